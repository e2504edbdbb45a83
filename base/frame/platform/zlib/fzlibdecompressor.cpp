#include "platform/zlib/fzlibdecompressor.h"

#include "storage/stream/fstream.h"

namespace
{
constexpr std::size_t kBufferSize = 65536;
}

FZlibDecompressor::~FZlibDecompressor()
{
    end();
}

bool FZlibDecompressor::begin(FStream* newSource)
{
    end();
    state = z_stream{};
    if (!newSource || inflateInit(&state) != Z_OK)
        return false;
    buffer.resize(kBufferSize);
    source = newSource;
    progress = Progress::kGoing;
    return true;
}

int FZlibDecompressor::read(void* data, int count)
{
    if (!source || count < 0)
        return -1;
    state.next_out = static_cast<Bytef*>(data);
    state.avail_out = static_cast<uInt>(count);
    while (state.avail_out > 0 && progress == Progress::kGoing)
        step();
    const int got = count - static_cast<int>(state.avail_out);
    return got == 0 && progress == Progress::kBroken ? -1 : got;
}

void FZlibDecompressor::step()
{
    if (state.avail_in == 0 && !fill())
    {
        progress = Progress::kBroken;
        return;
    }
    const int result = inflate(&state, Z_NO_FLUSH);
    if (result == Z_STREAM_END)
    {
        progress = Progress::kEnded;
        source->seek(-static_cast<int64>(state.avail_in), kSeekCurrent);
    }
    else if (result != Z_OK)
        progress = Progress::kBroken;
}

bool FZlibDecompressor::fill()
{
    const int64 got = source->readRaw(buffer.data(), static_cast<int64>(buffer.size()));
    state.next_in = buffer.data();
    state.avail_in = got > 0 ? static_cast<uInt>(got) : 0;
    return got > 0;
}

void FZlibDecompressor::end()
{
    if (source)
        inflateEnd(&state);
    source = nullptr;
}
