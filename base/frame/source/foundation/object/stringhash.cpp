#include "foundation/object/stringhash.h"

#include "foundation/object/wordat.h"

#include <bit>
#include <cstring>
#include <string>
#include <type_traits>

namespace
{
// The rule: every character is followed by the remainder, in 32 bits. Up to `kLargestShared` buckets nothing passes 32
// bits there, so that a remainder may as well be taken seldom, as long as nothing passes 64 bits. Groups of eight
// characters are summed up independently of each other, from as many words as they need; to put one behind a hash, the
// hash is multiplied by 64 to the power of eight, or by the remainder of that, which leaves more room.
constexpr unsigned kLargestShared = 1u << 25;
constexpr unsigned kGroup = 8;
constexpr uint64 kBehindGroup = uint64{1} << 6 * kGroup;

/// The characters in a word, and how far what stands before them is shifted.
template <class Character>
constexpr unsigned kWord = sizeof(uint64) / sizeof(Character);
template <class Character>
constexpr unsigned kShift = 6 * kWord<Character>;

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

/// The first `count` characters as the last ones of a word; the zeros before them add nothing to a hash.
template <class Character>
uint64 startOf(const Character* text, size_t count, size_t length)
{
    constexpr unsigned kBits = 8 * sizeof(Character);
    if (length >= kWord<Character>)
        return wordAt(text) << kBits * (kWord<Character> - count);
    Character padded[kWord<Character>] = {};
    for (size_t i = 0; i < count; i++)
        padded[kWord<Character> - count + i] = text[i];
    return wordAt(padded);
}

/// Puts the second of two neighbours behind the first, which is in the lower bits: each takes `bits` of them, and the
/// first counts 2 to the power of `shift` times.
template <unsigned bits, unsigned shift>
uint64 joined(uint64 word)
{
    static_assert(bits == 8 || bits == 16 || bits == 32);
    constexpr uint64 kFirsts = bits == 8    ? 0x00FF00FF00FF00FF
                               : bits == 16 ? 0x0000FFFF0000FFFF
                                            : 0x00000000FFFFFFFF;
    return ((word & kFirsts) << shift) + (word >> bits & kFirsts);
}

/// The sum of a word whose first character is in the low bits.
template <class Character>
uint64 sumOf(uint64 word)
{
    if constexpr (sizeof(Character) == 1)
        return joined<32, 24>(joined<16, 12>(joined<8, 6>(word)));
    return joined<32, 12>(joined<16, 6>(word));
}

/// The sum of `count` characters in whole words, whose bits are added to `all`.
template <unsigned count, class Character>
uint64 sumAt(const Character* text, uint64& all)
{
    uint64 sum = 0;
    for (unsigned i = 0; i < count; i += kWord<Character>)
    {
        const uint64 word = wordAt(text + i);
        all |= word;
        sum = sumOf<Character>(word) + (sum << kShift<Character>);
    }
    return sum;
}

/// Whether a character counts as negative, so that the text has to go by the rule.
template <class Character>
bool hasNegative(uint64 word)
{
    return sizeof(Character) == 1 && (word & 0x8080808080808080) != 0;
}

template <class Character>
unsigned hashWords(const Character* text, size_t length, unsigned size)
{
    if (size > kLargestShared || std::endian::native != std::endian::little)
        return hashByRule(text, length, size);
    size_t done = (length - 1) % kWord<Character> + 1;
    uint64 all = startOf(text, done, length);
    uint64 hash = sumOf<Character>(all);
    // As many words as stand before whole groups; these can't pass 64 bits.
    for (; (length - done) % kGroup != 0; done += kWord<Character>)
        hash = sumAt<kWord<Character>>(text + done, all) + (hash << kShift<Character>);
    const uint64 factor = done < length ? kBehindGroup % size : 0;
    const uint64 largestHash = ~uint64{0} >> (1 + std::bit_width(size));
    for (; done < length; done += kGroup)
    {
        if (hash > largestHash)
            hash %= size;
        hash = hash * factor + sumAt<kGroup>(text + done, all);
    }
    if (hasNegative<Character>(all))
        return hashByRule(text, length, size);
    return static_cast<unsigned>(hash % size);
}

// A hash is also the sum of all characters, each times the power of 64 that its place asks for, or times the remainder
// of that, which may be known beforehand. Plain texts that two blocks of 16 bytes cover are summed up that way: their
// characters times remainders of 15 bits stay within 32 bits, and compilers turn a sum of products into a few
// instructions.
template <class Character>
constexpr unsigned kBlock = 16 / sizeof(Character);
constexpr unsigned kLargestFor16Bits = 1u << 15;

/// The remainders of the powers of 64 for one number of buckets, the one that the thread goes on asking for.
///
/// To find them takes as long as some twenty hashes, so a number is learnt only when it was asked for often, and no other
/// unknown one meanwhile. One thread at a time.
template <class Character>
class Powers
{
public:
    bool areFor(unsigned buckets)
    {
        return buckets == size || (buckets <= kLargestFor16Bits && learn(buckets));
    }

    /// For the first block of a text of `length` characters; zeros for the characters that the last block has too.
    const int16* ofFirstBlock(size_t length) const { return first + 2 * kBlock<Character> - length; }
    const int16* ofLastBlock() const { return last; }

private:
    static constexpr unsigned kOften = 64;

    bool learn(unsigned buckets);

    /// At first one bucket, for which all remainders are 0.
    unsigned size = 1;
    unsigned candidate = 0;
    unsigned asked = 0;
    int16 first[2 * kBlock<Character>] = {};
    int16 last[kBlock<Character>] = {};
};

template <class Character>
bool Powers<Character>::learn(unsigned buckets)
{
    if (buckets != candidate)
        asked = 0;
    candidate = buckets;
    if (buckets == 0 || ++asked < kOften)
        return false;
    size = buckets;
    uint32 power = 1 % size;
    for (int16* block : {last, first})
        for (unsigned i = kBlock<Character>; i-- > 0; power = power * 64 % size)
            block[i] = static_cast<int16>(power);
    return true;
}

template <class Character>
constinit thread_local Powers<Character> powers;

template <class Character>
int16 asFactor(Character character)
{
    return static_cast<int16>(static_cast<std::make_unsigned_t<Character>>(character));
}

template <class Character>
uint32 blockSum(const Character* text, const int16* factors)
{
    int32 sum = 0;
    for (unsigned i = 0; i < kBlock<Character>; i++)
        sum += asFactor(text[i]) * factors[i];
    return static_cast<uint32>(sum);
}

template <class Character>
bool isBlockPair(size_t length)
{
    return length >= kBlock<Character> && length <= 2 * kBlock<Character>;
}

template <class Character>
unsigned hashBlocks(const Character* text, size_t length, unsigned size)
{
    const Character* last = text + length - kBlock<Character>;
    int32 all = 0;
    for (unsigned i = 0; i < kBlock<Character>; i++)
        all |= asFactor(text[i]) | asFactor(last[i]);
    if (static_cast<uint32>(all) > 127)
        return hashWords(text, length, size);
    const Powers<Character>& known = powers<Character>;
    return (blockSum(text, known.ofFirstBlock(length)) + blockSum(last, known.ofLastBlock())) % size;
}

template <class Character>
unsigned hashText(const Character* text, size_t length, unsigned size)
{
    if (isBlockPair<Character>(length) && powers<Character>.areFor(size))
        return hashBlocks(text, length, size);
    return size > 0 && length > 0 ? hashWords(text, length, size) : 0;
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
