#pragma once

#include "foundation/object/types.h"

#include <memory>

/// Counts permits that threads take and give. Thread-safe. A wait is a point of cancellation.
class FSemaphore
{
public:
    /// A negative count makes a semaphore that holds nothing: all its operations do nothing. The name serves
    /// debugging.
    FSemaphore(int initialCount, const char* name);
    FSemaphore(const FSemaphore&) = delete;
    FSemaphore& operator=(const FSemaphore&) = delete;
    ~FSemaphore();

    /// Takes one permit, waiting for it this many milliseconds, without limit if negative. Tells whether it did.
    bool acquire(int timeoutMs);
    /// Gives `count` permits; below 1, lets go all who wait now and leaves none behind.
    void release(int count);

private:
    struct State;

    std::unique_ptr<State> state;
};
