#include "foundation/object/blockpool.h"

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <iterator>
#include <mutex>
#include <utility>

// A test looks at the pool itself also under a sanitizer.
#if defined(BLOCK_POOL_IS_TESTED)
#elif defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
#define BLOCK_POOL_IS_MALLOC 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define BLOCK_POOL_IS_MALLOC 1
#endif
#endif

#ifdef BLOCK_POOL_IS_MALLOC

void* BlockPool::take(std::size_t size) noexcept
{
    return std::malloc(size);
}

void BlockPool::giveBack(void* block, std::size_t) noexcept
{
    std::free(block);
}

#else

namespace
{
/// Blocks whose size is a multiple of 16 are aligned to it; a type that needs that has such a size.
constexpr std::size_t kStep = 8;
constexpr std::size_t kSmallest = 16;
constexpr std::size_t kSizes = BlockPool::kLargest / kStep;
/// Slabs are aligned to their size, so that the address of a block leads to its slab.
constexpr std::size_t kSlabSize = 64 * 1024;
constexpr std::size_t kSlabsAtATime = 16;
constexpr std::size_t kLine = 64;
/// The heads of neighbouring slabs lie at different lines, or all would compete for the same few places in a cache.
constexpr std::size_t kHeadPlaces = 32;
/// Fresh blocks are handed out by and by, so that only memory that is used is touched.
constexpr std::size_t kStretch = 4096;

class ThreadPool;

/// What stands in a block while it is free.
struct FreeBlock
{
    FreeBlock* next;
};

/// Memory for blocks of one size. This is its head, the blocks follow. It belongs to the pool of one thread, or to the
/// store while none of its blocks is taken.
struct alignas(kLine) Slab
{
    ThreadPool* owner;
    FreeBlock* free;
    /// Behind the blocks that were made free at least once.
    char* fresh;
    Slab* next;
    Slab* previous;
    unsigned index;
    unsigned taken;
    /// Whether it has no free block, and is neither current nor among the others.
    bool isFull;
};

std::size_t indexOf(std::size_t size)
{
    return (std::max(size, kSmallest) - 1) / kStep;
}

std::size_t sizeAt(std::size_t index)
{
    return (index + 1) * kStep;
}

/// The head of the slab in which `memory` lies.
Slab* slabOf(void* memory)
{
    const auto address = reinterpret_cast<std::uintptr_t>(memory);
    const std::size_t head = address / kSlabSize % kHeadPlaces * kLine;
    return reinterpret_cast<Slab*>(static_cast<char*>(memory) - address % kSlabSize + head);
}

char* endOf(Slab* slab)
{
    char* bytes = reinterpret_cast<char*>(slab);
    return bytes + (kSlabSize - reinterpret_cast<std::uintptr_t>(bytes) % kSlabSize);
}

/// The blocks that one thread hands out. It is that thread's alone, but for the blocks that others return.
class ThreadPool
{
public:
    ThreadPool() { std::fill(std::begin(current), std::end(current), &noBlocks); }

    void* take(std::size_t index)
    {
        Slab* slab = current[index];
        return slab->free ? takeFrom(slab) : takeFromNext(index);
    }
    /// `slab` is the block's, and belongs to this pool.
    void giveBack(FreeBlock* block, Slab* slab)
    {
        block->next = slab->free;
        slab->free = block;
        slab->taken--;
        if (slab->isFull || slab->taken == 0)
            arrange(slab);
    }
    /// From any thread.
    void giveBackFromOutside(FreeBlock* block)
    {
        block->next = returned.load(std::memory_order_relaxed);
        while (!returned.compare_exchange_weak(block->next, block, std::memory_order_release,
                                               std::memory_order_relaxed))
        {
        }
    }

    /// Collects what others returned, and gives up all slabs without taken blocks. For a pool that no thread uses.
    void tidyUp();

    /// For whoever keeps the pool while no thread has it.
    ThreadPool* next = nullptr;

private:
    static void* takeFrom(Slab* slab)
    {
        FreeBlock* block = slab->free;
        slab->free = block->next;
        slab->taken++;
        return block;
    }
    void* takeFromNext(std::size_t index);
    void collectReturned();
    Slab* nextSlab(std::size_t index);
    void arrange(Slab* slab);
    void enlist(Slab* slab);
    void unlist(Slab* slab);

    /// Stands for a slab where there is none yet; nobody writes to it.
    static constinit Slab noBlocks;

    /// By size: the slab that blocks are taken from, and the others that have free ones.
    Slab* current[kSizes];
    Slab* others[kSizes] = {};
    alignas(kLine) std::atomic<FreeBlock*> returned = nullptr;
};

constinit Slab ThreadPool::noBlocks = {};

/// What belongs to no thread: slabs without taken blocks, and the pools of threads that have ended, to which their
/// blocks still come back. Thread-safe.
class Store
{
public:
    /// Null without memory, as `takePool`.
    Slab* takeSlab()
    {
        if (Slab* slab = take(slabs))
            return slab;
        tidyUpPools();
        Slab* slab = take(slabs);
        return slab ? slab : makeSlabs();
    }
    void put(Slab* slab) { put(slabs, slab); }
    ThreadPool* takePool()
    {
        ThreadPool* pool = take(pools);
        return pool ? pool : new (std::nothrow) ThreadPool;
    }
    void put(ThreadPool* pool) { put(pools, pool); }

private:
    template <class Kept>
    Kept* take(Kept*& first)
    {
        const std::lock_guard<std::mutex> guard(lock);
        return first ? std::exchange(first, first->next) : nullptr;
    }
    template <class Kept>
    void put(Kept*& first, Kept* kept)
    {
        const std::lock_guard<std::mutex> guard(lock);
        kept->next = std::exchange(first, kept);
    }
    /// What has come back to pools of ended threads may be whole slabs.
    void tidyUpPools();
    /// Keeps all but the first one.
    Slab* makeSlabs();

    std::mutex lock;
    Slab* slabs = nullptr;
    ThreadPool* pools = nullptr;
};

// Outlives everything: objects are made before `main` and go after it.
constinit Store store;
constinit thread_local ThreadPool* threadPool = nullptr;
/// Objects may come and go even after their thread has given up its pool.
constinit thread_local bool isOver = false;

/// Gives up the pool of a thread that ends.
struct ThreadEnd
{
    void watch() {}
    ~ThreadEnd()
    {
        isOver = true;
        threadPool->tidyUp();
        store.put(std::exchange(threadPool, nullptr));
    }
};
thread_local ThreadEnd threadEnd;

void Store::tidyUpPools()
{
    ThreadPool* pool = nullptr;
    {
        const std::lock_guard<std::mutex> guard(lock);
        pool = std::exchange(pools, nullptr);
    }
    while (pool)
    {
        ThreadPool* tidied = std::exchange(pool, pool->next);
        tidied->tidyUp();
        put(tidied);
    }
}

Slab* Store::makeSlabs()
{
    auto* bytes = static_cast<char*>(std::malloc((kSlabsAtATime + 1) * kSlabSize));
    if (!bytes)
        return nullptr;
    bytes += kSlabSize - reinterpret_cast<std::uintptr_t>(bytes) % kSlabSize;
    for (std::size_t i = kSlabsAtATime - 1; i > 0; i--)
        put(new (slabOf(bytes + i * kSlabSize)) Slab{});
    return new (slabOf(bytes)) Slab{};
}

/// Makes some of the fresh blocks free.
void addFresh(Slab* slab)
{
    const std::size_t size = sizeAt(slab->index);
    const auto left = static_cast<std::size_t>(endOf(slab) - slab->fresh);
    char* end = slab->fresh + std::min(left, kStretch) / size * size;
    // Linked as the blocks lie, so that objects made one after the other lie side by side.
    for (char* block = end; block != slab->fresh;)
    {
        block -= size;
        slab->free = new (block) FreeBlock{slab->free};
    }
    slab->fresh = end;
}

void* ThreadPool::takeFromNext(std::size_t index)
{
    collectReturned();
    Slab* slab = current[index];
    if (!slab->free && slab->owner)
        addFresh(slab);
    if (!slab->free)
        slab = nextSlab(index);
    return slab ? takeFrom(slab) : nullptr;
}

void ThreadPool::collectReturned()
{
    if (!returned.load(std::memory_order_relaxed))
        return;
    FreeBlock* block = returned.exchange(nullptr, std::memory_order_acquire);
    while (block)
    {
        FreeBlock* collected = std::exchange(block, block->next);
        giveBack(collected, slabOf(collected));
    }
}

void ThreadPool::tidyUp()
{
    collectReturned();
    for (Slab*& slab : current)
        if (slab->owner && slab->taken == 0)
            store.put(std::exchange(slab, &noBlocks));
}

/// Null without memory.
Slab* ThreadPool::nextSlab(std::size_t index)
{
    Slab* slab = others[index];
    if (slab)
        unlist(slab);
    else
    {
        slab = store.takeSlab();
        if (!slab)
            return nullptr;
        *slab = {this,    nullptr, reinterpret_cast<char*>(slab + 1),
                 nullptr, nullptr, static_cast<unsigned>(index),
                 0,       false};
        addFresh(slab);
    }
    if (current[index]->owner)
        current[index]->isFull = true;
    current[index] = slab;
    return slab;
}

/// For a slab that has its first free block, or only such.
void ThreadPool::arrange(Slab* slab)
{
    if (slab->isFull)
        return enlist(slab);
    if (slab == current[slab->index])
        return;
    unlist(slab);
    store.put(slab);
}

void ThreadPool::enlist(Slab* slab)
{
    Slab*& first = others[slab->index];
    slab->isFull = false;
    slab->previous = nullptr;
    slab->next = std::exchange(first, slab);
    if (slab->next)
        slab->next->previous = slab;
}

void ThreadPool::unlist(Slab* slab)
{
    (slab->previous ? slab->previous->next : others[slab->index]) = slab->next;
    if (slab->next)
        slab->next->previous = slab->previous;
}

/// For a thread without a pool.
void* takeFirst(std::size_t index)
{
    ThreadPool* pool = store.takePool();
    if (!pool)
        return nullptr;
    void* block = pool->take(index);
    if (isOver)
        store.put(pool);
    else
    {
        threadEnd.watch();
        threadPool = pool;
    }
    return block;
}
} // namespace

void* BlockPool::take(std::size_t size) noexcept
{
    if (size > kLargest)
        return std::malloc(size);
    const std::size_t index = indexOf(size);
    return threadPool ? threadPool->take(index) : takeFirst(index);
}

void BlockPool::giveBack(void* memory, std::size_t size) noexcept
{
    if (size > kLargest)
        return std::free(memory);
    if (!memory)
        return;
    auto* block = static_cast<FreeBlock*>(memory);
    Slab* slab = slabOf(memory);
    if (slab->owner == threadPool)
        threadPool->giveBack(block, slab);
    else
        slab->owner->giveBackFromOutside(block);
}

#endif
