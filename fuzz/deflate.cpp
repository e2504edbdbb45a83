// Compressed data that anybody may have made; and anything, compressed and read again. The first byte says how.

#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/fmemorystream.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

namespace
{
constexpr int64 kMaxContent = 1 << 24;

void require(bool holds)
{
    if (!holds)
        abort();
}

/// Reads pieces of that size to the end. The number of bytes; -1 where the data is damaged.
int64 readAll(FCompressionStream& stream, int64 pieceSize, std::vector<char>& content)
{
    std::vector<char> piece(static_cast<size_t>(pieceSize));
    while (static_cast<int64>(content.size()) < kMaxContent)
    {
        const int64 got = stream.readRaw(piece.data(), pieceSize);
        if (got <= 0)
            return got < 0 ? -1 : static_cast<int64>(content.size());
        require(got <= pieceSize);
        content.insert(content.end(), piece.begin(), piece.begin() + got);
    }
    return static_cast<int64>(content.size());
}

void unpack(FMemoryStream& packed, int64 pieceSize)
{
    FCompressionStream stream(&packed, nullptr);
    require(stream.beginDecompress(-1));
    std::vector<char> content;
    if (readAll(stream, pieceSize, content) < 0)
        return;
    // What can be read once can be read again.
    stream.rewind();
    stream.seek(static_cast<int64>(content.size()) / 2, kSeekStart);
    require(stream.tell() == static_cast<int64>(content.size()) / 2);
}

void roundTrip(FMemoryStream& plain, float quality, int64 pieceSize)
{
    FMemoryStream packed;
    require(FCompressData(&plain, &packed, nullptr, quality, nullptr));
    packed.rewind();
    FCompressionStream stream(&packed, nullptr);
    require(stream.beginDecompress(-1));
    std::vector<char> content;
    require(readAll(stream, pieceSize, content) == plain.getSize());
    require(content.empty() || memcmp(content.data(), plain.getData(), content.size()) == 0);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size == 0)
        return 0;
    FComponentRegistry::bringUp();
    const uint8_t how = data[0];
    FMemoryStream bytes(const_cast<uint8_t*>(data) + 1, static_cast<int64>(size - 1));
    const int64 pieceSize = (how & 2) ? 1000 : 65536;
    if (how & 1)
        roundTrip(bytes, static_cast<float>(how) / 255, pieceSize);
    else
        unpack(bytes, pieceSize);
    return 0;
}
