#include "application/outofmemory.h"

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <new>

namespace
{
bool isOutOfMemory()
{
    if (!std::current_exception())
        return false;
    try
    {
        throw;
    }
    catch (const std::bad_alloc&)
    {
        return true;
    }
    catch (...)
    {
        return false;
    }
}

[[noreturn]] void endProcess()
{
    if (!isOutOfMemory())
        std::abort();
    endWithoutMemory();
}
} // namespace

void endWithoutMemory()
{
    // No translation, which would need memory.
    std::fputs("Out of memory.\n", stderr);
    std::_Exit(EXIT_FAILURE);
}

void endInWordsWithoutMemory()
{
    std::set_terminate(endProcess);
}
