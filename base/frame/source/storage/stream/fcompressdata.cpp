#include "storage/stream/fcompressionstream.h"
#include "storage/stream/fstreamcounter.h"
#include "storage/stream/uprogresshook.h"

#include "containers/value/buffer.h"

static constexpr uint32 kPiece = 65536;

/// Whether `source` was copied to its end.
static bool copyPieces(FStream& source, FStream& target, uint32 pieceSize, UProgressHook* hook)
{
    Buffer piece(pieceSize);
    if (piece.getSize() < pieceSize)
        return false;
    int64 total = 0;
    for (;;)
    {
        const int64 got = source.readRaw(piece.ptr(), pieceSize);
        if (got <= 0)
            return got == 0;
        if (target.writeRaw(piece.ptr(), got) < got)
            return false;
        total += got;
        if (!hook)
            continue;
        hook->setValue(total / hook->getValueCompression());
        if (hook->wasCanceled())
            return false;
    }
}

bool FCompressData(FStream* source, FStream* target, FCompressionEngine* engine, float quality,
                   UProgressHook* hook)
{
    if (!source)
        return false;
    FCompressionStream packed(target, engine);
    return packed.beginCompress(quality) && copyPieces(*source, packed, kPiece, hook);
}

bool FDecompressData(FStream* source, FStream* target, FCompressionEngine* engine, UProgressHook* hook,
                     int bufferSize)
{
    if (!target)
        return false;
    FCompressionStream packed(source, engine);
    const uint32 pieceSize = bufferSize < 1 ? kPiece : static_cast<uint32>(bufferSize);
    return packed.beginDecompress(-1) && copyPieces(packed, *target, pieceSize, hook);
}

/// Compresses a sample into `counter`; gives its plain size, or 0 where that failed.
static int64 compressSample(FStream& source, FStreamCounter& counter, FCompressionEngine* engine,
                            float quality)
{
    constexpr int64 kSample = 8192;
    FCompressionStream packed(&counter, engine);
    if (!packed.beginCompress(quality))
        return 0;
    char sample[kSample];
    int64 total = 0;
    while (total < kSample)
    {
        const int64 got = source.readRaw(sample, kSample);
        if (got <= 0)
            break;
        if (packed.writeRaw(sample, got) < got)
            return 0;
        total += got;
    }
    return total;
}

float FGetCompressionRatio(FStream* source, FCompressionEngine* engine, float quality)
{
    if (!source)
        return 1.0f;
    FStreamCounter counter;
    const int64 plainSize = compressSample(*source, counter, engine, quality);
    if (plainSize == 0)
        return 1.0f;
    return static_cast<float>(counter.getSize()) / static_cast<float>(plainSize);
}
