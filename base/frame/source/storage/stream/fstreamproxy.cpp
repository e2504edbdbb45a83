#include "storage/stream/fstreamproxy.h"

#include "storage/stream/streamposition.h"

#include <algorithm>

FStreamProxy::FStreamProxy(FStream* innerStream, int64 firstByte, int64 byteCount, int accessMode)
    : stream(innerStream),
      start(firstByte),
      position(firstByte),
      length(byteCount),
      mode(accessMode)
{
    if (!stream)
        return;
    fileType = stream->getFileType();
    byteOrder = stream->getByteOrder();
}

int64 FStreamProxy::end() const
{
    return movePosition(start, length);
}

int64 FStreamProxy::clip(int64 count) const
{
    return length > 0 ? std::min(count, distanceBetween(position, end())) : count;
}

int64 FStreamProxy::readRaw(void* target, int64 count)
{
    if (!stream)
        return -1;
    stream->seek(position, kSeekStart);
    const int64 clipped = clip(count);
    if (clipped <= 0)
        return clipped < 0 ? -1 : 0;
    const int64 result = stream->readRaw(target, clipped);
    position = stream->tell();
    return result;
}

int64 FStreamProxy::writeRaw(const void* source, int64 count)
{
    if (!stream)
        return -1;
    stream->seek(position, kSeekStart);
    const int64 clipped = clip(count);
    if (clipped <= 0)
        return clipped < 0 ? -1 : 0;
    const int64 result = stream->writeRaw(source, clipped);
    position = stream->tell();
    return result;
}

int64 FStreamProxy::seek(int64 target, FSeekMode seekMode)
{
    if (!stream)
        return -1;
    int64 base = start;
    int64 offset = target;
    switch (seekMode)
    {
    case kSeekStart:
        break;
    case kSeekCurrent:
        base = position;
        break;
    case kSeekEnd:
        base = length > 0 ? end() : stream->seek(0, kSeekEnd);
        break;
    default:
        offset = 0;
        break;
    }
    position = std::max(movePosition(base, offset), start);
    if (length > 0)
        position = std::min(position, end());
    return tell();
}

int64 FStreamProxy::tell()
{
    return stream ? distanceBetween(start, position) : -1;
}

void FStreamProxy::flush()
{
    if (stream)
        stream->flush();
}
