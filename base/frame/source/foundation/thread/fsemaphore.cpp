#include "foundation/thread/fsemaphore.h"

#include "foundation/thread/platformthread.h"

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <new>

struct FSemaphore::State
{
    explicit State(int initialCount) : permits(initialCount) {}

    /// Whether the caller may go, who came when `generation` had this value.
    bool take(int64 cameAt)
    {
        // Whoever was let go by a release of all takes no permit.
        if (cameAt != generation)
            return true;
        if (permits == 0)
            return false;
        permits--;
        return true;
    }

    std::mutex mutex;
    std::condition_variable variable;
    int64 permits;
    // Counts the releases of all.
    int64 generation = 0;
};

FSemaphore::FSemaphore(int initialCount, const char*)
    : state(initialCount < 0 ? nullptr : new (std::nothrow) State(initialCount))
{
}

FSemaphore::~FSemaphore() = default;

bool FSemaphore::acquire(int timeoutMs)
{
    if (!state)
        return false;

    std::unique_lock<std::mutex> guard(state->mutex);
    const int64 cameAt = state->generation;
    const auto mayGo = [this, cameAt] { return state->take(cameAt); };
    FCancellationPoint mayBeCancelled;
    if (timeoutMs >= 0)
        return state->variable.wait_for(guard, std::chrono::milliseconds(timeoutMs), mayGo);
    state->variable.wait(guard, mayGo);
    return true;
}

void FSemaphore::release(int count)
{
    if (!state)
        return;

    std::lock_guard<std::mutex> guard(state->mutex);
    if (count < 1)
        state->generation++;
    else
        state->permits += count;
    state->variable.notify_all();
}
