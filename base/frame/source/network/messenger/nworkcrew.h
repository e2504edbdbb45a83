#pragma once

#include "foundation/thread/fcondition.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/fthread.h"

#include <deque>
#include <memory>
#include <vector>

class FWorkClass;

/// Does each work on a thread of its own, as many as `kMaxThreads` at a time; further works wait until one is done.
///
/// At most `kMaxWaiting` wait; what comes on top is ended undone. A work is ended by `finished`, which is called under the crew's lock, as `cancelWork` is: both must be short and
/// must not come back here. Thread-safe, but for `end` and the destructor, which belong to the owner.
class NWorkCrew
{
public:
    static constexpr size_t kMaxThreads = 64;
    static constexpr size_t kMaxWaiting = 4096;

    /// The name and the level of priority are those of the threads.
    NWorkCrew(const char* threadName, FThreadPriority threadPriority);
    ~NWorkCrew();
    NWorkCrew(const NWorkCrew&) = delete;
    NWorkCrew& operator=(const NWorkCrew&) = delete;

    void add(FWorkClass* work);
    /// Waits at most `grace` milliseconds for what is under way, cancels the rest, and waits for the threads. The crew
    /// can be used again.
    void end(int grace);

private:
    class Worker;

    FWorkClass* exchangeWork(Worker& worker);
    std::vector<std::unique_ptr<Worker>> takeIdle();
    size_t countBusy();
    void cancelAll();

    const char* name;
    FThreadPriority priority;
    FLock lock{"work crew"};
    std::vector<std::unique_ptr<Worker>> workers;
    std::deque<FWorkClass*> waiting;
    // A worker has nothing more to do.
    FCondition workerIdle{"worker idle"};
};
