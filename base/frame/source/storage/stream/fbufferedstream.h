#pragma once

#include "containers/value/cmbuffer.h"
#include "foundation/object/iptr.h"
#include "storage/stream/fstream.h"

class CmBufferPool;

/// Caches one block of another stream, for reading and writing here and there.
///
/// Changes are written when the cursor leaves the block, at `flush`, and at the end. A changed block is written
/// whole; a file that is padded by this is cut to its true length at the end. The pool is borrowed. One thread at a
/// time.
class FBufferedStream : public FStream
{
    DECLARE_COPYABLE(FBufferedStream, FStream)

    /// The block size must not be 0; the pool may be null.
    FBufferedStream(FStream* innerStream, uint32 itsBlockSize, bool writable, CmBufferPool* itsPool);
    /// Wraps the same stream with a cache of its own.
    FBufferedStream(const FBufferedStream& other);
    ~FBufferedStream() override;
    FBufferedStream& operator=(const FBufferedStream&) = delete;

    /// Begins anew at the position of `newStream`, which may be null. What is cached of the old stream is written.
    void setStream(FStream* newStream);
    FStream* getStream() const { return stream; }

    int64 readRaw(void* target, int64 count) override;
    int64 writeRaw(const void* source, int64 count) override;
    int64 seek(int64 position, FSeekMode mode) override;
    int64 tell() override { return cursor; }
    using FStream::seek;
    using FStream::tell;

    void rewind() override { seek(0, kSeekStart); }
    void flush() override;
    bool verify() override;
    void setReadWriteHook(UProgressHook* newHook, int threshold) override;

private:
    enum Flags : uint32
    {
        kWritable = 1,
        kDirty = 2
    };

    void finish();
    int64 blockStart() const { return blockIndex * blockSize(); }
    int64 blockSize() const { return buffer->getSize(); }
    bool isCanceled() const;
    void tellHook(int64 target) const;
    /// False where the block can't be read; nothing is read behind the end of the stream.
    bool loadBlock();
    int64 writeAligned(const void* source, int64 count);
    /// How many bytes the block took; -1 where its other bytes can't be read.
    int64 writeToBlock(const char* source, int64 count);

    IPtr<FStream> stream;
    IPtr<CmBuffer> buffer;
    int64 blockIndex = 0;
    int64 cursor = 0;
    int64 streamEnd = 0;
    int32 seekThreshold = 0;
    uint32 flags = 0;
    UProgressHook* hook = nullptr;
    CmBufferPool* pool = nullptr;
    bool writeFailed = false;
};
