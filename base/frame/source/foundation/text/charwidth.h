#pragma once

#include "foundation/object/types.h"
#include "foundation/object/wordat.h"

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

/// In eight bytes of a text, the bits that only characters above 127 have.
template <class Char>
inline constexpr uint64 kAboveAscii = sizeof(Char) == 1 ? 0x8080808080808080 : 0xFF80FF80FF80FF80;

/// Whether no character is above 127. Eight bytes are looked at together, and a block of them without a test inside.
template <class Char>
bool isAsciiText(const Char* text, unsigned length)
{
    constexpr unsigned kTogether = sizeof(uint64) / sizeof(Char);
    constexpr unsigned kBlock = 8 * kTogether;
    uint64 bits = 0;
    unsigned i = 0;
    for (; i + kBlock <= length && bits == 0; i += kBlock)
        for (unsigned k = 0; k < kBlock; k += kTogether)
            bits |= wordAt(text + i + k) & kAboveAscii<Char>;
    for (; i < length && bits == 0; ++i)
        bits = static_cast<std::make_unsigned_t<Char>>(text[i]) & ~uint64{0x7F};
    return bits == 0;
}

/// One byte of the default encoding in 16 bits; a blank where it means nothing alone.
char16 widenCharacter(char character);

/// The bytes that a block from `malloc` has, which may be more than were asked for; 0 for null. From the platform.
size_t blockSizeOf(const void* block);
