#include "foundation/thread/fthread.h"

#include "foundation/thread/fsemaphore.h"

#include <mutex>

namespace
{
std::atomic<IThreadSpy*> gSpy{nullptr};
} // namespace

/// One run of a thread: the link between the thread and its object, of which either may end first.
struct FThread::Run
{
    explicit Run(FThread* thread) : owner(thread) {}

    void leave()
    {
        std::lock_guard<std::mutex> guard(lock);
        owner = nullptr;
    }
    FThread* getOwner()
    {
        std::lock_guard<std::mutex> guard(lock);
        return owner;
    }
    void markEnd()
    {
        std::lock_guard<std::mutex> guard(lock);
        if (owner)
            owner->isRunning = false;
    }

    std::mutex lock;
    FThread* owner;
};

FThread::FThread(const char* threadName) : name(threadName)
{
    if (IThreadSpy* spy = gSpy)
        spy->threadCreated(this);
}

FThread::~FThread()
{
    if (IThreadSpy* spy = gSpy)
        spy->threadDestroyed(this);
    // A thread that deletes its own object has nothing left to work with.
    if (isInThreadContext())
        terminate();
    leaveThread();
}

void FThread::leaveThread()
{
    if (lastRun)
        lastRun->leave();
    if (handle)
        handle->detach();
    handle = nullptr;
}

int FThread::run()
{
    if (!waitDead(-1))
        leaveThread();

    isRunning = true;
    lastRun = std::make_shared<Run>(this);
    auto* context = new std::shared_ptr<Run>(lastRun);
    const int error = PlatformThread::createSuspended(&FThread::callEntry, context, handle);
    if (error != 0)
    {
        delete context;
        isRunning = false;
        return error;
    }
    setPriority(priority);
    return handle->resume();
}

int FThread::callEntry(void* context)
{
    // Also at work where the thread is cancelled and its stack unwound.
    struct EndOfRun
    {
        explicit EndOfRun(std::shared_ptr<Run>* handedOver) : run(std::move(*handedOver))
        {
            delete handedOver;
        }
        ~EndOfRun() { run->markEnd(); }

        std::shared_ptr<Run> run;
    } end(static_cast<std::shared_ptr<Run>*>(context));

    FThread* thread = end.run->getOwner();
    if (!thread)
        return 0;
    if (!thread->name.isEmpty())
        PlatformThread::nameCurrent(thread->name.text8());
    return thread->entry();
}

bool FThread::setPriority(int level)
{
    priority = level;
    if (handle)
        handle->applyPriority(level);
    return handle != nullptr;
}

void FThread::setCpuAffinity(int number)
{
    cpuAffinity = number;
}

void FThread::terminate()
{
    if (handle)
        handle->cancel();
}

bool FThread::waitDead(int)
{
    if (!handle)
        return true;
    if (!handle->join())
        return false;
    handle = nullptr;
    return true;
}

bool FThread::isInThreadContext() const
{
    return handle && handle->isCurrent();
}

FThread* FThread::newForCallingThread(const char* threadName)
{
    auto* thread = new FThread(threadName);
    thread->isRunning = true;
    thread->handle = PlatformThread::adoptCurrent();
    return thread;
}

void FThread::setSpy(IThreadSpy* observer)
{
    gSpy = observer;
}

void FThreadSleep(int ms)
{
    FSemaphore nobodySignals(0, "sleep");
    nobodySignals.acquire(ms);
}
