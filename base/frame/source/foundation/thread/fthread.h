#pragma once

#include "foundation/object/types.h"
#include "foundation/text/string.h"
#include "foundation/thread/platformthread.h"

#include <atomic>
#include <memory>

class FThread;

/// Levels of a thread's priority, in rising order. Every other number counts as the lowest.
///
/// | level | scheduling                                                                      |
/// |-------|---------------------------------------------------------------------------------|
/// | 0-2   | time sharing, ten and five below and at the niceness of the process             |
/// | 3-5   | round robin where it is permitted, else time sharing at the best nice permitted |
enum FThreadPriority : int32
{
    kThreadPriorityLowest = 0,
    kThreadPriorityLow = 1,
    kThreadPriorityNormal = 2,
    kThreadPriorityHigh = 3,
    kThreadPriorityHigher = 4,
    kThreadPriorityHighest = 5
};

/// Watches threads come and go, for debugging. Thread-safe: called on whatever thread makes or deletes the
/// object.
class IThreadSpy
{
public:
    virtual void threadCreated(FThread* thread) = 0;
    virtual void threadDestroyed(FThread* thread) = 0;

protected:
    ~IThreadSpy() = default;
};

/// A thread of the process; a derived class puts its work into `entry`.
///
/// One object runs one thread at a time, and can be run again after `entry` has returned. Whoever runs it waits for
/// its end by `waitDead` before deleting it; an object that is deleted earlier leaves its thread to itself.
/// One thread at a time: that of the owner, but that any thread may ask `isThreadRunning`, and the thread itself may
/// ask and set what concerns it.
class FThread
{
public:
    /// The name serves debugging.
    explicit FThread(const char* threadName);
    FThread(const FThread&) = delete;
    FThread& operator=(const FThread&) = delete;
    virtual ~FThread();

    /// Takes effect at once on a thread that exists and otherwise at `run`. Whether the thread exists.
    virtual bool setPriority(int level);
    /// For what a derived class wants to give back after a run that was cut short; nobody calls it by itself.
    virtual void cleanup() {}
    /// The work, on the new thread; the result is the thread's exit value.
    virtual int entry() { return 0; }

    /// Starts the thread; `entry` begins at the right priority. Gives 0 or the system's error code. A run that has
    /// not been waited for is waited for first.
    int run();
    /// Asks the system to cancel the thread. It ends in the next of the framework's own waits (FCondition,
    /// FSemaphore, FThreadSleep), with its stack unwound; elsewhere it goes on.
    void terminate();
    /// Waits until the thread has ended, however long that takes: `timeoutMs` is not looked at. True also where none
    /// was started; false if waiting is impossible, as on the thread itself.
    bool waitDead(int timeoutMs);

    /// True from `run` until `entry` has returned.
    bool isThreadRunning() const { return isRunning; }
    bool isInThreadContext() const;
    int getPriority() const { return priority; }
    /// Kept for the day that a scheduler takes such hints: the number is stored.
    void setCpuAffinity(int number);
    int getCpuAffinity() const { return cpuAffinity; }
    const String& getName() const { return name; }

    /// An object that stands for the calling thread and counts as running. The caller deletes it, which leaves the
    /// thread alone.
    static FThread* newForCallingThread(const char* threadName);
    /// `observer` is borrowed and may be null.
    static void setSpy(IThreadSpy* observer);
    static FThreadID currentThreadID() { return PlatformThread::currentID(); }
    /// A hint without an effect here: desktops raise the process of the window in front by themselves.
    static void setTaskPriorityToForegroundApplication() {}

private:
    struct Run;

    static int callEntry(void* context);
    void leaveThread();

    int32 priority = kThreadPriorityNormal;
    int32 cpuAffinity = -1;
    std::atomic<bool> isRunning{false};
    PlatformThread* handle = nullptr;
    String name;
    // What the thread knows of this object, which may go before it.
    std::shared_ptr<Run> lastRun;
};

/// Blocks the caller for this many milliseconds, for ever if negative.
void FThreadSleep(int ms);
