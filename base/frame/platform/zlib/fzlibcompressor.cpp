#include "platform/zlib/fzlibcompressor.h"

#include "storage/stream/fstream.h"

#include <algorithm>
#include <cmath>

namespace
{
constexpr std::size_t kBufferSize = 65536;

int levelOf(float quality)
{
    // Not a number is taken for 0.
    const float inRange = quality > 0 ? std::min(quality, 1.0f) : 0.0f;
    return 1 + static_cast<int>(std::lround(inRange * 8));
}
} // namespace

FZlibCompressor::~FZlibCompressor()
{
    close();
}

bool FZlibCompressor::begin(FStream* newTarget, float quality)
{
    close();
    state = z_stream{};
    if (!newTarget || deflateInit(&state, levelOf(quality)) != Z_OK)
        return false;
    buffer.resize(kBufferSize);
    target = newTarget;
    hasFailed = false;
    return true;
}

bool FZlibCompressor::write(void* data, int count)
{
    if (!target || count < 0)
        return false;
    if (count == 0)
        return !hasFailed;
    state.next_in = static_cast<Bytef*>(data);
    state.avail_in = static_cast<uInt>(count);
    return run(Z_NO_FLUSH);
}

bool FZlibCompressor::run(int mode)
{
    do
    {
        if (hasFailed)
            return false;
        state.next_out = buffer.data();
        state.avail_out = static_cast<uInt>(buffer.size());
        hasFailed = deflate(&state, mode) == Z_STREAM_ERROR;
        const auto made = static_cast<int64>(buffer.size() - state.avail_out);
        if (made > 0 && target->writeRaw(buffer.data(), made) != made)
            hasFailed = true;
        // A full buffer may not have been all.
    } while (state.avail_out == 0);
    return !hasFailed;
}

void FZlibCompressor::flush()
{
    if (target)
        run(Z_SYNC_FLUSH);
}

void FZlibCompressor::end()
{
    if (target)
        run(Z_FINISH);
    close();
}

void FZlibCompressor::close()
{
    if (target)
        deflateEnd(&state);
    target = nullptr;
}
