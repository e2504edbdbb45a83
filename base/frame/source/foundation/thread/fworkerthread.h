#pragma once

#include "foundation/thread/fcondition.h"
#include "foundation/thread/fqueue.h"
#include "foundation/thread/fthread.h"
#include "foundation/thread/fworkclass.h"
#include "foundation/thread/iworkerthread.h"

/// Works off a queue on a thread of its own, first come first served.
///
/// The thread starts with the first work. The object is ended, and deleted, by `end` alone. `finished` and
/// `cancelWork` are called under the queue's lock, since a work may be given up only once: they must be short and
/// take no lock under which others add work. Thread-safe; `end` once.
class FWorkerThread : public FThread, public IWorkerThread
{
public:
    /// A null name stands for "WorkerThread".
    FWorkerThread(const char* threadName, FThreadPriority level);

    int entry() override;
    bool addWork(FWorkClass* work, void* data) override;
    void end() override;
    void suspend() override;
    void resume() override;
    /// As `addWork`, but the work is done next.
    virtual bool prependWork(FWorkClass* work, void* data);

    /// Asks the running work to stop, and gives it up with `discard`; otherwise it is done again, next.
    void cancelCurrent(bool discard);

protected:
    ~FWorkerThread() override;

private:
    struct Record
    {
        FWorkClass* work;
        void* data;
    };

    void enqueue(Record* record, bool first);
    Record* takeNext();
    void finishCurrent();
    void cancelAll();
    void waitWhileSuspended();

    FCondition workAvailable{"work available"};
    FCondition resumed{"resumed"};
    FQueue queue;
    std::atomic<bool> notStarted{true};
    std::atomic<bool> terminating{false};
    std::atomic<bool> suspended{false};
    FThreadPriority requestedPriority;
    // Guarded by the queue's lock.
    Record* current = nullptr;
    // Set by an `end` from inside a work: `entry` finds here that its object is gone.
    bool* endedByItself = nullptr;
};

/// The first worker made, null without one.
extern FWorkerThread* gWorkerThread;
