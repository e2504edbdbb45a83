#include "containers/value/bitset.h"

#include <algorithm>
#include <bit>
#include <limits>
#include <new>

namespace
{
constexpr uint32 kWordBits = 32;

uint32 wordsFor(uint32 bits)
{
    return bits / kWordBits + (bits % kWordBits != 0);
}

uint32 maskOf(uint32 index)
{
    return 1u << (index % kWordBits);
}
} // namespace

BitSet::BitSet(uint32 size)
{
    resize(size);
}

BitSet::BitSet(const BitSet& other)
{
    if (resize(other.bitCount))
        std::copy_n(other.words.get(), wordCount, words.get());
}

BitSet& BitSet::operator=(const BitSet& other)
{
    if (this == &other)
        return *this;
    if (resize(other.bitCount))
        std::copy_n(other.words.get(), wordCount, words.get());
    changed();
    return *this;
}

bool BitSet::resize(uint32 size)
{
    const uint32 count = wordsFor(size);
    if (count != wordCount)
    {
        std::unique_ptr<uint32[]> grown(new (std::nothrow) uint32[count]());
        if (!grown)
            return false;
        std::copy_n(words.get(), std::min(count, wordCount), grown.get());
        words = std::move(grown);
        wordCount = count;
    }
    bitCount = size;
    clearTail();
    return true;
}

void BitSet::clearTail()
{
    if (bitCount % kWordBits != 0)
        words[wordCount - 1] &= maskOf(bitCount) - 1;
}

bool BitSet::setSize(uint32 size)
{
    if (!resize(size))
        return false;
    changed();
    return true;
}

bool BitSet::include(uint32 index)
{
    if (index < bitCount)
        return true;
    return index < std::numeric_limits<uint32>::max() && resize(index + 1);
}

bool BitSet::getBit(uint32 index) const
{
    return index < bitCount && (words[index / kWordBits] & maskOf(index)) != 0;
}

void BitSet::setBit(uint32 index)
{
    if (!include(index))
        return;
    words[index / kWordBits] |= maskOf(index);
    changed();
}

void BitSet::clearBit(uint32 index)
{
    if (!include(index))
        return;
    words[index / kWordBits] &= ~maskOf(index);
    changed();
}

void BitSet::toggleBit(uint32 index)
{
    if (!include(index))
        return;
    words[index / kWordBits] ^= maskOf(index);
    changed();
}

void BitSet::setAll()
{
    std::fill_n(words.get(), wordCount, ~0u);
    clearTail();
    changed();
}

void BitSet::clearAll()
{
    std::fill_n(words.get(), wordCount, 0u);
    changed();
}

bool BitSet::isEmpty() const
{
    return getFirstSet() < 0;
}

uint32 BitSet::countSetBits(int limit) const
{
    const uint32 bits = limit < 0 ? bitCount : std::min(static_cast<uint32>(limit), bitCount);
    uint32 count = 0;
    for (uint32 i = 0; i < bits / kWordBits; i++)
        count += static_cast<uint32>(std::popcount(words[i]));
    if (bits % kWordBits != 0)
        count += static_cast<uint32>(std::popcount(words[bits / kWordBits] & (maskOf(bits) - 1)));
    return count;
}

int BitSet::getFirstSet() const
{
    for (uint32 i = 0; i < wordCount; i++)
        if (words[i] != 0)
            return static_cast<int>(i * kWordBits) + std::countr_zero(words[i]);
    return -1;
}

int BitSet::getFirstNotSet() const
{
    for (uint32 i = 0; i < wordCount; i++)
    {
        const uint32 index = i * kWordBits + static_cast<uint32>(std::countr_one(words[i]));
        if (words[i] != ~0u)
            return index < bitCount ? static_cast<int>(index) : -1;
    }
    return -1;
}

int BitSet::getLastSet() const
{
    for (uint32 i = wordCount; i > 0; i--)
        if (words[i - 1] != 0)
            return static_cast<int>(i * kWordBits) - 1 - std::countl_zero(words[i - 1]);
    return -1;
}

uint32 BitSet::getChunk(uint32 index) const
{
    return index < wordCount ? words[index] : 0;
}

void BitSet::setChunk(uint32 index, uint32 bits)
{
    constexpr uint32 kMaxWords = std::numeric_limits<uint32>::max() / kWordBits;
    if (index >= wordCount && (index >= kMaxWords || !resize((index + 1) * kWordBits)))
        return;
    words[index] = bits;
    clearTail();
    changed();
}

bool BitSet::operator==(const BitSet& other) const
{
    return bitCount == other.bitCount && std::equal(words.get(), words.get() + wordCount, other.words.get());
}

BitSet& BitSet::operator&=(const BitSet& other)
{
    for (uint32 i = 0; i < wordCount; i++)
        words[i] &= other.getChunk(i);
    changed();
    return *this;
}

BitSet& BitSet::operator|=(const BitSet& other)
{
    if (bitCount >= other.bitCount || resize(other.bitCount))
        for (uint32 i = 0; i < other.wordCount; i++)
            words[i] |= other.words[i];
    changed();
    return *this;
}

BitSet& BitSet::operator^=(const BitSet& other)
{
    if (bitCount >= other.bitCount || resize(other.bitCount))
        for (uint32 i = 0; i < other.wordCount; i++)
            words[i] ^= other.words[i];
    changed();
    return *this;
}
