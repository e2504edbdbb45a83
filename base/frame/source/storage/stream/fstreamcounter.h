#pragma once

#include "storage/stream/fstream.h"

/// Counts what would be written and keeps nothing of it. One thread at a time.
class FStreamCounter : public FStream
{
    DECLARE_COPYABLE(FStreamCounter, FStream)

    int64 getSize() const { return size; }

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// kSeekEnd takes the target off the size. A negative outcome becomes 0; one past the size raises it.
    int64 seek(int64 target, FSeekMode mode) override;
    int64 tell() override { return position; }
    using FStream::seek;
    using FStream::tell;

    void rewind() override;

private:
    int64 size = 0;
    int64 position = 0;
};
