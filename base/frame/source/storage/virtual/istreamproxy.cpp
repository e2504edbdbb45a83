#include "storage/virtual/istreamproxy.h"

#include <algorithm>
#include <limits>

static constexpr int64 kMaxPiece = std::numeric_limits<int>::max();

int64 IStreamProxy::readRaw(void* buffer, int64 count)
{
    char* bytes = static_cast<char*>(buffer);
    int64 total = 0;
    while (plain && total < count)
    {
        const int asked = static_cast<int>(std::min(count - total, kMaxPiece));
        int got = 0;
        // A component that claims more than it was asked for isn't believed.
        if (plain->read(bytes + total, asked, &got) != kResultOk || got < 1 || got > asked)
            break;
        total += got;
    }
    return total;
}

int64 IStreamProxy::writeRaw(const void* buffer, int64 count)
{
    // The interface is no stickler for const; a stream doesn't change what it is given.
    char* bytes = const_cast<char*>(static_cast<const char*>(buffer));
    int64 total = 0;
    while (plain && total < count)
    {
        const int piece = static_cast<int>(std::min(count - total, kMaxPiece));
        if (plain->write(bytes + total, piece, nullptr) != kResultOk)
            return total > 0 ? total : -1;
        total += piece;
    }
    return total;
}

int64 IStreamProxy::seek(int64 position, FSeekMode mode)
{
    int64 reached = -1;
    return plain && plain->seek(position, mode, &reached) == kResultOk ? reached : -1;
}

int64 IStreamProxy::tell()
{
    int64 position = -1;
    return plain && plain->tell(&position) == kResultOk ? position : -1;
}
