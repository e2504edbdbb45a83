#pragma once

#include "foundation/object/cmobject.h"

/// A block of bytes in an attribute tree, its own or borrowed. One thread at a time.
class FAttrBuffer : public CmObject
{
    DECLARE_CLASS(FAttrBuffer, CmObject)

    FAttrBuffer() = default;
    /// Without `copy` the block must outlive the object. A null block is empty.
    FAttrBuffer(const void* block, uint32 blockSize, bool copy);
    /// The copy owns its block.
    FAttrBuffer(const FAttrBuffer& other);
    FAttrBuffer& operator=(const FAttrBuffer&) = delete;
    ~FAttrBuffer() override;

    const void* getData() const { return data; }
    uint32 getSize() const { return size; }

    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    void copyBlock(const void* block, uint32 blockSize);
    void empty();

    const void* data = nullptr;
    uint32 size = 0;
    bool isOwner = false;
};

/// The bytes of an object of the kinds that hold a block: FAttrBuffer, CmBuffer, as far as it is filled, and
/// FMemoryStream. False for any other object and null. Borrowed.
bool getBinaryBlock(const CmObject* object, const void*& data, uint32& size);
