#include "platform/zlib/fzlibengine.h"

#include "platform/zlib/fzlibcompressor.h"
#include "platform/zlib/fzlibdecompressor.h"
#include "services/components/fcomponententry.h"

#include <limits>

constinit const FUIDBytes FZlibEngine::kClassID = fuidBytes(0x6D1F0C52, 0x3E8B4A97, 0xB02E7D15, 0xC94A68F3);

namespace
{
// A run of one byte takes two bits for each 258 bytes; the rest is room for the ends of short texts.
constexpr int64 kMaxRatio = 1032;
constexpr int64 kMaxShortText = 1024;

FUnknown* createEngine()
{
    return static_cast<CmObject*>(new FZlibEngine);
}

FComponentEntry entry("Compression Engine", FZlibEngine::kClassID, "Deflate", &createEngine);
} // namespace

FCompressor* FZlibEngine::newCompressor()
{
    return new FZlibCompressor;
}

FDecompressor* FZlibEngine::newDecompressor()
{
    return new FZlibDecompressor;
}

void FZlibEngine::getFormat(FUID& format)
{
    format = FUID(kClassID);
}

int64 FZlibEngine::getMaxUncompressedSize(int64 compressedSize)
{
    constexpr int64 kMax = std::numeric_limits<int64>::max();
    if (compressedSize > (kMax - kMaxShortText) / kMaxRatio)
        return kMax;
    return compressedSize * kMaxRatio + kMaxShortText;
}
