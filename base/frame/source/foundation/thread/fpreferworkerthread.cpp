#include "foundation/thread/fpreferworkerthread.h"

#include "foundation/object/cmobject.h"
#include "foundation/thread/flockscope.h"

#include <memory>

FPreferWorkerThread::FPreferWorkerThread(const char* threadName) : FThread(threadName) {}

FPreferWorkerThread::~FPreferWorkerThread()
{
    if (endedByItself && isInThreadContext())
        *endedByItself = true;
}

int FPreferWorkerThread::entry()
{
    bool isGone = false;
    endedByItself = &isGone;
    while (!terminating)
    {
        waitWhileSuspended();
        if (Record* record = takeNext())
        {
            FWorkClass* work = record->work;
            work->performThreadWork(record->data);
            if (isGone)
                return 0;
            finishCurrent();
            waitWhileSuspended();
        }
        else if (!terminating)
            condition.wait();
    }
    endedByItself = nullptr;
    return 0;
}

void FPreferWorkerThread::waitWhileSuspended()
{
    while (suspended && !terminating)
        condition.wait();
}

FPreferWorkerThread::Record* FPreferWorkerThread::takeNext()
{
    FLockScope guard(lock);
    void* id = nullptr;
    current = static_cast<Record*>(queue.removeFirst(&id));
    currentId = static_cast<CmObject*>(id);
    return current;
}

void FPreferWorkerThread::finishCurrent()
{
    FLockScope guard(lock);
    if (current)
        current->work->finished();
    delete current;
    current = nullptr;
    if (currentId)
        currentId->release();
    currentId = nullptr;
}

bool FPreferWorkerThread::addWork(FWorkClass* work, void* data)
{
    return addWork(work, nullptr, data);
}

bool FPreferWorkerThread::addWork(FWorkClass* work, CmObject* id, void* data)
{
    if (!enqueue(work, id, data))
        return false;

    if (notStarted.exchange(false))
    {
        run();
        setPriority(kThreadPriorityLowest);
    }
    FLockScope guard(lock);
    if (!suspended && !current)
        condition.signal();
    return true;
}

bool FPreferWorkerThread::enqueue(FWorkClass* work, CmObject* id, void* data)
{
    FLockScope guard(lock);
    if (id && queue.idExists(id))
        return false;
    if (id)
        id->addRef();
    return queue.append(new Record{work, data}, id);
}

bool FPreferWorkerThread::prefer(CmObject* id)
{
    return queue.prefer(id);
}

void FPreferWorkerThread::suspend()
{
    cancelCurrent();
    if (suspended)
        return;
    condition.reset();
    suspended = true;
}

void FPreferWorkerThread::resume()
{
    if (!suspended)
        return;
    suspended = false;
    condition.signalAll();
}

void FPreferWorkerThread::cancelCurrent()
{
    FLockScope guard(lock);
    if (current)
        current->work->cancelWork();
}

void FPreferWorkerThread::clear()
{
    FLockScope guard(lock);
    void* id = nullptr;
    while (void* item = queue.removeFirst(&id))
    {
        const std::unique_ptr<Record> record(static_cast<Record*>(item));
        record->work->cancelWork();
        record->work->finished();
        if (id)
            static_cast<CmObject*>(id)->release();
    }
}

void FPreferWorkerThread::end()
{
    terminating = true;
    suspended = false;
    cancelCurrent();
    clear();
    condition.signalAll();
    if (!waitDead(1000))
    {
        finishCurrent();
        terminate();
    }
    delete this;
}
