#include "storage/stream/fblockstreamreader.h"

#include "storage/stream/streamposition.h"

#include <algorithm>
#include <cstring>

FBlockStreamReader::FBlockStreamReader(FStream* innerStream, uint32 blockSize)
    : stream(innerStream),
      buffer(std::max(blockSize, 1u))
{
    if (!stream)
        return;
    fileType = stream->getFileType();
    byteOrder = stream->getByteOrder();
    position = stream->tell();
}

void FBlockStreamReader::dropBuffer()
{
    bufferOffset = bufferBytes = 0;
}

int64 FBlockStreamReader::takeBuffered(char* target, int64 count)
{
    const int64 taken = std::min<int64>(count, bufferBytes);
    if (taken <= 0)
        return 0;
    memcpy(target, buffer.ptr() + bufferOffset, static_cast<size_t>(taken));
    bufferOffset += static_cast<int32>(taken);
    bufferBytes -= static_cast<int32>(taken);
    position += taken;
    return taken;
}

int64 FBlockStreamReader::readBlocks(char* target, int64 count)
{
    const int64 blockSize = buffer.getSize();
    int64 done = 0;
    while (count - done >= blockSize)
    {
        const int64 got = stream->readRaw(target + done, (count - done) / blockSize * blockSize);
        if (got < 1)
            break;
        done += got;
    }
    position += done;
    return done;
}

bool FBlockStreamReader::fillBuffer()
{
    bufferOffset = 0;
    bufferBytes = static_cast<int32>(std::max<int64>(stream->readRaw(buffer.ptr(), buffer.getSize()), 0));
    return bufferBytes > 0;
}

int64 FBlockStreamReader::readRaw(void* target, int64 count)
{
    if (!stream)
        return -1;
    auto* bytes = static_cast<char*>(target);
    int64 done = takeBuffered(bytes, count);
    if (count - done >= int64{buffer.getSize()})
    {
        dropBuffer();
        done += readBlocks(bytes + done, count - done);
        if (count - done >= int64{buffer.getSize()})
            return done;
    }
    if (done < count && fillBuffer())
        done += takeBuffered(bytes + done, count - done);
    return done;
}

int64 FBlockStreamReader::writeRaw(const void*, int64)
{
    return -1;
}

int64 FBlockStreamReader::seek(int64 target, FSeekMode mode)
{
    if (!stream || (mode != kSeekStart && mode != kSeekCurrent))
        return -1;
    const int64 wanted = mode == kSeekStart ? target : movePosition(position, target);
    const int64 distance = distanceBetween(position, wanted);
    if (distance >= -int64{bufferOffset} && distance <= bufferBytes)
    {
        bufferOffset += static_cast<int32>(distance);
        bufferBytes -= static_cast<int32>(distance);
        position += distance;
        return position;
    }

    dropBuffer();
    const int64 result = stream->seek(wanted, kSeekStart);
    position = result < 0 ? stream->tell() : result;
    return result;
}

void FBlockStreamReader::flush()
{
    if (!stream)
        return;
    stream->flush();
    dropBuffer();
    position = stream->tell();
}
