// The pool itself, also where a sanitizer makes the program's own one malloc.
#define BLOCK_POOL_IS_TESTED
#define BlockPool TestedBlockPool
#include "foundation/object/blockpool.cpp"
#undef BlockPool

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <mutex>
#include <random>
#include <set>
#include <thread>
#include <vector>

namespace BlockPool = TestedBlockPool;

namespace
{
constexpr std::size_t kSize = 48;
constexpr int kMany = 1000;

using Blocks = std::vector<void*>;

Blocks takeMany()
{
    Blocks blocks;
    for (int i = 0; i < kMany; i++)
        blocks.push_back(BlockPool::take(kSize));
    return blocks;
}

void giveBackAll(const Blocks& blocks)
{
    for (void* block : blocks)
        BlockPool::giveBack(block, kSize);
}
} // namespace

TEST(BlockPool, BlocksOfEverySizeAreApartAndAligned)
{
    struct Taken
    {
        unsigned char* bytes;
        std::size_t size;
    };
    std::vector<Taken> taken;
    for (std::size_t size = 0; size <= 2 * BlockPool::kLargest; size++)
        for (int i = 0; i < 70; i++)
        {
            auto* bytes = static_cast<unsigned char*>(BlockPool::take(size));
            ASSERT_NE(bytes, nullptr);
            EXPECT_EQ(reinterpret_cast<std::uintptr_t>(bytes) % (size % 16 == 0 ? 16 : 8), 0u);
            memset(bytes, static_cast<int>(taken.size() % 251), size);
            taken.push_back({bytes, size});
        }
    for (std::size_t i = 0; i < taken.size(); i++)
    {
        for (std::size_t at = 0; at < taken[i].size; at++)
            ASSERT_EQ(taken[i].bytes[at], i % 251);
        BlockPool::giveBack(taken[i].bytes, taken[i].size);
    }
}

TEST(BlockPool, ReturnedBlocksAreTakenAgain)
{
    std::set<void*> seen;
    for (int round = 0; round < 50; round++)
    {
        const Blocks blocks = takeMany();
        seen.insert(blocks.begin(), blocks.end());
        giveBackAll(blocks);
    }
    EXPECT_LT(seen.size(), 3u * kMany);
}

TEST(BlockPool, BlocksThatAnotherThreadReturnsGoRound)
{
    std::set<void*> seen;
    for (int round = 0; round < 50; round++)
    {
        Blocks blocks;
        std::thread([&blocks] { blocks = takeMany(); }).join();
        seen.insert(blocks.begin(), blocks.end());
        giveBackAll(blocks);
    }
    EXPECT_LT(seen.size(), 3u * kMany) << "what a thread had at hand must not be lost when it ends";
}

TEST(BlockPool, BlocksThatAreTakenTogetherLieTogetherWhateverWasReturned)
{
    constexpr std::size_t kFar = 64 * 1024;
    Blocks all;
    for (int i = 0; i < 100; i++)
    {
        const Blocks some = takeMany();
        all.insert(all.end(), some.begin(), some.end());
    }
    std::shuffle(all.begin(), all.end(), std::mt19937(1));
    giveBackAll(all);

    const Blocks blocks = takeMany();
    std::set<std::uintptr_t> places;
    for (void* block : blocks)
        places.insert(reinterpret_cast<std::uintptr_t>(block) / kFar);
    EXPECT_LT(places.size(), 10u);
    giveBackAll(blocks);
}

TEST(BlockPool, MemoryServesBlocksOfAnotherSizeAfterwards)
{
    constexpr std::size_t kOther = 2 * kSize;
    constexpr std::size_t kPage = 4096;
    std::set<std::uintptr_t> pages;
    Blocks blocks;
    for (int i = 0; i < 40 * kMany; i++)
    {
        blocks.push_back(BlockPool::take(kSize));
        pages.insert(reinterpret_cast<std::uintptr_t>(blocks.back()) / kPage);
    }
    giveBackAll(blocks);
    int known = 0;
    Blocks others;
    for (int i = 0; i < 10 * kMany; i++)
    {
        others.push_back(BlockPool::take(kOther));
        known += pages.contains(reinterpret_cast<std::uintptr_t>(others.back()) / kPage);
    }
    EXPECT_GT(known, 5 * kMany);
    for (void* block : others)
        BlockPool::giveBack(block, kOther);
}

TEST(BlockPool, WhatAnEndedThreadTookServesOthersOnceItIsReturned)
{
    constexpr std::size_t kFar = 64 * 1024;
    Blocks blocks;
    std::thread(
        [&blocks]
        {
            for (int i = 0; i < 100 * kMany; i++)
                blocks.push_back(BlockPool::take(kSize));
        })
        .join();
    std::set<std::uintptr_t> places;
    for (void* block : blocks)
        places.insert(reinterpret_cast<std::uintptr_t>(block) / kFar);
    giveBackAll(blocks);

    blocks.clear();
    int known = 0;
    for (int i = 0; i < 200 * kMany; i++)
    {
        blocks.push_back(BlockPool::take(kSize));
        known += places.contains(reinterpret_cast<std::uintptr_t>(blocks.back()) / kFar);
    }
    EXPECT_GT(known, 90 * kMany);
    giveBackAll(blocks);
}

TEST(BlockPool, NoBlockIsTakenTwiceUnderRandomWorkOfAllSizes)
{
    struct Taken
    {
        unsigned char* bytes;
        std::size_t size;
        unsigned char mark;
    };
    std::mutex lock;
    std::vector<Taken> shared;
    const auto giveBack = [](const Taken& taken)
    {
        for (std::size_t at = 0; at < taken.size; at++)
            ASSERT_EQ(taken.bytes[at], taken.mark);
        BlockPool::giveBack(taken.bytes, taken.size);
    };
    const auto work = [&](unsigned seed)
    {
        std::mt19937 random(seed);
        std::vector<Taken> mine;
        for (int i = 0; i < 60 * kMany; i++)
        {
            // Long stretches of taking and of returning, so that slabs fill up and become empty.
            const bool takes = i / (5 * kMany) % 2 == 0 ? random() % 8 != 0 : random() % 8 == 0;
            if (takes || mine.empty())
            {
                const std::size_t size = 16 * (1 + random() % 16);
                auto* bytes = static_cast<unsigned char*>(BlockPool::take(size));
                const auto mark = static_cast<unsigned char>(random());
                memset(bytes, mark, size);
                mine.push_back({bytes, size, mark});
                continue;
            }
            std::swap(mine[random() % mine.size()], mine.back());
            giveBack(mine.back());
            mine.pop_back();
            if (i % kMany == 0)
            {
                const std::lock_guard<std::mutex> guard(lock);
                shared.swap(mine);
            }
        }
        for (const Taken& taken : mine)
            giveBack(taken);
    };
    std::thread first(work, 1), second(work, 2), third(work, 3);
    first.join();
    second.join();
    third.join();
    for (const Taken& taken : shared)
        giveBack(taken);
}

TEST(BlockPool, ThreadsTakeAndReturnAtTheSameTime)
{
    std::mutex lock;
    Blocks shared;
    const auto work = [&](unsigned char mark)
    {
        for (int round = 0; round < 200; round++)
        {
            Blocks blocks = takeMany();
            for (void* block : blocks)
                memset(block, mark, kSize);
            for (void* block : blocks)
                ASSERT_EQ(static_cast<unsigned char*>(block)[kSize - 1], mark) << "two threads got one block";
            // Each returns what another thread has left.
            const std::lock_guard<std::mutex> guard(lock);
            shared.swap(blocks);
            giveBackAll(blocks);
        }
    };
    std::thread first(work, 1), second(work, 2), third(work, 3);
    first.join();
    second.join();
    third.join();
    giveBackAll(shared);
}

namespace
{
/// Returns its block and takes another one when the thread ends, after the thread may have given up its pool.
struct LateReturn
{
    ~LateReturn()
    {
        BlockPool::giveBack(block, kSize);
        void* late = BlockPool::take(kSize);
        memset(late, 0xFF, kSize);
        BlockPool::giveBack(late, kSize);
    }
    void* block = nullptr;
};
} // namespace

TEST(BlockPool, ABlockThatIsReturnedAfterItsThreadHasEndedIsKept)
{
    std::set<void*> seen;
    for (int round = 0; round < 5 * kMany; round++)
    {
        std::thread(
            [&seen]
            {
                thread_local LateReturn late;
                late.block = nullptr;
                late.block = BlockPool::take(kSize);
                seen.insert(late.block);
            })
            .join();
    }
    EXPECT_LT(seen.size(), 3u * kMany);
}
