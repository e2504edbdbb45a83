#pragma once

#include "foundation/thread/fcondition.h"
#include "foundation/thread/fpreferqueue.h"
#include "foundation/thread/fthread.h"
#include "foundation/thread/fworkclass.h"
#include "foundation/thread/iworkerthread.h"

class CmObject;

/// Works off a queue at the lowest priority; a work that carries an id can be moved to the front.
///
/// A reference on the id is held while the work waits and runs. The object is ended, and deleted, by `end` alone.
/// `finished` and `cancelWork` are called under the worker's lock, as in FWorkerThread. Thread-safe; `end` once.
class FPreferWorkerThread : public FThread, public IWorkerThread
{
public:
    explicit FPreferWorkerThread(const char* threadName);

    int entry() override;
    bool addWork(FWorkClass* work, void* data) override;
    void end() override;
    /// Also asks the running work to stop.
    void suspend() override;
    void resume() override;

    /// False, and nothing is taken, where a work with this id waits already; null is no id.
    bool addWork(FWorkClass* work, CmObject* id, void* data);
    /// Moves the work with this id to the front; false where none waits.
    bool prefer(CmObject* id);
    /// Gives up all work that waits.
    void clear();

protected:
    ~FPreferWorkerThread() override;

private:
    struct Record
    {
        FWorkClass* work;
        void* data;
    };

    bool enqueue(FWorkClass* work, CmObject* id, void* data);
    Record* takeNext();
    void finishCurrent();
    void cancelCurrent();
    void waitWhileSuspended();

    FCondition condition{"prefer worker"};
    FPreferQueue queue;
    // Guards `current` and `currentId`, and makes each step on the queue one with them.
    FLock lock{"prefer worker"};
    std::atomic<bool> notStarted{true};
    std::atomic<bool> terminating{false};
    std::atomic<bool> suspended{false};
    Record* current = nullptr;
    CmObject* currentId = nullptr;
    bool* endedByItself = nullptr;
};
