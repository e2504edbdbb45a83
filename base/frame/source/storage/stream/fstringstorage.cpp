#include "foundation/text/fstring.h"
#include "storage/stream/fstream.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace
{
/// Larger texts are not taken from a stream: a damaged length must not ask for memory.
constexpr int32 kMaxStoredSize = 50000;

constexpr char kUtf8Marker[] = "\xEF\xBB\xBF";
constexpr int32 kMarkerSize = 3;

bool isMarker(const char* bytes)
{
    return std::memcmp(bytes, kUtf8Marker, kMarkerSize) == 0;
}

bool writeText(FStreamer& stream, const ConstString& text, bool withMarker)
{
    if (text.isEmpty())
        return stream.writeInt32(0);
    const auto size = static_cast<int32>(text.length()) + 1;
    if (!stream.writeInt32(size + (withMarker ? kMarkerSize : 0)) ||
        stream.writeRaw(text.text(), size) != size)
        return false;
    return !withMarker || stream.writeRaw(kUtf8Marker, kMarkerSize) == kMarkerSize;
}

/// Gives `text` the bytes of the stored form; wide where they are marked as UTF-8.
bool readText(String& text, const char* bytes, int32 size)
{
    const bool markedBehind = size > kMarkerSize && isMarker(bytes + size - kMarkerSize);
    const bool markedBefore = !markedBehind && size >= kMarkerSize && isMarker(bytes);
    if (!markedBehind && !markedBefore)
    {
        text.assign(bytes, bytes[size - 1] == 0 ? size - 1 : size, false);
        return true;
    }
    text.assign(bytes + (markedBefore ? kMarkerSize : 0), std::max(size - kMarkerSize - 1, 0), false);
    return text.toWideString(kEncodingUtf8);
}
} // namespace

bool FString::store(FStream& stream) const
{
    if (!isWideString())
        return writeText(stream, *this, false);
    String narrow(*this);
    return narrow.toMultiByte(kEncodingUtf8) && writeText(stream, narrow, true);
}

bool FString::load(FStream& stream)
{
    int32 size = 0;
    const bool hasSize = stream.readInt32(size);
    if (!hasSize || size > kMaxStoredSize)
    {
        stream.seek(size, kSeekCurrent);
        return false;
    }
    if (size <= 0)
    {
        remove();
        return true;
    }
    auto* bytes = static_cast<char*>(std::malloc(static_cast<std::size_t>(size)));
    const bool isWhole = bytes && stream.readRaw(bytes, size) == size && readText(*this, bytes, size);
    std::free(bytes);
    return isWhole;
}

bool FString::storeString8(FStream& stream, const char* text, int count)
{
    return FString(text, count).store(stream);
}

bool FString::storeString16(FStream& stream, const char16* text, int count)
{
    return FString(text, count).store(stream);
}
