#pragma once

#include "foundation/thread/fpreferqueue.h"
#include "foundation/thread/fqueueworker.h"

/// Works off a queue at the lowest priority; a work that carries an id can be moved to the front.
///
/// A reference on the id is held while the work waits and runs. Thread-safe.
class FPreferWorkerThread : public FQueueWorker
{
public:
    explicit FPreferWorkerThread(const char* threadName);

    bool addWork(FWorkClass* work, void* data) override;
    /// Also asks the running work to stop.
    void suspend() override;

    /// False, and nothing is taken, where a work with this id waits already; null is no id.
    bool addWork(FWorkClass* work, CmObject* id, void* data);
    /// Moves the work with this id to the front; false where none waits.
    bool prefer(CmObject* id);
    /// Gives up all work that waits.
    void clear() { clearQueue(); }

protected:
    ~FPreferWorkerThread() override = default;

private:
    FLock& queueLock() override { return lock; }
    Record* removeFirst(CmObject*& id) override;
    bool enqueue(FWorkClass* work, CmObject* id, void* data);

    FCondition condition{"prefer worker"};
    FPreferQueue queue;
    // Makes each step on the queue one with what is running.
    FLock lock{"prefer worker"};
};
