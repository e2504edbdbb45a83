#include "storage/stream/fbufferedstream.h"

#include "containers/value/cmbufferpool.h"
#include "storage/stream/ffilestream.h"
#include "storage/stream/streamposition.h"
#include "storage/stream/uprogresshook.h"

#include <algorithm>
#include <cassert>
#include <cstdlib>
#include <cstring>

FBufferedStream::FBufferedStream(FStream* innerStream, uint32 itsBlockSize, bool writable,
                                 CmBufferPool* itsPool)
    : flags(writable ? kWritable : 0u),
      pool(itsPool)
{
    assert(itsBlockSize > 0 && "a cache needs a block to hold");
    buffer = adopt(pool ? pool->allocateBuffer(itsBlockSize) : new CmBuffer(itsBlockSize));
    buffer->setSize(itsBlockSize);
    setStream(innerStream);
}

FBufferedStream::FBufferedStream(const FBufferedStream& other)
    : FBufferedStream(other.stream, other.buffer->getSize(), (other.flags & kWritable) != 0, other.pool)
{
    seek(other.cursor, kSeekStart);
}

FBufferedStream::~FBufferedStream()
{
    finish();
    if (pool)
        pool->deleteBuffer(buffer.take());
}

void FBufferedStream::finish()
{
    if (!stream || (flags & kWritable) == 0)
        return;
    flush();
    // The last block was written whole. A file that is too short has lost data and isn't made to look complete.
    auto* file = FCast(FFileStream, stream.get());
    if (file && file->getEof() > streamEnd)
        file->setEof(streamEnd);
}

void FBufferedStream::setStream(FStream* newStream)
{
    finish();
    stream = newStream;
    flags &= ~static_cast<uint32>(kDirty);
    buffer->setFillSize(0);
    blockIndex = cursor = streamEnd = 0;
    if (!stream)
        return;

    fileType = stream->getFileType();
    byteOrder = stream->getByteOrder();
    // A closed stream stands nowhere, and one in memory may stand before its start.
    cursor = std::max<int64>(stream->tell(), 0);
    blockIndex = cursor / blockSize();
    streamEnd = std::max<int64>(stream->seek(0, kSeekEnd), 0);
    stream->seek(cursor, kSeekStart);
}

bool FBufferedStream::isCanceled() const
{
    return hook && hook->wasCanceled();
}

void FBufferedStream::tellHook(int64 target) const
{
    if (hook && std::abs(hook->getValue() - target) > seekThreshold)
        hook->setValue(target);
}

int64 FBufferedStream::seek(int64 position, FSeekMode mode)
{
    int64 target = cursor;
    switch (mode)
    {
    case kSeekStart:
        target = position;
        break;
    case kSeekCurrent:
        target = movePosition(cursor, position);
        break;
    case kSeekEnd:
        target = movePosition(streamEnd, position);
        break;
    }
    target = std::max<int64>(target, 0);
    if ((flags & kWritable) == 0)
        target = std::min(target, streamEnd);
    tellHook(target);
    if (target / blockSize() != blockIndex)
    {
        flush();
        blockIndex = target / blockSize();
    }
    cursor = target;
    return cursor;
}

bool FBufferedStream::loadBlock()
{
    const int64 wanted = std::min(blockSize(), streamEnd - blockStart());
    if (wanted <= 0)
        return true;
    stream->seek(blockStart(), kSeekStart);
    const int64 got = stream->readRaw(buffer->ptr(), wanted);
    buffer->setFillSize(static_cast<uint32>(std::max<int64>(got, 0)));
    return got >= 0;
}

int64 FBufferedStream::readRaw(void* target, int64 count)
{
    if (!stream || isCanceled())
        return -1;
    auto* bytes = static_cast<char*>(target);
    int64 done = 0;
    while (done < count)
    {
        if (buffer->getFillSize() == 0 && !loadBlock())
            break;
        const int64 offset = cursor - blockStart();
        const int64 available = buffer->getFillSize() - offset;
        if (available <= 0)
            break;
        const int64 taken = std::min(count - done, available);
        memcpy(bytes + done, *buffer + static_cast<uint32>(offset), static_cast<size_t>(taken));
        done += taken;
        seek(cursor + taken, kSeekStart);
    }
    return done;
}

int64 FBufferedStream::writeRaw(const void* source, int64 count)
{
    if (!stream || isCanceled() || (flags & kWritable) == 0)
        return -1;
    if (count <= 0)
        return 0;
    // No stream reaches beyond the last position.
    if (count > std::numeric_limits<int64>::max() - cursor)
        return -1;
    if (count % blockSize() == 0 && cursor % blockSize() == 0)
        return writeAligned(source, count);

    const auto* bytes = static_cast<const char*>(source);
    int64 done = 0;
    while (done < count)
    {
        const int64 taken = writeToBlock(bytes + done, count - done);
        if (taken < 0)
            return done > 0 ? done : -1;
        done += taken;
    }
    return done;
}

int64 FBufferedStream::writeAligned(const void* source, int64 count)
{
    flush();
    stream->seek(cursor, kSeekStart);
    const int64 written = stream->writeRaw(source, count);
    seek(stream->tell(), kSeekStart);
    streamEnd = std::max(streamEnd, cursor);
    return written;
}

int64 FBufferedStream::writeToBlock(const char* source, int64 count)
{
    // The block's other bytes must not be lost.
    if (buffer->getFillSize() == 0 && !loadBlock())
        return -1;
    flags |= kDirty;
    const int64 offset = cursor - blockStart();
    const int64 taken = std::min(count, blockSize() - offset);
    const auto end = static_cast<uint32>(offset + taken);
    if (end > buffer->getFillSize())
    {
        buffer->fillup(0);
        buffer->setFillSize(end);
    }
    memcpy(*buffer + static_cast<uint32>(offset), source, static_cast<size_t>(taken));
    streamEnd = std::max(streamEnd, cursor + taken);
    seek(cursor + taken, kSeekStart);
    return taken;
}

void FBufferedStream::flush()
{
    if ((flags & kDirty) != 0)
    {
        // Padding is zeros, not what the block held before.
        buffer->fillup(0);
        stream->seek(blockStart(), kSeekStart);
        if (stream->writeRaw(buffer->ptr(), blockSize()) < blockSize())
            writeFailed = true;
        flags &= ~static_cast<uint32>(kDirty);
    }
    buffer->setFillSize(0);
}

bool FBufferedStream::verify()
{
    return !writeFailed && (!stream || stream->verify());
}

void FBufferedStream::setReadWriteHook(UProgressHook* newHook, int threshold)
{
    hook = newHook;
    seekThreshold = threshold;
}
