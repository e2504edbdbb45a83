#include "tests/faults/faultrun.h"

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstdlib>

#include <dlfcn.h>
#include <fcntl.h>
#include <malloc.h>
#include <unistd.h>

// Preloaded into a program: one of its allocations finds no memory. It also marks when calls begin to count, as all
// libraries are loaded and main is next, and when they end, behind main.

extern "C"
{
    // The C library's own, under the names that it has for such as this.
    void* __libc_malloc(std::size_t size);
    void* __libc_calloc(std::size_t count, std::size_t size);
    void* __libc_realloc(void* block, std::size_t size);
    void* __libc_memalign(std::size_t alignment, std::size_t size);
}

namespace
{
std::atomic<long> counted{0};
std::atomic<bool> isCounting{false};
long failing = 0;
char report[4096];

bool isRefused()
{
    if (!isCounting.load(std::memory_order_relaxed))
        return false;
    if (counted.fetch_add(1, std::memory_order_relaxed) + 1 != failing)
        return false;
    errno = ENOMEM;
    return true;
}

long mark(int number)
{
    isCounting = number == kBeginCounting;
    return syscall(SYS_getpgid, number);
}

using Main = int (*)(int, char**, char**);
Main programMain = nullptr;

// What runs behind this at the end was set up before main: a checker of leaks, whose calls are none of the program's.
void endCounting()
{
    mark(kEndCounting);
}

int runMain(int count, char** arguments, char** environment)
{
    std::atexit(endCounting);
    return programMain(count, arguments, environment);
}
} // namespace

[[gnu::constructor]] static void beginFaults()
{
    const char* number = std::getenv(kAllocationVariable);
    failing = number ? std::atol(number) : 0;
    if (const char* path = std::getenv(kReportVariable))
        std::snprintf(report, sizeof report, "%s", path);
    const bool isMarked = std::getenv(kMarkedVariable) != nullptr;
    // What the program starts is left alone.
    for (const char* name : {"LD_PRELOAD", kAllocationVariable, kReportVariable, kMarkedVariable})
        unsetenv(name);
    if (!isMarked)
        mark(kBeginCounting);
}

[[gnu::destructor]] static void reportFaults()
{
    isCounting = false;
    const int file = report[0] ? open(report, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600) : -1;
    if (file < 0)
        return;
    dprintf(file, "malloc %ld\n", counted.load());
    close(file);
}

extern "C"
{
    int __libc_start_main(Main main, int count, char** arguments, void (*init)(), void (*fini)(),
                          void (*loaderFini)(), void* stackEnd)
    {
        programMain = main;
        const auto next =
            reinterpret_cast<decltype(&__libc_start_main)>(dlsym(RTLD_NEXT, "__libc_start_main"));
        return next(runMain, count, arguments, init, fini, loaderFini, stackEnd);
    }

    pid_t getpgid(pid_t process) noexcept
    {
        const bool isMark = process == kBeginCounting || process == kEndCounting;
        return static_cast<pid_t>(isMark ? mark(process) : syscall(SYS_getpgid, process));
    }

    void* malloc(std::size_t size) noexcept
    {
        return isRefused() ? nullptr : __libc_malloc(size);
    }

    void* calloc(std::size_t count, std::size_t size) noexcept
    {
        return isRefused() ? nullptr : __libc_calloc(count, size);
    }

    void* realloc(void* block, std::size_t size) noexcept
    {
        return isRefused() ? nullptr : __libc_realloc(block, size);
    }

    void* memalign(std::size_t alignment, std::size_t size) noexcept
    {
        return isRefused() ? nullptr : __libc_memalign(alignment, size);
    }

    void* aligned_alloc(std::size_t alignment, std::size_t size) noexcept
    {
        return memalign(alignment, size);
    }

    int posix_memalign(void** block, std::size_t alignment, std::size_t size) noexcept
    {
        *block = memalign(alignment, size);
        return *block ? 0 : ENOMEM;
    }
}
