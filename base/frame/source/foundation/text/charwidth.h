#pragma once

#include "foundation/object/types.h"

#include <string_view>
#include <type_traits>

// Helpers of the string family for characters of either width.

inline constexpr unsigned kMaxTextLength = 0x3FFFFFFF;

inline unsigned charSize(bool wide)
{
    return wide ? sizeof(char16) : sizeof(char);
}

/// The number of characters before the terminator; 0 for null.
template <class Char>
unsigned measureText(const Char* text)
{
    return text ? static_cast<unsigned>(std::char_traits<Char>::length(text)) : 0;
}

/// As `measureText`, but of at most the first `count` characters, which need no terminator.
template <class Char>
unsigned measureText(const Char* text, unsigned count)
{
    if (!text)
        return 0;
    const Char* end = std::char_traits<Char>::find(text, count, Char(0));
    return end ? static_cast<unsigned>(end - text) : count;
}

/// Whether no character is above 127. Blocks without a test inside let the compiler use wide registers.
template <class Char>
bool isAsciiText(const Char* text, unsigned length)
{
    constexpr unsigned kBlock = 64;
    unsigned bits = 0;
    unsigned i = 0;
    for (; i + kBlock <= length && bits < 0x80; i += kBlock)
        for (unsigned k = 0; k < kBlock; ++k)
            bits |= static_cast<std::make_unsigned_t<Char>>(text[i + k]);
    for (; i < length && bits < 0x80; ++i)
        bits |= static_cast<std::make_unsigned_t<Char>>(text[i]);
    return bits < 0x80;
}

/// One byte of the default encoding in 16 bits; a blank where it means nothing alone.
char16 widenCharacter(char character);
