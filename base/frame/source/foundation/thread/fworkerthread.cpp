#include "foundation/thread/fworkerthread.h"

#include "foundation/thread/flockscope.h"

FWorkerThread* gWorkerThread = nullptr;

FWorkerThread::FWorkerThread(const char* threadName, FThreadPriority level)
    : FQueueWorker(threadName ? threadName : "WorkerThread", level, workAvailable, resumed)
{
    if (!gWorkerThread)
        gWorkerThread = this;
}

FWorkerThread::~FWorkerThread()
{
    if (gWorkerThread == this)
        gWorkerThread = nullptr;
}

FQueueWorker::Record* FWorkerThread::removeFirst(CmObject*&)
{
    return static_cast<Record*>(queue.removeFirst());
}

bool FWorkerThread::addWork(FWorkClass* work, void* data)
{
    queue.append(new Record{work, data});
    startWork();
    return true;
}

bool FWorkerThread::prependWork(FWorkClass* work, void* data)
{
    queue.prepend(new Record{work, data});
    startWork();
    return true;
}

void FWorkerThread::startWork()
{
    startOnce();
    workAvailable.signalAll();
}

void FWorkerThread::cancelCurrent(bool discard)
{
    FLockScope guard(queue.guard());
    if (!current)
        return;

    cancelRunning();
    if (discard)
    {
        finishCurrent();
        return;
    }
    queue.prepend(current);
    current = nullptr;
}
