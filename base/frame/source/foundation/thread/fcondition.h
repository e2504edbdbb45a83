#pragma once

#include "foundation/object/types.h"

#include <condition_variable>
#include <mutex>

/// Lets threads wait for a signal that sticks: with nobody waiting it lets the next wait pass at once.
///
/// Thread-safe. A wait is a point of cancellation.
class FCondition
{
public:
    /// The name serves the reader of the code only.
    explicit FCondition(const char* name = nullptr);
    FCondition(const FCondition&) = delete;
    FCondition& operator=(const FCondition&) = delete;

    void wait();
    /// -1 means no limit. True if signalled, false when the time is over.
    bool waitTimeout(int ms);
    /// Lets one waiting thread go.
    void signal();
    void signalAll();
    /// Takes back a signal that nobody has used.
    void reset();

private:
    class Waiting;

    std::mutex mutex;
    std::condition_variable variable;
    int32 signaled = 0;
    int32 waiters = 0;
};
