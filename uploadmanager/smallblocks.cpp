#include "application/outofmemory.h"

#include <cstddef>

// What becomes of malloc in the program. It is linked with --wrap: each call of these functions in the program's own
// objects comes here; libraries keep theirs.
//
// An operation on a text says false where it finds no memory and leaves the text as it was. Hardly a caller looks, as
// there is nothing to be done about it: a path that lacks its end or a file that lacks a line would go on its way.
// So a small block that can't be had ends the program; a large one, whose size may come from a file, is still null.

namespace
{
constexpr std::size_t kLargeBlock = 16 << 20;

void* whole(void* block, std::size_t size)
{
    if (!block && size > 0 && size < kLargeBlock)
        endWithoutMemory();
    return block;
}
} // namespace

extern "C"
{
    void* __real_malloc(std::size_t size);
    void* __real_calloc(std::size_t count, std::size_t size);
    void* __real_realloc(void* block, std::size_t size);

    void* __wrap_malloc(std::size_t size)
    {
        return whole(__real_malloc(size), size);
    }

    void* __wrap_calloc(std::size_t count, std::size_t size)
    {
        void* block = __real_calloc(count, size);
        // What the product can't hold is large.
        return size > 0 && count >= kLargeBlock / size ? block : whole(block, count * size);
    }

    void* __wrap_realloc(void* block, std::size_t size)
    {
        return whole(__real_realloc(block, size), size);
    }
}
