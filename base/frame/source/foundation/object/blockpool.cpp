#include "foundation/object/blockpool.h"

#include <algorithm>
#include <cstdlib>
#include <mutex>
#include <utility>

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
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
constexpr std::size_t kSizes = BlockPool::kLargest / kStep;
/// The blocks that are made, and that go to the store, at a time.
constexpr unsigned kBatch = 64;

/// What stands in a block while it is free. `nextBatch` counts in the first block of a batch in the store.
struct FreeBlock
{
    FreeBlock* next;
    FreeBlock* nextBatch;
};

/// The free blocks of one size that no thread has at hand, in batches.
class Store
{
public:
    void put(FreeBlock* batch)
    {
        const std::lock_guard<std::mutex> guard(lock);
        batch->nextBatch = first;
        first = batch;
    }
    /// Null where there is none.
    FreeBlock* take()
    {
        const std::lock_guard<std::mutex> guard(lock);
        FreeBlock* batch = first;
        if (batch)
            first = batch->nextBatch;
        return batch;
    }

private:
    std::mutex lock;
    FreeBlock* first = nullptr;
};

/// The free blocks of one size that a thread has at hand. The whole batch in reserve keeps a thread that takes and
/// returns in turn away from the store. At most `kBatch` blocks stand in the list itself.
struct Shelf
{
    FreeBlock* first = nullptr;
    unsigned count = 0;
    FreeBlock* reserve = nullptr;
};

// Both outlive everything: objects are made before `main` and go after it.
constinit Store stores[kSizes];
constinit thread_local Shelf shelves[kSizes];
/// Objects may go even after their thread has cleared its shelves; their blocks go right to the store.
constinit thread_local bool isCleared = false;

/// Clears the shelves of a thread that ends.
struct ThreadEnd
{
    void watch() {}
    ~ThreadEnd();
};
thread_local ThreadEnd threadEnd;

ThreadEnd::~ThreadEnd()
{
    isCleared = true;
    for (std::size_t i = 0; i < kSizes; i++)
    {
        Shelf& shelf = shelves[i];
        if (shelf.first)
            stores[i].put(shelf.first);
        if (shelf.reserve)
            stores[i].put(shelf.reserve);
        // Neither takes nor keeps a block any more.
        shelf = {nullptr, kBatch, nullptr};
    }
}

std::size_t indexOf(std::size_t size)
{
    return (std::max(size, sizeof(FreeBlock)) - 1) / kStep;
}

FreeBlock* makeBatch(std::size_t blockSize)
{
    // The list is linked as the blocks lie, so that objects made one after the other lie side by side.
    auto* bytes = static_cast<char*>(std::malloc(kBatch * blockSize));
    FreeBlock* first = nullptr;
    for (unsigned i = bytes ? kBatch : 0; i > 0; i--)
        first = new (bytes + (i - 1) * blockSize) FreeBlock{first, nullptr};
    return first;
}

/// For an empty shelf: gets a batch and takes its first block.
void* takeFromBatch(std::size_t index)
{
    threadEnd.watch();
    Shelf& shelf = shelves[index];
    FreeBlock* batch = std::exchange(shelf.reserve, nullptr);
    if (!batch)
        batch = stores[index].take();
    if (!batch)
        batch = makeBatch((index + 1) * kStep);
    if (!batch)
        return nullptr;
    if (!isCleared)
        shelf = {batch->next, kBatch - 1, nullptr};
    else if (batch->next)
        stores[index].put(batch->next);
    return batch;
}

/// For a full shelf.
void giveToStore(FreeBlock* block, std::size_t index)
{
    threadEnd.watch();
    Shelf& shelf = shelves[index];
    block->next = nullptr;
    if (isCleared)
        return stores[index].put(block);
    if (shelf.reserve)
        stores[index].put(shelf.reserve);
    shelf = {block, 1, shelf.first};
}
} // namespace

void* BlockPool::take(std::size_t size) noexcept
{
    if (size > kLargest)
        return std::malloc(size);
    const std::size_t index = indexOf(size);
    Shelf& shelf = shelves[index];
    FreeBlock* block = shelf.first;
    if (!block)
        return takeFromBatch(index);
    shelf.first = block->next;
    shelf.count--;
    return block;
}

void BlockPool::giveBack(void* memory, std::size_t size) noexcept
{
    if (size > kLargest)
        return std::free(memory);
    if (!memory)
        return;
    const std::size_t index = indexOf(size);
    auto* block = static_cast<FreeBlock*>(memory);
    Shelf& shelf = shelves[index];
    if (shelf.count == kBatch)
        return giveToStore(block, index);
    block->next = shelf.first;
    shelf.first = block;
    shelf.count++;
}

#endif
