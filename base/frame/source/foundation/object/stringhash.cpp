#include "foundation/object/stringhash.h"

#include <bit>
#include <cstring>
#include <string>
#include <type_traits>

namespace
{
// The rule: every character is followed by the remainder, in 32 bits. Up to `kLargestShared` buckets nothing passes 32
// bits there, so that a remainder may as well be taken seldom, as long as nothing passes 64 bits. Groups of four
// characters are summed up independently of each other; to put one behind a hash, the hash is multiplied by 64 to the
// power of four, or by the remainder of that, which leaves more room.
constexpr unsigned kLargestShared = 1u << 25;
constexpr unsigned kGroup = 4;
constexpr uint32 kBehindGroup = uint32{1} << 6 * kGroup;

uint32 widened(char character)
{
    return static_cast<uint32>(static_cast<int32>(static_cast<signed char>(character)));
}

uint32 widened(char16 character)
{
    return character;
}

template <class Character>
unsigned hashByRule(const Character* text, size_t length, unsigned size)
{
    uint32 hash = 0;
    for (size_t i = 0; i < length; i++)
        hash = ((hash << 6) + widened(text[i])) % size;
    return hash;
}

/// Four characters in one word.
template <class Character>
using Group = std::conditional_t<sizeof(Character) == 1, uint32, uint64>;

template <class Character>
Group<Character> groupAt(const Character* text)
{
    Group<Character> group;
    memcpy(&group, text, sizeof(group));
    return group;
}

/// The first `count` characters as the last ones of a group; the zeros before them add nothing to a hash.
template <class Character>
Group<Character> startOf(const Character* text, size_t count, size_t length)
{
    constexpr unsigned kBits = 8 * sizeof(Character);
    if (length >= kGroup)
        return static_cast<Group<Character>>(groupAt(text) << kBits * (kGroup - count));
    Character padded[kGroup] = {};
    for (size_t i = 0; i < count; i++)
        padded[kGroup - count + i] = text[i];
    return groupAt(padded);
}

/// The sum of a group whose first character is in the low bits: those of each pair are joined, and then the pairs.
template <class Character>
uint64 sumOf(Group<Character> group)
{
    constexpr unsigned kBits = 8 * sizeof(Character);
    constexpr uint64 kFirst = (uint64{1} << kBits) - 1;
    constexpr uint64 kFirstPair = (uint64{1} << 2 * kBits) - 1;
    constexpr uint64 kFirsts = kFirst << 2 * kBits | kFirst;
    const uint64 pairs = ((group & kFirsts) << 6) + (group >> kBits & kFirsts);
    return ((pairs & kFirstPair) << 12) + (pairs >> 2 * kBits);
}

/// Whether a character counts as negative, so that the text has to go by the rule.
template <class Character>
bool hasNegative(Group<Character> group)
{
    return sizeof(Character) == 1 && (group & 0x80808080) != 0;
}

template <class Character>
unsigned hashText(const Character* text, size_t length, unsigned size)
{
    if (size == 0 || length == 0)
        return 0;
    if (size > kLargestShared || std::endian::native != std::endian::little)
        return hashByRule(text, length, size);
    const uint64 factor = kBehindGroup % size;
    const uint64 largestHash = ~uint64{0} >> (1 + std::bit_width(size));
    const size_t first = (length - 1) % kGroup + 1;
    Group<Character> group = startOf(text, first, length);
    Group<Character> all = group;
    uint64 hash = sumOf<Character>(group);
    for (size_t i = first; i < length; i += kGroup)
    {
        group = groupAt(text + i);
        all |= group;
        if (hash > largestHash)
            hash %= size;
        hash = hash * factor + sumOf<Character>(group);
    }
    if (hasNegative<Character>(all))
        return hashByRule(text, length, size);
    return static_cast<unsigned>(hash % size);
}
} // namespace

unsigned hashString8(const char* text, unsigned size)
{
    return text ? hashString8(text, strlen(text), size) : 0;
}

unsigned hashString16(const char16* text, unsigned size)
{
    return text ? hashString16(text, std::char_traits<char16>::length(text), size) : 0;
}

unsigned hashString8(const char* text, size_t length, unsigned size)
{
    return hashText(text, length, size);
}

unsigned hashString16(const char16* text, size_t length, unsigned size)
{
    return hashText(text, length, size);
}
