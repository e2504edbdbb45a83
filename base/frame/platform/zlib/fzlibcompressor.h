#pragma once

#include "storage/stream/fcompressionengine.h"

#include <vector>
#include <zlib.h>

/// Deflates into a stream as the bytes come, through a buffer of 64 KiB. One thread at a time.
class FZlibCompressor : public FCompressor
{
    DECLARE_TYPE(FZlibCompressor, FCompressor)

    FZlibCompressor() = default;
    FZlibCompressor(const FZlibCompressor&) = delete;
    FZlibCompressor& operator=(const FZlibCompressor&) = delete;
    ~FZlibCompressor() override;

    bool begin(FStream* newTarget, float quality) override;
    bool write(void* data, int count) override;
    /// Completes the data; what is written without it can't be read to its end.
    void end() override;
    /// Brings all that was written so far into a form that can be read, at the cost of some bytes.
    void flush() override;

private:
    /// Lets zlib work, and writes what it gives. After a failure nothing more is written.
    bool run(int mode);
    void close();

    FStream* target = nullptr;
    bool hasFailed = false;
    z_stream state{};
    std::vector<Bytef> buffer;
};
