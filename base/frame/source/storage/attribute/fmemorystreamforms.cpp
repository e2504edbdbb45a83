#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <limits>

static constexpr const char* kDataKey = "Data";

bool FMemoryStream::externalize(FArchive& archive) const
{
    const int64 stored = storedSize();
    if (stored > std::numeric_limits<int32>::max())
        return false;
    FStream& stream = archive.getStream();
    return stream.writeInt32(static_cast<int32>(stored)) && stream.writeRaw(data, stored) == stored;
}

bool FMemoryStream::internalize(FArchive& archive)
{
    rewind();
    FStream& stream = archive.getStream();
    int32 stored = 0;
    if (!stream.readInt32(stored))
        return false;
    if (stored == 0)
        return true;
    if (stored < 0)
        return false;
    const bool isComplete = readGrowing(stream, stored);
    rewind();
    return isComplete;
}

bool FMemoryStream::readGrowing(FStream& from, int64 count)
{
    // A damaged size may be far greater than the archive: memory follows the bytes that come.
    constexpr int64 kPiece = 1 << 20;
    for (int64 done = 0; done < count; done = size)
    {
        const int64 piece = std::min(count - done, std::max(done, kPiece));
        if (!setSize(done + piece) || from.readRaw(data + done, piece) != piece)
            return false;
    }
    return setSize(count);
}

bool FMemoryStream::storeAttributes(FAttributes& attributes) const
{
    const int64 stored = storedSize();
    return stored <= std::numeric_limits<uint32>::max() &&
           attributes.setBinary(kDataKey, data, static_cast<uint32>(stored));
}

bool FMemoryStream::restoreAttributes(FAttributes& attributes)
{
    return fromAttributes(kDataKey, attributes);
}

bool FMemoryStream::fromAttributes(const char* key, FAttributes& attributes)
{
    if (!attributes.containsAttribute(key))
        return false;
    // A block of somebody else's is let go first: what comes is this stream's own.
    if (!ownsMemory)
        setSize(0);
    ownsMemory = true;
    const uint32 stored = attributes.getBinarySize(key);
    const bool isRestored = setSize(stored) && (stored == 0 || attributes.getBinary(key, data, stored));
    rewind();
    return isRestored;
}
