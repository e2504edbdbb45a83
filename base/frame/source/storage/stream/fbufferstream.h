#pragma once

#include "storage/stream/fstream.h"

/// Reads and writes a buffer in place: the cursor is the buffer's fill size.
///
/// A read at the end sets the fill size to 0, which starts the buffer anew. The buffer is borrowed and must outlive
/// the stream. One thread at a time.
class FBufferStream : public FStream
{
    DECLARE_COPYABLE(FBufferStream, FStream)

    explicit FBufferStream(CmBuffer& target) : buffer(target) {}

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// The buffer grows to a target past its end, by zeros. kSeekEnd takes the position off the buffer's size. A
    /// target before the start or past 4 GiB gives -1.
    int64 seek(int64 position, FSeekMode mode) override;
    int64 tell() override;
    using FStream::seek;
    using FStream::tell;

    void rewind() override;

private:
    bool growTo(int64 target);

    CmBuffer& buffer;
};
