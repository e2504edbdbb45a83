#pragma once

#include "containers/value/cmbuffer.h"
#include "foundation/object/iptr.h"
#include "storage/stream/fstream.h"

/// Reads ahead in another stream by blocks, for reading forward in small pieces. Writes nothing.
///
/// Nobody else may move the inner stream meanwhile, so of a reader and its copy only one goes on reading. One thread
/// at a time.
class FBlockStreamReader : public FStream
{
    DECLARE_COPYABLE(FBlockStreamReader, FStream)

    FBlockStreamReader(FStream* innerStream, uint32 blockSize);

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    /// kSeekEnd gives -1.
    int64 seek(int64 target, FSeekMode mode) override;
    int64 tell() override { return position; }
    using FStream::seek;
    using FStream::tell;

    void rewind() override { seek(0, kSeekStart); }
    void flush() override;

private:
    void dropBuffer();
    int64 takeBuffered(char* target, int64 count);
    int64 readBlocks(char* target, int64 count);
    bool fillBuffer();

    IPtr<FStream> stream;
    CmBuffer buffer;
    int64 position = 0;
    int32 bufferOffset = 0;
    int32 bufferBytes = 0;
};
