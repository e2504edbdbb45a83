#include "foundation/object/iptr.h"
#include "fuzz/fuzztext.h"
#include "storage/stream/fblockstreamreader.h"
#include "storage/stream/fbufferedstream.h"
#include "storage/stream/fmemorystream.h"
#include "storage/stream/fstreamproxy.h"

#include <algorithm>
#include <limits>
#include <vector>

// Streams that wrap others, moved to any position that a damaged file may name, read and written there.

namespace
{
constexpr int64 kLargest = 1 << 20;

int64 takeNumber(FuzzText& input)
{
    const int bytes = input.takeByte() % 9;
    uint64 number = 0;
    for (int i = 0; i < bytes; i++)
        number = number << 8 | input.takeByte();
    // Small numbers of either sign, and the largest.
    return bytes % 2 == 0 ? static_cast<int64>(number) : -static_cast<int64>(number >> 1);
}

IPtr<FStream> wrap(FMemoryStream& inner, FuzzText& input)
{
    const int64 first = takeNumber(input) % kLargest;
    const int64 count = takeNumber(input);
    switch (input.takeByte() % 4)
    {
    case 0:
        return adopt(new FStreamProxy(&inner, first, count, 0));
    case 1:
        return adopt(new FBlockStreamReader(&inner, 16));
    default:
        return adopt(new FBufferedStream(&inner, 16, input.takeByte() % 2 == 0, nullptr));
    }
}

void act(FStream& stream, FMemoryStream& inner, FuzzText& input)
{
    std::vector<char> block(64);
    const uint8_t action = input.takeByte();
    const int64 number = takeNumber(input);
    // A gap is filled with zeros, so that only streams that stay small are written to, and those beyond all memory.
    const bool isNear = std::max(stream.tell(), inner.tell()) < kLargest;
    const bool isBeyond = stream.tell() > std::numeric_limits<int64>::max() / 2;
    switch (action % 4)
    {
    case 0:
        stream.seek(number, static_cast<FSeekMode>(action / 4 % 3));
        break;
    case 1:
        require(stream.readRaw(block.data(), action % 64) <= action % 64);
        break;
    case 2:
        if (isNear || isBeyond)
            require(stream.writeRaw(block.data(), action % 64) <= action % 64);
        break;
    default:
        stream.flush();
    }
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    constexpr int kMaxActions = 10000;
    FuzzText input(data, size);
    FMemoryStream inner;
    for (int i = 0; i < 100; i++)
        inner.writeUChar8(static_cast<uint8>(i));
    const IPtr<FStream> stream = wrap(inner, input);
    for (int i = 0; i < kMaxActions && !input.isEmpty(); i++)
        act(*stream, inner, input);
    return 0;
}
