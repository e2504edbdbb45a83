#pragma once

#include "foundation/object/funknown.h"

/// A stream whose size can be asked for and changed. One thread at a time.
class ISizeableStream : public FUnknown
{
public:
    virtual int32 getStreamSize(int64& size) = 0;
    /// 0, or 4 where the size can't be changed.
    virtual int32 setStreamSize(int64 size) = 0;

    DECLARE_INTERFACE_ID
};
