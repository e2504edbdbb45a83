#include "containers/value/buffer.h"

#include "foundation/text/string.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <string>
#include <utility>

namespace
{
constexpr uint32 kDefaultDelta = 4096;

/// The block at its new size, or null; the old one is gone in any case.
char* reallocated(char* block, uint32 oldSize, uint32 size)
{
    if (void* grown = realloc(block, size))
        return static_cast<char*>(grown);
    void* copy = malloc(size);
    if (copy && block)
        memcpy(copy, block, std::min(oldSize, size));
    free(block);
    return static_cast<char*>(copy);
}

int digitValue(char digit)
{
    if (digit >= '0' && digit <= '9')
        return digit - '0';
    if (digit >= 'A' && digit <= 'F')
        return digit - 'A' + 10;
    if (digit >= 'a' && digit <= 'f')
        return digit - 'a' + 10;
    return -1;
}
} // namespace

Buffer::Buffer(uint32 size)
{
    setSize(size);
}

Buffer::Buffer(uint32 size, uint8 fill)
{
    setSize(size);
    set(fill);
}

Buffer::Buffer(const void* data, uint32 size)
{
    if (setSize(size) && data && size > 0)
    {
        memcpy(buffer, data, size);
        fillSize = size;
    }
}

Buffer::Buffer(const Buffer& other) : Buffer(other.buffer, other.memSize)
{
    fillSize = std::min(other.fillSize, memSize);
    delta = other.delta;
}

Buffer::~Buffer()
{
    free(buffer);
}

Buffer& Buffer::operator=(const Buffer& other)
{
    if (this == &other)
        return *this;
    Buffer copy(other);
    take(copy);
    return *this;
}

bool Buffer::setSize(uint32 size)
{
    if (size == memSize)
        return true;
    const uint32 oldSize = std::exchange(memSize, 0);
    char* const oldBuffer = std::exchange(buffer, nullptr);
    const uint32 oldFillSize = std::exchange(fillSize, 0);
    if (size == 0)
    {
        free(oldBuffer);
        return true;
    }

    buffer = reallocated(oldBuffer, oldSize, size);
    if (!buffer)
        return false;
    if (size > oldSize)
        memset(buffer + oldSize, 0, size - oldSize);
    memSize = size;
    fillSize = std::min(oldFillSize, size);
    return true;
}

bool Buffer::reserve(uint64 size)
{
    if (size <= memSize)
        return true;
    if (delta == 0)
        delta = kDefaultDelta;
    const uint64 rounded = (size + delta - 1) / delta * delta;
    return rounded <= std::numeric_limits<uint32>::max() && setSize(static_cast<uint32>(rounded));
}

bool Buffer::operator==(const Buffer& other) const
{
    return memSize == other.memSize && (memSize == 0 || memcmp(buffer, other.buffer, memSize) == 0);
}

bool Buffer::put(const void* data, uint32 count)
{
    if (!data || !reserve(uint64{fillSize} + count))
        return false;
    if (count > 0)
        memcpy(buffer + fillSize, data, count);
    fillSize += count;
    return true;
}

bool Buffer::put(const String& text)
{
    const bool isWide = text.isWideString();
    const void* characters = isWide ? static_cast<const void*>(text.text16()) : text.text8();
    return put(characters, (text.length() + 1) * static_cast<uint32>(isWide ? sizeof(char16) : sizeof(char)));
}

uint32 Buffer::get(void* data, uint32 count)
{
    const uint32 taken = std::min(count, memSize - fillSize);
    if (!data || taken == 0)
        return 0;
    memcpy(data, buffer + fillSize, taken);
    fillSize += taken;
    return taken;
}

void Buffer::set(uint8 value)
{
    if (buffer)
        memset(buffer, value, memSize);
}

void Buffer::fillup(uint8 value)
{
    if (buffer)
        memset(buffer + fillSize, value, memSize - fillSize);
}

bool Buffer::copy(uint32 from, uint32 to, uint32 count)
{
    if (from > memSize || count > memSize - from || !reserve(uint64{to} + count))
        return false;
    if (count > 0)
        memmove(buffer + to, buffer + from, count);
    return true;
}

bool Buffer::move(int amount, uint8 fill)
{
    if (amount > 0)
    {
        if (!shiftAt(0, amount))
            return false;
        memset(buffer, fill, static_cast<uint32>(amount));
        return true;
    }
    const uint32 dropped = std::min(fillSize, 0u - static_cast<uint32>(amount));
    return shiftAt(0, -static_cast<int>(dropped));
}

bool Buffer::shiftAt(uint32 position, int amount)
{
    if (position > fillSize)
        return false;
    const uint32 tail = fillSize - position;
    if (amount < 0)
    {
        const uint32 removed = 0u - static_cast<uint32>(amount);
        if (removed > tail)
            return false;
        memmove(buffer + position, buffer + position + removed, tail - removed);
        fillSize -= removed;
        return true;
    }

    const auto gap = static_cast<uint32>(amount);
    if (!reserve(uint64{fillSize} + gap))
        return false;
    if (tail > 0)
        memmove(buffer + position + gap, buffer + position, tail);
    fillSize += gap;
    return true;
}

void Buffer::take(Buffer& other)
{
    if (this == &other)
        return;
    free(buffer);
    buffer = std::exchange(other.buffer, nullptr);
    memSize = std::exchange(other.memSize, 0);
    fillSize = std::exchange(other.fillSize, 0);
    delta = other.delta;
}

void* Buffer::pass()
{
    memSize = fillSize = 0;
    return std::exchange(buffer, nullptr);
}

bool Buffer::swap(int16 width)
{
    if (width != 2 && width != 4 && width != 8)
        return false;
    const auto step = static_cast<uint32>(width);
    if (fillSize % step != 0)
        return false;
    for (uint32 i = 0; i < fillSize; i += step)
        std::reverse(buffer + i, buffer + i + step);
    return true;
}

bool Buffer::insertText(uint32 position, const void* text, size_t count, uint32 width)
{
    const size_t bytes = count * width;
    if (!reserve(uint64{fillSize} + bytes + width))
        return false;
    memmove(buffer + position + bytes, buffer + position, fillSize - position);
    memcpy(buffer + position, text, bytes);
    fillSize += static_cast<uint32>(bytes);
    memset(buffer + fillSize, 0, width);
    return true;
}

bool Buffer::appendString8(const char* text)
{
    return text && insertText(fillSize, text, strlen(text), sizeof(char));
}

bool Buffer::appendString16(const char16* text)
{
    return text && insertText(fillSize, text, std::char_traits<char16>::length(text), sizeof(char16));
}

bool Buffer::prependString8(const char* text)
{
    return text && insertText(0, text, strlen(text), sizeof(char));
}

bool Buffer::prependString16(const char16* text)
{
    return text && insertText(0, text, std::char_traits<char16>::length(text), sizeof(char16));
}

bool Buffer::toWideString(int encoding)
{
    String text;
    text.assign(str8(), static_cast<int>(fillSize), false);
    if (!text.toWideString(static_cast<unsigned>(encoding)))
        return false;
    fillSize = 0;
    return insertText(0, text.text16(), text.length(), sizeof(char16));
}

bool Buffer::toMultibyteString(int encoding)
{
    const auto length = static_cast<int>(fillSize / sizeof(char16));
    String text;
    if (length > 0)
        text.assign(reinterpret_cast<const char16*>(buffer), length, false);
    if (!text.toMultiByte(static_cast<unsigned>(encoding)))
        return false;
    fillSize = 0;
    return insertText(0, text.text8(), text.length(), sizeof(char));
}

bool Buffer::makeHexString(String& result) const
{
    constexpr const char* kDigits = "0123456789ABCDEF";
    std::string digits;
    digits.reserve(size_t{fillSize} * 2);
    for (uint32 i = 0; i < fillSize; i++)
    {
        const auto byte = static_cast<uint8>(buffer[i]);
        digits += kDigits[byte >> 4];
        digits += kDigits[byte & 15];
    }
    result.assign(digits.c_str());
    return result.length() == digits.size();
}

bool Buffer::fromHexString(const char* text)
{
    fillSize = 0;
    const size_t length = text ? strlen(text) : 0;
    if (length == 0 || length % 2 != 0 || !reserve(length / 2))
        return false;
    for (; *text != 0; text += 2)
    {
        const int high = digitValue(text[0]);
        const int low = digitValue(text[1]);
        if (high < 0 || low < 0)
            return false;
        buffer[fillSize++] = static_cast<char>(high * 16 + low);
    }
    return true;
}
