#include "storage/stream/fstreamunpacker.h"

#include "storage/stream/fcompressionstream.h"

#include <algorithm>
#include <limits>

FStreamUnpacker::FStreamUnpacker(FStream* stream) : packed(stream)
{
    auto* compressed = FCast(FCompressionStream, stream);
    const int64 size = compressed ? compressed->getUncompressedSize() : 0;
    if (size <= 0 || size > std::numeric_limits<uint32>::max() || !buffer.setSize(static_cast<uint32>(size)))
        return;
    const int64 got = std::max<int64>(compressed->readRaw(buffer.ptr(), size), 0);
    unpacked = adopt(new FMemoryStream(buffer.ptr(), got));
}

FStream* FStreamUnpacker::getStream() const
{
    return unpacked ? unpacked.get() : packed.get();
}
