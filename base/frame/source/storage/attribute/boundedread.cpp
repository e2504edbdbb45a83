#include "storage/attribute/boundedread.h"

#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <cstring>
#include <vector>

bool readBounded(FStream& stream, int64 count, FMemoryStream& result)
{
    constexpr int64 pieceSize = 65536;
    std::vector<char> piece(static_cast<size_t>(std::min(count, pieceSize)));
    while (count > 0)
    {
        const int64 wanted = std::min(count, pieceSize);
        if (stream.readRaw(piece.data(), wanted) != wanted || result.writeRaw(piece.data(), wanted) != wanted)
            return false;
        count -= wanted;
    }
    return count == 0;
}

bool readBoundedStr8(FStream& stream, std::string& result)
{
    char text[kMaxStoredName + 1];
    int32 size = 0;
    if (!stream.readInt32(size) || size < 1 || size > kMaxStoredName + 1)
        return false;
    if (stream.readRaw(text, size) != size || text[size - 1] != 0)
        return false;
    result = text;
    return true;
}
