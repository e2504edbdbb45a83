#pragma once

#include "foundation/object/funknown.h"

class FVariant;

/// An attribute tree that crosses a component boundary: values by key, and queues of values by key.
///
/// Each operation tells whether it succeeded; a read that doesn't leaves its target as it was.
class IAttributes : public FUnknown
{
public:
    /// Texts and objects are copied or counted, whoever owns the variant's.
    virtual bool set(const char* key, const FVariant& value) = 0;
    virtual bool queue(const char* key, const FVariant& value) = 0;
    /// Without `copy` the block must outlive the tree.
    virtual bool setBinaryData(const char* key, const void* data, uint32 size, bool copy) = 0;
    /// Texts and objects in `value` are borrowed from the tree.
    virtual bool get(const char* key, FVariant& value) const = 0;
    /// Reads the next value of the queue; false at its end.
    virtual bool unqueue(const char* key, FVariant& value) const = 0;
    virtual int getQueueItemCount(const char* key) const = 0;
    virtual bool resetQueue(const char* key) const = 0;
    virtual bool resetAllQueues() const = 0;
    /// Copies at most `size` bytes.
    virtual bool getBinaryData(const char* key, void* data, uint32 size) const = 0;
    virtual uint32 getBinarySize(const char* key) const = 0;

    DECLARE_INTERFACE_ID
};
