#include "foundation/text/utf8.h"

#include "foundation/object/wordat.h"
#include "foundation/text/charwidth.h"

#include <bit>
#include <cstring>

namespace
{
constexpr unsigned kBlock = 16;
constexpr unsigned kLargeBlock = 128;

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

// Each takes one character of its number of bytes at `in`, if one stands there, and steps behind it.

bool takeTwo(const Byte*& in, const Byte* end, char16*& out)
{
    if (in[0] < 0xC2 || end - in < 2)
        return false;
    const unsigned a = continuation(in[1]);
    if (a >= 64)
        return false;
    *out++ = static_cast<char16>((in[0] & 0x1Fu) << 6 | a);
    in += 2;
    return true;
}

bool takeThree(const Byte*& in, const Byte* end, char16*& out)
{
    if (end - in < 3)
        return false;
    const unsigned a = continuation(in[1]);
    const unsigned b = continuation(in[2]);
    const unsigned character = (in[0] & 0x0Fu) << 12 | a << 6 | b;
    if ((a | b) >= 64 || character < 0x800 || isSurrogate(character))
        return false;
    *out++ = static_cast<char16>(character);
    in += 3;
    return true;
}

bool takeFour(const Byte*& in, const Byte* end, char16*& out)
{
    if (end - in < 4)
        return false;
    const unsigned a = continuation(in[1]);
    const unsigned b = continuation(in[2]);
    const unsigned c = continuation(in[3]);
    const unsigned character = (in[0] & 0x0Fu) << 18 | a << 12 | b << 6 | c;
    if ((a | b | c) >= 64 || character < 0x10000 || character > 0x10FFFF)
        return false;
    *out++ = static_cast<char16>(0xD7C0 + (character >> 10));
    *out++ = static_cast<char16>(0xDC00 + (character & 0x3FF));
    in += 4;
    return true;
}

bool takeCharacter(const Byte*& in, const Byte* end, char16*& out)
{
    const unsigned lead = *in;
    if (lead < 0xE0)
        return takeTwo(in, end, out);
    if (lead < 0xF0)
        return takeThree(in, end, out);
    return lead < 0xF5 && takeFour(in, end, out);
}

/// How many of the first `kBlock` characters stand before one above 127: eight bytes are looked at together.
template <class Element>
unsigned countAscii(const Element* text)
{
    constexpr unsigned kTogether = sizeof(uint64) / sizeof(Element);
    constexpr unsigned kBitsPerElement = 8 * sizeof(Element);
    for (unsigned i = 0; i < kBlock; i += kTogether)
    {
        const uint64 word = wordAt(text + i) & kAboveAscii<Element>;
        if (word == 0)
            continue;
        const int bits =
            std::endian::native == std::endian::little ? std::countr_zero(word) : std::countl_zero(word);
        return i + static_cast<unsigned>(bits) / kBitsPerElement;
    }
    return kBlock;
}

template <unsigned size, class Element>
bool isAsciiBlock(const Element* text)
{
    uint64 all = 0;
    for (unsigned i = 0; i < size; i += sizeof(uint64) / sizeof(Element))
        all |= wordAt(text + i);
    return (all & kAboveAscii<Element>) == 0;
}

/// Copies `kBlock` characters to elements of another size. What is written to a place of its own can't be what is read
/// next, and so goes through wide registers.
template <class From, class To>
void copyBlock(const From* in, To* out)
{
    To to[kBlock];
    for (unsigned i = 0; i < kBlock; ++i)
        to[i] = static_cast<To>(in[i]);
    memcpy(out, to, sizeof(to));
}

/// Copies the characters below 128 at both places and steps behind them. A block is written whole, and then what
/// follows writes over what was none of them: there is room, since no character gives less than one element.
template <class From, class To>
void copyAscii(const From*& in, const From* end, To*& out)
{
    while (end - in >= kBlock)
    {
        copyBlock(in, out);
        // Most blocks are plain; where in one the other character stands is asked only then.
        const bool isPlain = isAsciiBlock<kBlock>(in);
        const unsigned count = isPlain ? kBlock : countAscii(in);
        in += count;
        out += count;
        if (!isPlain)
            return;
    }
    while (in < end && *in < 0x80)
        *out++ = static_cast<To>(*in++);
}

/// Cuts blocks of `size` characters to bytes, up to the first one that has a character above 127.
template <unsigned size>
void narrowAsciiBlocks(const char16*& in, const char16* end, char*& out)
{
    for (; end - in >= size && isAsciiBlock<size>(in); in += size)
        for (unsigned i = 0; i < size; i += kBlock, out += kBlock)
            copyBlock(in + i, out);
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
            if (!takeCharacter(in, end, out))
            {
                *out++ = loss;
                ++in;
            }
    }
    return static_cast<unsigned>(out - result);
}

unsigned encodeAsciiStart(const char16* text, unsigned length, char* result)
{
    const char16* in = text;
    const char16* end = in + length;
    narrowAsciiBlocks<kLargeBlock>(in, end, result);
    narrowAsciiBlocks<kBlock>(in, end, result);
    while (in < end && *in < 0x80)
        *result++ = static_cast<char>(*in++);
    return static_cast<unsigned>(in - text);
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
