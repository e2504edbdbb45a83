#include "foundation/thread/fpreferworkerthread.h"

#include "foundation/object/cmobject.h"
#include "foundation/thread/flockscope.h"

FPreferWorkerThread::FPreferWorkerThread(const char* threadName)
    : FQueueWorker(threadName, kThreadPriorityLowest, condition, condition)
{
}

FQueueWorker::Record* FPreferWorkerThread::removeFirst(CmObject*& id)
{
    void* found = nullptr;
    auto* record = static_cast<Record*>(queue.removeFirst(&found));
    id = static_cast<CmObject*>(found);
    return record;
}

bool FPreferWorkerThread::addWork(FWorkClass* work, void* data)
{
    return addWork(work, nullptr, data);
}

bool FPreferWorkerThread::addWork(FWorkClass* work, CmObject* id, void* data)
{
    if (!enqueue(work, id, data))
        return false;

    startOnce();
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
    cancelRunning();
    FQueueWorker::suspend();
}
