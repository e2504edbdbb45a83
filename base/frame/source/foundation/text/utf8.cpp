#include "foundation/text/utf8.h"

#include "foundation/text/charwidth.h"

namespace
{
constexpr unsigned kBlock = 16;

using Byte = unsigned char;

/// The six bits of a continuation byte; above 63 where the byte is none.
unsigned continuation(Byte byte)
{
    return byte ^ 0x80u;
}

bool isSurrogate(unsigned character)
{
    return (character & 0xF800) == 0xD800;
}

/// Takes one character of 2 to 4 bytes. Gives the number of bytes; 0 where `text` doesn't begin with one.
unsigned decodeCharacter(const Byte* text, std::size_t rest, unsigned& character)
{
    const unsigned lead = text[0];
    if (lead < 0xE0)
    {
        if (lead < 0xC2 || rest < 2)
            return 0;
        const unsigned a = continuation(text[1]);
        character = (lead & 0x1F) << 6 | a;
        return a < 64 ? 2 : 0;
    }
    if (lead < 0xF0)
    {
        if (rest < 3)
            return 0;
        const unsigned a = continuation(text[1]);
        const unsigned b = continuation(text[2]);
        character = (lead & 0x0F) << 12 | a << 6 | b;
        return (a | b) < 64 && character >= 0x800 && !isSurrogate(character) ? 3 : 0;
    }
    if (lead > 0xF4 || rest < 4)
        return 0;
    const unsigned a = continuation(text[1]);
    const unsigned b = continuation(text[2]);
    const unsigned c = continuation(text[3]);
    character = (lead & 0x07) << 18 | a << 12 | b << 6 | c;
    return (a | b | c) < 64 && character >= 0x10000 && character <= 0x10FFFF ? 4 : 0;
}

char16* putCharacter(char16* out, unsigned character)
{
    if (character < 0x10000)
    {
        *out++ = static_cast<char16>(character);
        return out;
    }
    *out++ = static_cast<char16>(0xD7C0 + (character >> 10));
    *out++ = static_cast<char16>(0xDC00 + (character & 0x3FF));
    return out;
}

/// Whole blocks let the compiler use wide registers.
template <class Element>
bool isAsciiBlock(const Element* text)
{
    unsigned bits = 0;
    for (unsigned i = 0; i < kBlock; ++i)
        bits |= text[i];
    return bits < 0x80;
}

/// Copies the characters below 128 at both places and steps behind them.
template <class From, class To>
void copyAscii(const From*& in, const From* end, To*& out)
{
    while (end - in >= kBlock && isAsciiBlock(in))
    {
        for (unsigned i = 0; i < kBlock; ++i)
            out[i] = static_cast<To>(in[i]);
        in += kBlock;
        out += kBlock;
    }
    while (in < end && *in < 0x80)
        *out++ = static_cast<To>(*in++);
}
/// Writes the character above 127 at `in` and steps behind it.
Byte* encodeCharacter(const char16*& in, const char16* end, Byte* out, char loss)
{
    const unsigned first = *in++;
    if (first < 0x800)
    {
        *out++ = static_cast<Byte>(0xC0 | first >> 6);
        *out++ = static_cast<Byte>(0x80 | (first & 0x3F));
        return out;
    }
    if (!isSurrogate(first))
    {
        *out++ = static_cast<Byte>(0xE0 | first >> 12);
        *out++ = static_cast<Byte>(0x80 | (first >> 6 & 0x3F));
        *out++ = static_cast<Byte>(0x80 | (first & 0x3F));
        return out;
    }
    if (first >= 0xDC00 || in == end || (*in & 0xFC00) != 0xDC00)
    {
        *out++ = static_cast<Byte>(loss);
        return out;
    }
    const unsigned character = 0x10000 + ((first & 0x3FF) << 10 | (*in++ & 0x3FFu));
    *out++ = static_cast<Byte>(0xF0 | character >> 18);
    *out++ = static_cast<Byte>(0x80 | (character >> 12 & 0x3F));
    *out++ = static_cast<Byte>(0x80 | (character >> 6 & 0x3F));
    *out++ = static_cast<Byte>(0x80 | (character & 0x3F));
    return out;
}
} // namespace

unsigned decodeUtf8(const char* text, unsigned length, char16* result, char16 loss)
{
    const auto* in = reinterpret_cast<const Byte*>(text);
    const Byte* end = in + length;
    char16* out = result;
    while (in < end)
    {
        if (*in < 0x80)
            copyAscii(in, end, out);
        while (in < end && *in >= 0x80)
        {
            unsigned character = 0;
            const unsigned taken = decodeCharacter(in, static_cast<std::size_t>(end - in), character);
            out = putCharacter(out, taken == 0 ? loss : character);
            in += taken == 0 ? 1 : taken;
        }
    }
    return static_cast<unsigned>(out - result);
}

unsigned encodeUtf8(const char16* text, unsigned length, char* result, char loss)
{
    const char16* in = text;
    const char16* end = in + length;
    auto* out = reinterpret_cast<Byte*>(result);
    while (in < end)
    {
        if (*in < 0x80)
            copyAscii(in, end, out);
        while (in < end && *in >= 0x80)
            out = encodeCharacter(in, end, out, loss);
    }
    return static_cast<unsigned>(out - reinterpret_cast<Byte*>(result));
}
