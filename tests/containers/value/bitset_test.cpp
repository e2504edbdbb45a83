#include "containers/value/idset.h"

#include <gtest/gtest.h>

namespace
{
struct CountingSet : BitSet
{
    using BitSet::BitSet;
    void changed() override { changes++; }
    int changes = 0;
};
} // namespace

TEST(BitSet, GrowsToTheBitThatIsChanged)
{
    CountingSet bits;
    bits.setBit(100);
    EXPECT_EQ(bits.getSize(), 101u);
    EXPECT_TRUE(bits.getBit(100));
    EXPECT_FALSE(bits.getBit(99));
    EXPECT_FALSE(bits.getBit(5000));
    bits.toggleBit(101);
    bits.clearBit(200);
    EXPECT_EQ(bits.getSize(), 201u);
    EXPECT_EQ(bits.countSetBits(), 2u);
    EXPECT_EQ(bits.changes, 3);
}

TEST(BitSet, ShrinkingClearsWhatLiesAbove)
{
    BitSet bits(70);
    bits.setAll();
    EXPECT_EQ(bits.countSetBits(), 70u);
    EXPECT_TRUE(bits.setSize(33));
    EXPECT_TRUE(bits.setSize(70));
    EXPECT_EQ(bits.countSetBits(), 33u);
    EXPECT_EQ(bits.getLastSet(), 32);
    EXPECT_EQ(bits.getChunk(1), 1u);
}

TEST(BitSet, SearchesAndCounts)
{
    BitSet bits(64);
    EXPECT_TRUE(bits.isEmpty());
    EXPECT_EQ(bits.getFirstSet(), -1);
    EXPECT_EQ(bits.getLastSet(), -1);
    EXPECT_EQ(bits.getFirstNotSet(), 0);
    bits.setBit(31);
    bits.setBit(40);
    EXPECT_EQ(bits.getFirstSet(), 31);
    EXPECT_EQ(bits.getLastSet(), 40);
    EXPECT_EQ(bits.countSetBits(32), 1u);
    EXPECT_EQ(bits.countSetBits(31), 0u);
    EXPECT_EQ(bits.countSetBits(1000), 2u);
    bits.setAll();
    EXPECT_EQ(bits.getFirstNotSet(), -1);
    bits.setSize(65);
    EXPECT_EQ(bits.getFirstNotSet(), 64);
    BitSet odd(3);
    odd.setAll();
    EXPECT_EQ(odd.getFirstNotSet(), -1);
}

TEST(BitSet, SetsWholeWords)
{
    BitSet bits(40);
    bits.setChunk(1, 0xFFFFFFFFu);
    EXPECT_EQ(bits.countSetBits(), 8u) << "bits outside the set don't count";
    bits.setChunk(2, 5);
    EXPECT_EQ(bits.getSize(), 96u);
    EXPECT_EQ(bits.getChunk(2), 5u);
    EXPECT_EQ(bits.getChunk(9), 0u);
}

TEST(BitSet, CombinesWithOthers)
{
    BitSet low(8), high(40);
    low.setChunk(0, 0x0F);
    high.setChunk(0, 0x3C);
    high.setBit(39);

    BitSet both(high), any(low), one(low);
    both &= low;
    EXPECT_EQ(both.countSetBits(), 2u);
    any |= high;
    EXPECT_EQ(any.getSize(), 40u);
    EXPECT_EQ(any.countSetBits(), 7u);
    one ^= high;
    EXPECT_EQ(one.countSetBits(), 5u);
    EXPECT_TRUE(low != high);
    low = high;
    EXPECT_TRUE(low == high);
    low.setSize(41);
    EXPECT_TRUE(low != high) << "another size";
}

TEST(IDSet, GivesTheLowestFreeNumber)
{
    IDSet ids(1, 8);
    for (int expected = 1; expected <= 9; expected++)
        EXPECT_EQ(ids.newID(), expected);
    EXPECT_EQ(ids.getSize(), 16u);
    ids.releaseID(2);
    ids.releaseID(2);
    EXPECT_EQ(ids.newID(), 2);
    EXPECT_EQ(ids.newID(), 10);
    ids.releaseID(0);
    ids.releaseID(20);
    EXPECT_EQ(ids.getSize(), 20u);
    EXPECT_EQ(ids.newID(), 11);
}
