#include "storage/stream/fstreamer.h"

#include "containers/value/buffer.h"
#include "foundation/text/string.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>

namespace
{
constexpr char kUtf8Mark[] = "\xEF\xBB\xBF";
constexpr uint32 kUtf8MarkSize = 3;

bool hasUtf8Mark(const Buffer& text)
{
    return text.getFillSize() >= kUtf8MarkSize && memcmp(text.ptr(), kUtf8Mark, kUtf8MarkSize) == 0;
}
} // namespace

bool FStreamer::readBool(bool& value)
{
    int16 number;
    const bool isRead = readInt16(number);
    value = number != 0;
    return isRead;
}

bool FStreamer::skip(uint32 count)
{
    char byte;
    for (; count > 0; count--)
        if (!readChar8(byte))
            return false;
    return true;
}

bool FStreamer::pad(uint32 count)
{
    for (; count > 0; count--)
        if (!writeChar8(0))
            return false;
    return true;
}

bool FStreamer::writeStr8(const char* text)
{
    const size_t count = text ? strlen(text) + 1 : 0;
    if (count > static_cast<size_t>(std::numeric_limits<int32>::max()))
        return false;
    if (!writeInt32(static_cast<int32>(count)))
        return false;
    const auto bytes = static_cast<int64>(count);
    return bytes == 0 || writeRaw(text, bytes) == bytes;
}

char* FStreamer::readStr8()
{
    int32 count;
    if (!readInt32(count) || count <= 0)
        return nullptr;
    // A damaged count may be far greater than the stream: memory follows the bytes that come.
    constexpr int32 kPiece = 65536;
    if (count > kPiece)
        return readLongStr8(count);
    char* text = new (std::nothrow) char[static_cast<size_t>(count) + 1];
    if (text)
        text[std::max<int64>(readRaw(text, count), 0)] = 0;
    return text;
}

char* FStreamer::readLongStr8(int32 count)
{
    Buffer body;
    const auto wanted = static_cast<uint32>(count);
    while (body.getFillSize() < wanted)
    {
        const uint32 done = body.getFillSize();
        const uint32 piece = std::min(wanted - done, std::max(done, 65536u));
        if (!body.grow(done + piece))
            return nullptr;
        const int64 got = std::max<int64>(readRaw(body + done, piece), 0);
        body.setFillSize(done + static_cast<uint32>(got));
        if (got < piece)
            break;
    }
    char* text = new (std::nothrow) char[size_t{body.getFillSize()} + 1];
    if (!text)
        return nullptr;
    memcpy(text, body.str8(), body.getFillSize());
    text[body.getFillSize()] = 0;
    return text;
}

int64 FStreamer::getStr8Size(const char* text)
{
    return text ? static_cast<int64>(strlen(text)) + 5 : 4;
}

bool FStreamer::writeString8(const char* text, bool withTerminator)
{
    const char* const written = text ? text : "";
    const auto count = static_cast<int64>(strlen(written)) + (withTerminator ? 1 : 0);
    return count == 0 || writeRaw(written, count) == count;
}

int64 FStreamer::readString8(char* buffer, int64 size)
{
    if (!buffer || size < 1)
        return 0;
    int64 length = 0;
    char byte;
    while (length < size && readChar8(byte) && byte != 0)
    {
        if (byte != '\n')
        {
            buffer[length++] = byte;
            continue;
        }
        if (length > 0 && buffer[length - 1] == '\r')
            length--;
        break;
    }
    length = std::min(length, size - 1);
    buffer[length] = 0;
    return length;
}

bool FStreamer::writeStringUtf8(const char16* text)
{
    String bytes(text ? text : kEmptyString16);
    const bool needsMark = !bytes.isAsciiString();
    if (!bytes.toMultiByte(kEncodingUtf8))
        return false;
    return (!needsMark || writeString8(kUtf8Mark, false)) && writeString8(bytes.text8(), true);
}

int FStreamer::readStringUtf8(char16* buffer, int maxChars)
{
    if (!buffer || maxChars < 1)
        return 0;
    buffer[0] = 0;
    Buffer bytes;
    char byte;
    while (readChar8(byte) && bytes.put(byte) && byte != 0)
    {
    }
    if (bytes.getFillSize() < 2)
        return 0;

    const bool isUtf8 = hasUtf8Mark(bytes);
    bytes.put('\0');
    String text(bytes.str8() + (isUtf8 ? kUtf8MarkSize : 0));
    if (!text.toWideString(isUtf8 ? kEncodingUtf8 : kEncodingDefault))
        return 0;
    return text.copyTo16(buffer, 0, std::min(maxChars - 1, static_cast<int>(text.length())));
}
