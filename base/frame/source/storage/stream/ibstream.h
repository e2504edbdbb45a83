#pragma once

#include "containers/value/resultcodes.h"
#include "foundation/object/funknown.h"

/// Results of stream interfaces; 0 is success.
inline constexpr int32 kStreamFailed = 1;
inline constexpr int32 kStreamInvalidArgument = kResultInvalidArgument;
inline constexpr int32 kStreamSizeNotChanged = 4;

/// A stream of bytes as a component sees it. One thread at a time.
class IBStream : public FUnknown
{
public:
    /// The end of the stream is a failure. `numRead` may be null; on failure it is left alone.
    virtual int32 read(void* buffer, int count, int* numRead) = 0;
    /// Fails where not all bytes were written. `numWritten` may be null; on failure it is left alone.
    virtual int32 write(void* buffer, int count, int* numWritten) = 0;
    /// `mode` is an FSeekMode; any other number counts from the start. `result` may be null.
    virtual int32 seek(int64 pos, int mode, int64* result) = 0;
    virtual int32 tell(int64* pos) = 0;

    DECLARE_INTERFACE_ID
};
