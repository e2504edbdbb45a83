#pragma once

#include "foundation/thread/fcondition.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/fthread.h"
#include "foundation/thread/fworkclass.h"
#include "foundation/thread/iworkerthread.h"

class CmObject;

/// What the worker threads have in common: the loop that works off a queue, and how it is suspended and ended.
///
/// A derived class has the queue, its lock and the conditions, and takes the lock for each step on the queue. The
/// object is ended, and deleted, by `end` alone. `finished` and `cancelWork` are called under the lock, since a work
/// may be given up only once: they must be short and take no lock under which others add work. Thread-safe; `end`
/// once.
class FQueueWorker : public FThread, public IWorkerThread
{
public:
    int entry() override;
    void end() override;
    void suspend() override;
    void resume() override;

protected:
    struct Record
    {
        FWorkClass* work;
        void* data;
    };

    /// The conditions are members of the derived class; one may serve as both.
    FQueueWorker(const char* threadName, FThreadPriority level, FCondition& hasWork, FCondition& hasResumed);
    ~FQueueWorker() override;

    virtual FLock& queueLock() = 0;
    /// Takes the next record, which is the caller's, from the queue; null from an empty one. `id` is left alone where
    /// records have none, else it gets the reference that the queue held. Called under the lock.
    virtual Record* removeFirst(CmObject*& id) = 0;

    /// Starts the thread with the first work.
    void startOnce();
    /// Gives up the running work, if there is one. Takes the lock.
    void finishCurrent();
    /// Asks the running work to stop. Takes the lock.
    void cancelRunning();
    /// Cancels and gives up all that waits. Takes the lock.
    void clearQueue();

    std::atomic<bool> notStarted{true};
    std::atomic<bool> terminating{false};
    std::atomic<bool> suspended{false};
    const FThreadPriority requestedPriority;
    // Guarded by the lock.
    Record* current = nullptr;
    CmObject* currentId = nullptr;

private:
    Record* takeNext();
    void waitWhileSuspended();

    FCondition& workAvailable;
    FCondition& resumed;
    // Set by an `end` from inside a work: `entry` finds here that its object is gone.
    bool* endedByItself = nullptr;
};
