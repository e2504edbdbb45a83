#include "foundation/thread/fcondition.h"

#include "foundation/thread/platformthread.h"

#include <algorithm>
#include <chrono>

/// Counts a waiting thread, also one that is cancelled in its wait.
class FCondition::Waiting
{
public:
    explicit Waiting(FCondition& waitedFor) : condition(waitedFor), guard(condition.mutex)
    {
        condition.waiters++;
    }
    ~Waiting() { condition.waiters--; }

    void wait()
    {
        FCancellationPoint mayBeCancelled;
        condition.variable.wait(guard, [this] { return condition.signaled != 0; });
    }
    bool waitFor(int ms)
    {
        FCancellationPoint mayBeCancelled;
        return condition.variable.wait_for(guard, std::chrono::milliseconds(ms),
                                           [this] { return condition.signaled != 0; });
    }
    /// Uses up the signal: its part for this thread, and all of it where nobody else waits.
    void takeSignal()
    {
        if (condition.waiters > 1)
            condition.signaled--;
        else
            condition.signaled = 0;
    }

private:
    FCondition& condition;
    std::unique_lock<std::mutex> guard;
};

FCondition::FCondition(const char*) {}

void FCondition::wait()
{
    Waiting waiting(*this);
    waiting.wait();
    waiting.takeSignal();
}

bool FCondition::waitTimeout(int ms)
{
    if (ms == -1)
    {
        wait();
        return true;
    }

    Waiting waiting(*this);
    if (!waiting.waitFor(std::max(ms, 0)))
        return false;
    waiting.takeSignal();
    return true;
}

void FCondition::signal()
{
    std::lock_guard<std::mutex> guard(mutex);
    signaled = 1;
    variable.notify_one();
}

void FCondition::signalAll()
{
    std::lock_guard<std::mutex> guard(mutex);
    signaled = waiters + 1;
    variable.notify_all();
}

void FCondition::reset()
{
    std::lock_guard<std::mutex> guard(mutex);
    signaled = 0;
}
