#include "foundation/thread/fqueueworker.h"

#include "foundation/object/cmobject.h"
#include "foundation/thread/flockscope.h"

#include <memory>

FQueueWorker::FQueueWorker(const char* threadName, FThreadPriority level, FCondition& hasWork,
                           FCondition& hasResumed)
    : FThread(threadName),
      requestedPriority(level),
      workAvailable(hasWork),
      resumed(hasResumed)
{
}

FQueueWorker::~FQueueWorker()
{
    if (endedByItself && isInThreadContext())
        *endedByItself = true;
}

// The worker

int FQueueWorker::entry()
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
            workAvailable.wait();
    }
    endedByItself = nullptr;
    return 0;
}

void FQueueWorker::waitWhileSuspended()
{
    while (suspended && !terminating)
        resumed.wait();
}

FQueueWorker::Record* FQueueWorker::takeNext()
{
    FLockScope guard(queueLock());
    current = removeFirst(currentId);
    return current;
}

void FQueueWorker::finishCurrent()
{
    FLockScope guard(queueLock());
    if (current)
        current->work->finished();
    delete current;
    current = nullptr;
    if (currentId)
        currentId->release();
    currentId = nullptr;
}

// Its users

void FQueueWorker::startOnce()
{
    if (!notStarted.exchange(false))
        return;
    // A system that is out of threads is asked again with the next work.
    notStarted = run() != 0;
    setPriority(requestedPriority);
}

void FQueueWorker::suspend()
{
    if (suspended)
        return;
    resumed.reset();
    suspended = true;
}

void FQueueWorker::resume()
{
    if (!suspended)
        return;
    suspended = false;
    resumed.signalAll();
}

void FQueueWorker::cancelRunning()
{
    FLockScope guard(queueLock());
    if (current)
        current->work->cancelWork();
}

void FQueueWorker::clearQueue()
{
    FLockScope guard(queueLock());
    CmObject* id = nullptr;
    while (const auto record = std::unique_ptr<Record>(removeFirst(id)))
    {
        record->work->cancelWork();
        record->work->finished();
        if (id)
            id->release();
    }
}

void FQueueWorker::end()
{
    terminating = true;
    suspended = false;
    {
        // In one, so that the worker takes no further work in between.
        FLockScope guard(queueLock());
        cancelRunning();
        clearQueue();
    }
    workAvailable.signalAll();
    resumed.signalAll();
    if (!waitDead(1000))
    {
        finishCurrent();
        terminate();
    }
    delete this;
}
