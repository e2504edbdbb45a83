#pragma once

#include "foundation/object/types.h"

/// Hears how far a long transfer has come, and may cancel it.
///
/// A value counts bytes, divided by the value compression where totals are too great for whoever shows them.
/// Whoever passes a hook keeps it alive; its operations are called by the thread that transfers, one
/// thread at a time.
class UProgressHook
{
public:
    virtual ~UProgressHook() = default;

    virtual bool wasCanceled() = 0;
    /// The value at which the work is done.
    virtual void setMaximum(int64 value) = 0;
    virtual void setValue(int64 value) = 0;
    virtual int64 getValue() const = 0;
    /// What is being done now.
    virtual void setText(const char16* text) = 0;

    void advance(int64 amount) { setValue(getValue() + amount); }

    /// The number of bytes that count as one; at least 1.
    int64 getValueCompression() const { return valueCompression; }
    void setValueCompression(int64 bytes) { valueCompression = bytes < 1 ? 1 : bytes; }

private:
    int64 valueCompression = 1;
};
