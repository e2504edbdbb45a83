#include "storage/path/filenametext.h"

#include <cstring>

namespace
{
using Bytes = const unsigned char*;

constexpr char16 kStrayByte = 0xDC00;

bool isHighSurrogate(char16 c)
{
    return c >= 0xD800 && c <= 0xDBFF;
}

bool isLowSurrogate(char16 c)
{
    return c >= 0xDC00 && c <= 0xDFFF;
}

bool isStrayByte(char16 c)
{
    return c >= kStrayByte + 0x80 && c <= kStrayByte + 0xFF;
}

// The length that the first byte of a sequence announces; 0 where none begins with it.
int announcedLength(unsigned char first)
{
    if (first < 0x80)
        return 1;
    if (first >= 0xC2 && first < 0xE0)
        return 2;
    if (first >= 0xE0 && first < 0xF0)
        return 3;
    return first >= 0xF0 && first < 0xF5 ? 4 : 0;
}

bool isShortestForm(uint32 code, int length)
{
    return (length < 3 || code >= 0x800) && (length < 4 || code >= 0x10000);
}

bool isCharacter(uint32 code)
{
    return code <= 0x10FFFF && (code < 0xD800 || code > 0xDFFF);
}

// Reads one character of valid UTF-8; gives its length, 0 where there is none. Stops at the terminator.
int decode(Bytes bytes, uint32& code)
{
    const int length = announcedLength(bytes[0]);
    if (length <= 1)
    {
        code = bytes[0];
        return length;
    }
    code = bytes[0] & (0x7Fu >> length);
    for (int i = 1; i < length; i++)
    {
        if ((bytes[i] & 0xC0) != 0x80)
            return 0;
        code = (code << 6) | (bytes[i] & 0x3Fu);
    }
    return isShortestForm(code, length) && isCharacter(code) ? length : 0;
}

void append(std::u16string& text, uint32 code)
{
    if (code < 0x10000)
    {
        text += static_cast<char16>(code);
        return;
    }
    code -= 0x10000;
    text += static_cast<char16>(0xD800 + (code >> 10));
    text += static_cast<char16>(0xDC00 + (code & 0x3FF));
}

char byteOf(uint32 value)
{
    return static_cast<char>(static_cast<unsigned char>(value));
}

void encode(std::string& bytes, uint32 code)
{
    if (code < 0x80)
    {
        bytes += byteOf(code);
        return;
    }
    const int tail = code < 0x800 ? 1 : code < 0x10000 ? 2 : 3;
    const uint32 mark = tail == 1 ? 0xC0 : tail == 2 ? 0xE0 : 0xF0;
    bytes += byteOf(mark | (code >> (6 * tail)));
    for (int i = tail - 1; i >= 0; i--)
        bytes += byteOf(0x80 | ((code >> (6 * i)) & 0x3F));
}
} // namespace

void FileNameText::fromBytes(const char* bytes, String& text)
{
    std::u16string wide;
    wide.reserve(strlen(bytes));
    for (Bytes next = reinterpret_cast<Bytes>(bytes); *next;)
    {
        uint32 code = 0;
        const int length = decode(next, code);
        append(wide, length > 0 ? code : kStrayByte + static_cast<uint32>(*next));
        next += length > 0 ? length : 1;
    }
    text.assign(wide.c_str());
}

std::string FileNameText::toBytes(const ConstString& text)
{
    const String wide(text);
    const char16* next = wide.text16();
    std::string bytes;
    bytes.reserve(wide.length());
    for (; *next; next++)
    {
        if (isHighSurrogate(next[0]) && isLowSurrogate(next[1]))
        {
            encode(bytes, 0x10000 + ((next[0] & 0x3FFu) << 10) + (next[1] & 0x3FFu));
            next++;
        }
        else if (isStrayByte(*next))
            bytes += byteOf(*next);
        else
            encode(bytes, *next);
    }
    return bytes;
}

std::string FileNameText::toDecomposedBytes(const ConstString& text)
{
    String wide(text);
    wide.toWideString();
    wide.normalize(kUnicodeNormD);
    return toBytes(wide);
}
