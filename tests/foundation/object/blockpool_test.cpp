#include "foundation/object/blockpool.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <mutex>
#include <random>
#include <set>
#include <thread>
#include <vector>

namespace
{
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool kIsPooled = false;
#elif defined(__has_feature)
constexpr bool kIsPooled = !__has_feature(address_sanitizer) && !__has_feature(thread_sanitizer);
#else
constexpr bool kIsPooled = true;
#endif

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
    if (!kIsPooled)
        GTEST_SKIP() << "every block comes from malloc here";
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
    if (!kIsPooled)
        GTEST_SKIP() << "every block comes from malloc here";
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
    if (!kIsPooled)
        GTEST_SKIP() << "every block comes from malloc here";
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
    if (!kIsPooled)
        GTEST_SKIP() << "every block comes from malloc here";
    constexpr std::size_t kOther = 2 * kSize;
    constexpr std::size_t kPage = 4096;
    std::set<std::uintptr_t> pages;
    const Blocks blocks = [&pages]
    {
        Blocks taken;
        for (int i = 0; i < 40 * kMany; i++)
        {
            taken.push_back(BlockPool::take(kSize));
            pages.insert(reinterpret_cast<std::uintptr_t>(taken.back()) / kPage);
        }
        return taken;
    }();
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
/// Returns its block when the thread ends, after the pool may have cleared what the thread had at hand.
struct LateReturn
{
    ~LateReturn() { BlockPool::giveBack(block, kSize); }
    void* block = nullptr;
};
} // namespace

TEST(BlockPool, ABlockThatIsReturnedAfterItsThreadWasClearedIsKept)
{
    if (!kIsPooled)
        GTEST_SKIP() << "every block comes from malloc here";
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
