#include "foundation/object/stringhash.h"

#include <bit>
#include <cstring>
#include <string>

namespace
{
// The rule: every character is followed by the remainder, in 32 bits. Up to `kLargestShared` buckets nothing passes 32
// bits there, so that a remainder may as well be taken seldom, as long as nothing passes 64 bits. Groups of as many
// characters as fit 64 bits are summed up independently of each other; to put one behind a hash, the hash is multiplied
// by 64 to the power of their number, or by the remainder of that, which leaves more room.
constexpr unsigned kLargestShared = 1u << 25;

template <class Character>
constexpr unsigned kGroup = sizeof(uint64) / sizeof(Character);

template <class Character>
constexpr uint64 kBehindGroup = uint64{1} << 6 * kGroup<Character>;

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

template <class Character>
uint64 groupAt(const Character* text)
{
    uint64 group;
    memcpy(&group, text, sizeof(group));
    return group;
}

/// The first `count` characters as the last ones of a group; the zeros before them add nothing to a hash.
template <class Character>
uint64 startOf(const Character* text, size_t count, size_t length)
{
    constexpr unsigned kBits = 8 * sizeof(Character);
    if (length >= kGroup<Character>)
        return groupAt(text) << kBits * (kGroup<Character> - count);
    Character padded[kGroup<Character>] = {};
    for (size_t i = 0; i < count; i++)
        padded[kGroup<Character> - count + i] = text[i];
    return groupAt(padded);
}

/// Puts the second of two neighbours behind the first, which is in the lower bits: each takes `bits` of them, and the
/// first counts 2 to the power of `shift` times.
template <unsigned bits, unsigned shift>
uint64 joined(uint64 group)
{
    static_assert(bits == 8 || bits == 16 || bits == 32);
    constexpr uint64 kFirsts = bits == 8    ? 0x00FF00FF00FF00FF
                               : bits == 16 ? 0x0000FFFF0000FFFF
                                            : 0x00000000FFFFFFFF;
    return ((group & kFirsts) << shift) + (group >> bits & kFirsts);
}

/// The sum of a group whose first character is in the low bits.
template <class Character>
uint64 sumOf(uint64 group)
{
    if constexpr (sizeof(Character) == 1)
        return joined<32, 24>(joined<16, 12>(joined<8, 6>(group)));
    return joined<32, 12>(joined<16, 6>(group));
}

/// Whether a character counts as negative, so that the text has to go by the rule.
template <class Character>
bool hasNegative(uint64 group)
{
    return sizeof(Character) == 1 && (group & 0x8080808080808080) != 0;
}

template <class Character>
unsigned hashText(const Character* text, size_t length, unsigned size)
{
    if (size == 0 || length == 0)
        return 0;
    if (size > kLargestShared || std::endian::native != std::endian::little)
        return hashByRule(text, length, size);
    const size_t first = (length - 1) % kGroup<Character> + 1;
    uint64 group = startOf(text, first, length);
    uint64 all = group;
    uint64 hash = sumOf<Character>(group);
    const uint64 factor = first < length ? kBehindGroup<Character> % size : 0;
    const uint64 largestHash = ~uint64{0} >> (1 + std::bit_width(size));
    for (size_t i = first; i < length; i += kGroup<Character>)
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
