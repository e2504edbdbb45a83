#pragma once

#include <cstddef>
#include <new>

/// Memory for what is small and comes by the thousands: objects, tree nodes, links, messages.
///
/// Each thread has slabs of memory, each for blocks of one size, so that taking and returning a block costs a few
/// instructions, and a block has no header. Blocks come from one slab until it has none left: what is made together
/// lies together, even where many blocks came back in any order before. A block that another thread returns waits
/// until the thread that took it runs out of blocks, or has ended and memory is asked for. Slabs without taken blocks
/// then serve any size and thread, but for the one of each size that its thread takes from; memory is never given back
/// to the system.
/// Blocks of more than `kLargest` bytes, and with the address or the thread sanitizer all blocks, come from `malloc`,
/// so that these tools see what they are made for. Thread-safe.
namespace BlockPool
{
inline constexpr std::size_t kLargest = 256;

/// Aligned for every type of this size; null where there is no memory.
[[nodiscard]] void* take(std::size_t size) noexcept;
/// `size` is that which the block was taken with. Null is legal.
void giveBack(void* block, std::size_t size) noexcept;

[[nodiscard]] inline void* takeOrThrow(std::size_t size)
{
    void* block = take(size);
    if (!block)
        throw std::bad_alloc();
    return block;
}
} // namespace BlockPool

/// In a class: its objects, and those of the classes derived from it, come from the pool. A class that is deleted
/// through a pointer to a base needs a virtual destructor, as it does without a pool.
#define FPOOLED_OBJECTS                                                                                      \
    static void* operator new(std::size_t size)                                                              \
    {                                                                                                        \
        return BlockPool::takeOrThrow(size);                                                                 \
    }                                                                                                        \
    static void* operator new(std::size_t size, const std::nothrow_t&) noexcept                              \
    {                                                                                                        \
        return BlockPool::take(size);                                                                        \
    }                                                                                                        \
    static void operator delete(void* block, std::size_t size) noexcept                                      \
    {                                                                                                        \
        BlockPool::giveBack(block, size);                                                                    \
    }
