#include "foundation/thread/fworkerthread.h"

#include "foundation/thread/flockscope.h"

#include <memory>

FWorkerThread* gWorkerThread = nullptr;

FWorkerThread::FWorkerThread(const char* threadName, FThreadPriority level)
    : FThread(threadName ? threadName : "WorkerThread"),
      requestedPriority(level)
{
    if (!gWorkerThread)
        gWorkerThread = this;
}

FWorkerThread::~FWorkerThread()
{
    if (gWorkerThread == this)
        gWorkerThread = nullptr;
    if (endedByItself && isInThreadContext())
        *endedByItself = true;
}

int FWorkerThread::entry()
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

void FWorkerThread::waitWhileSuspended()
{
    while (suspended && !terminating)
        resumed.wait();
}

FWorkerThread::Record* FWorkerThread::takeNext()
{
    FLockScope guard(queue.guard());
    current = static_cast<Record*>(queue.removeFirst());
    return current;
}

void FWorkerThread::finishCurrent()
{
    FLockScope guard(queue.guard());
    if (!current)
        return;
    current->work->finished();
    delete current;
    current = nullptr;
}

bool FWorkerThread::addWork(FWorkClass* work, void* data)
{
    enqueue(new Record{work, data}, false);
    return true;
}

bool FWorkerThread::prependWork(FWorkClass* work, void* data)
{
    enqueue(new Record{work, data}, true);
    return true;
}

void FWorkerThread::enqueue(Record* record, bool first)
{
    if (first)
        queue.prepend(record);
    else
        queue.append(record);

    if (notStarted.exchange(false))
    {
        run();
        setPriority(requestedPriority);
    }
    workAvailable.signalAll();
}

void FWorkerThread::cancelCurrent(bool discard)
{
    FLockScope guard(queue.guard());
    if (!current)
        return;

    current->work->cancelWork();
    if (discard)
    {
        current->work->finished();
        delete current;
    }
    else
        queue.prepend(current);
    current = nullptr;
}

void FWorkerThread::suspend()
{
    if (suspended)
        return;
    resumed.reset();
    suspended = true;
}

void FWorkerThread::resume()
{
    if (!suspended)
        return;
    suspended = false;
    resumed.signalAll();
}

void FWorkerThread::cancelAll()
{
    FLockScope guard(queue.guard());
    if (current)
        current->work->cancelWork();
    while (void* item = queue.removeFirst())
    {
        const std::unique_ptr<Record> record(static_cast<Record*>(item));
        record->work->cancelWork();
        record->work->finished();
    }
}

void FWorkerThread::end()
{
    terminating = true;
    suspended = false;
    cancelAll();
    workAvailable.signalAll();
    resumed.signalAll();
    if (!waitDead(1000))
    {
        finishCurrent();
        terminate();
    }
    delete this;
}
