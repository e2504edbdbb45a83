#pragma once

#include "containers/value/buffer.h"
#include "foundation/object/cmobject.h"

class FStream;

/// A block of bytes as an object. Two are equal where they have the same size and bytes, filled or not.
///
/// One thread at a time.
class CmBuffer : public Buffer, public CmObject
{
    DECLARE_CLASS(CmBuffer, CmObject)

    using Buffer::Buffer;
    CmBuffer() = default;
    CmBuffer(const CmBuffer&) = default;
    CmBuffer& operator=(const CmBuffer&) = default;

    /// Size and fill size as 32-bit numbers, then all bytes of the block.
    bool writeToStream(FStream& stream) const;
    /// On failure the buffer is empty.
    bool readFromStream(FStream& stream);

    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
};
