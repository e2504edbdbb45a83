#include "storage/stream/fbufferstream.h"

#include "containers/value/cmbuffer.h"

#include <algorithm>
#include <limits>

static constexpr int64 kMaxSize = std::numeric_limits<uint32>::max();

int64 FBufferStream::readRaw(void* target, int64 count)
{
    if (buffer.getFree() == 0)
    {
        buffer.setFillSize(0);
        return 0;
    }
    return buffer.get(target, static_cast<uint32>(std::clamp<int64>(count, 0, kMaxSize)));
}

int64 FBufferStream::writeRaw(const void* source, int64 count)
{
    if (count < 0 || count > kMaxSize)
        return 0;
    return buffer.put(source, static_cast<uint32>(count)) ? count : 0;
}

bool FBufferStream::growTo(int64 target)
{
    return target >= 0 && target <= kMaxSize && buffer.setFillSize(static_cast<uint32>(target));
}

int64 FBufferStream::seek(int64 position, FSeekMode mode)
{
    // Whatever is out of reach counts the same, so nothing below can overflow.
    const int64 offset = std::clamp<int64>(position, -kMaxSize - 1, kMaxSize + 1);
    int64 target = tell();
    switch (mode)
    {
    case kSeekStart:
        target = offset;
        break;
    case kSeekCurrent:
        target += offset;
        break;
    case kSeekEnd:
        target = buffer.getSize() - offset;
        break;
    }
    return growTo(target) ? target : -1;
}

int64 FBufferStream::tell()
{
    return buffer.getFillSize();
}

void FBufferStream::rewind()
{
    buffer.setFillSize(0);
}
