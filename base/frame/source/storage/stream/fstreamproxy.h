#pragma once

#include "foundation/object/iptr.h"
#include "storage/stream/fstream.h"

/// A window over a part of another stream.
///
/// Each transfer seeks the inner stream first, so that several proxies of one thread may share it in turn. One
/// thread at a time.
class FStreamProxy : public FStream
{
    DECLARE_COPYABLE(FStreamProxy, FStream)

    /// The window begins at `firstByte` of the inner stream; a `byteCount` of 0 or less reaches to its end. `accessMode`
    /// is kept for whoever made the window.
    FStreamProxy(FStream* innerStream, int64 firstByte, int64 byteCount, int accessMode);

    FStream* getStream() const { return stream; }
    int getMode() const { return mode; }

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// The position is kept inside the window.
    int64 seek(int64 target, FSeekMode seekMode) override;
    int64 tell() override;
    using FStream::seek;
    using FStream::tell;

    void rewind() override { seek(0, kSeekStart); }
    void flush() override;

protected:
    IPtr<FStream> stream;
    int64 start;
    int64 position;
    int64 length;

private:
    /// How many of `count` bytes lie inside the window; below 0 behind its end.
    int64 clip(int64 count) const;
    /// Behind the last byte of a window that has a length.
    int64 end() const;

    int mode;
};
