#pragma once

#include "storage/stream/fcompressionengine.h"

#include <vector>
#include <zlib.h>

/// Inflates from a stream as the bytes are asked for, through a buffer of 64 KiB.
///
/// Data that is damaged or ends early gives what could be read, and -1 from then on; so whoever wants to know that
/// all is well reads to the end, where the check sum stands. One thread at a time.
class FZlibDecompressor : public FDecompressor
{
    DECLARE_TYPE(FZlibDecompressor, FDecompressor)

    FZlibDecompressor() = default;
    FZlibDecompressor(const FZlibDecompressor&) = delete;
    FZlibDecompressor& operator=(const FZlibDecompressor&) = delete;
    ~FZlibDecompressor() override;

    bool begin(FStream* newSource) override;
    /// At the end of the data the source stands right behind it, if it can be sought.
    int read(void* data, int count) override;
    void end() override;
    bool canSeek() override { return false; }
    int64 seek(int64, int) override { return -1; }

private:
    enum class Progress
    {
        kGoing,
        kEnded,
        kBroken
    };

    void step();
    bool fill();

    FStream* source = nullptr;
    Progress progress = Progress::kGoing;
    z_stream state{};
    std::vector<Bytef> buffer;
};
