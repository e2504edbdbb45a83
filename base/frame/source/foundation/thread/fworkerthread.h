#pragma once

#include "foundation/thread/fqueue.h"
#include "foundation/thread/fqueueworker.h"

/// Works off a queue on a thread of its own, first come first served. The lock is that of the queue. Thread-safe.
class FWorkerThread : public FQueueWorker
{
public:
    /// A null name stands for "WorkerThread".
    FWorkerThread(const char* threadName, FThreadPriority level);

    bool addWork(FWorkClass* work, void* data) override;
    /// As `addWork`, but the work is done next.
    virtual bool prependWork(FWorkClass* work, void* data);

    /// Asks the running work to stop, and gives it up with `discard`; otherwise it is done again, next.
    void cancelCurrent(bool discard);

protected:
    ~FWorkerThread() override;

private:
    FLock& queueLock() override { return queue.guard(); }
    Record* removeFirst(CmObject*& id) override;
    void startWork();

    FCondition workAvailable{"work available"};
    FCondition resumed{"resumed"};
    FQueue queue;
};

/// The first worker made, null without one.
extern FWorkerThread* gWorkerThread;
