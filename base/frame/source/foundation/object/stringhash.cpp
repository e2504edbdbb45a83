#include "foundation/object/stringhash.h"

namespace
{
uint32 widened(char character)
{
    return static_cast<uint32>(static_cast<int32>(static_cast<signed char>(character)));
}

uint32 widened(char16 character)
{
    return character;
}

/// The rule: every character is followed by the remainder, in 32 bits.
template <class Character>
unsigned hashOneByOne(const Character* text, unsigned size)
{
    uint32 hash = 0;
    for (; *text; text++)
        hash = ((hash << 6) + widened(*text)) % size;
    return hash;
}

// The remainder may as well be taken of several characters at once, as long as nothing passes 64 bits where they
// are summed up, nor would have passed 32 bits one by one. A byte above 127, which counts as negative, goes alone.
constexpr unsigned kShared = 6;
constexpr unsigned kLargestShared = 1u << 25;

template <class Character>
unsigned hashText(const Character* text, unsigned size)
{
    if (!text || size == 0)
        return 0;
    if (size > kLargestShared)
        return hashOneByOne(text, size);
    uint64 hash = 0;
    while (*text)
    {
        unsigned taken = 0;
        for (; taken<kShared&& * text> 0; taken++)
            hash = (hash << 6) + widened(*text++);
        if (taken == 0)
            hash = static_cast<uint32>((hash << 6) + widened(*text++));
        hash %= size;
    }
    return static_cast<unsigned>(hash);
}
} // namespace

unsigned hashString8(const char* text, unsigned size)
{
    return hashText(text, size);
}

unsigned hashString16(const char16* text, unsigned size)
{
    return hashText(text, size);
}
