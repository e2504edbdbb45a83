#include "storage/stream/fstreamcounter.h"

#include "storage/stream/streamposition.h"

#include <algorithm>

int64 FStreamCounter::readRaw(void*, int64)
{
    return 0;
}

int64 FStreamCounter::writeRaw(const void*, int64 count)
{
    if (count < 1)
        return 0;
    position = movePosition(position, count);
    size = std::max(size, position);
    return count;
}

int64 FStreamCounter::seek(int64 target, FSeekMode mode)
{
    switch (mode)
    {
    case kSeekStart:
        position = target;
        break;
    case kSeekCurrent:
        position = movePosition(position, target);
        break;
    case kSeekEnd:
        position = distanceBetween(target, size);
        break;
    default:
        return -1;
    }
    position = std::max<int64>(position, 0);
    size = std::max(size, position);
    return position;
}

void FStreamCounter::rewind()
{
    size = position = 0;
}
