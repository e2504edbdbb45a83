#pragma once

#include "foundation/object/types.h"

#include <memory>

/// A row of bits, numbered from 0, that grows when a bit past its end is changed.
///
/// Bits past the end read as clear. A set is equal to another of the same size with the same bits. One thread at a
/// time.
class BitSet
{
public:
    BitSet() = default;
    explicit BitSet(uint32 size);
    BitSet(const BitSet& other);
    virtual ~BitSet() = default;
    BitSet& operator=(const BitSet& other);

    /// Called after each change.
    virtual void changed() {}

    uint32 getSize() const { return bitCount; }
    /// New bits are clear. False where no memory can be had; the set then stays as it was.
    bool setSize(uint32 size);

    bool getBit(uint32 index) const;
    void setBit(uint32 index);
    void clearBit(uint32 index);
    void toggleBit(uint32 index);
    void setAll();
    void clearAll();

    bool isEmpty() const;
    /// How many of the first `limit` bits are set; -1 means all.
    uint32 countSetBits(int limit = -1) const;

    // Searching; -1 where there is none

    int getFirstSet() const;
    int getFirstNotSet() const;
    int getLastSet() const;

    // Words of 32 bits, the lowest bit first

    uint32 countChunks() const { return wordCount; }
    /// 0 past the end.
    uint32 getChunk(uint32 index) const;
    /// Grows the set where needed; of the last word only the bits inside the set count.
    void setChunk(uint32 index, uint32 bits);

    // The other set counts as clear past its end; `|=` and `^=` let this one grow to the other's size

    bool operator==(const BitSet& other) const;
    bool operator!=(const BitSet& other) const { return !(*this == other); }
    BitSet& operator&=(const BitSet& other);
    BitSet& operator|=(const BitSet& other);
    BitSet& operator^=(const BitSet& other);

private:
    bool resize(uint32 size);
    bool include(uint32 index);
    void clearTail();

    uint32 bitCount = 0;
    uint32 wordCount = 0;
    std::unique_ptr<uint32[]> words;
};
