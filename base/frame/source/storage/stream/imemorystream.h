#pragma once

#include "foundation/object/funknown.h"

/// A stream whose bytes stand in memory. One thread at a time.
class IMemoryStream : public FUnknown
{
public:
    /// The block, which stays the stream's; null where there is none. Valid until the stream grows.
    virtual char* getData() const = 0;
    virtual int64 getSize() const = 0;

    DECLARE_INTERFACE_ID
};
