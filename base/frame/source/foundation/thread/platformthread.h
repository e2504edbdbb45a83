#pragma once

#include <cstdint>

/// Identifies a thread of this process while it lives; 0 is none.
using FThreadID = std::uintptr_t;

/// One thread of the operating system, as the thread classes use it.
///
/// The platform defines the static operations and the one derived class. The record outlives the thread that it
/// stands for: whoever made it ends it by `join` or `detach`, after which the pointer is dead. Thread-safe, but for
/// those two.
class PlatformThread
{
public:
    /// What the thread runs; its result is the thread's exit value.
    using Body = int (*)(void* context);

    /// Makes a thread that waits for `resume` before it calls `body`. Gives 0, or the system's error code and a null
    /// `result`.
    static int createSuspended(Body body, void* context, PlatformThread*& result);
    /// A record that stands for the calling thread; `join` fails on it and `cancel` does nothing.
    static PlatformThread* adoptCurrent();

    static FThreadID currentID();
    /// A hint for debuggers; names longer than the system permits are cut.
    static void nameCurrent(const char* name);
    static int countProcessors();
    /// Those on which this process may run.
    static int countAvailableProcessors();

    /// Lets a suspended thread go; 0 on success.
    virtual int resume() = 0;
    /// Applies one of the levels of FThreadPriority. What the system refuses is left as it is.
    virtual void applyPriority(int level) = 0;
    /// Asks the thread to end at its next point of cancellation.
    virtual void cancel() = 0;
    virtual bool isCurrent() const = 0;
    /// Waits for the end of the thread and frees the record. Fails on the calling thread itself, and then frees
    /// nothing.
    virtual bool join() = 0;
    /// Frees the record; a thread that still runs goes on by itself.
    virtual void detach() = 0;

protected:
    ~PlatformThread() = default;
};

/// While one lives, a cancel ends the thread in the waits of this scope.
///
/// A cancelled thread unwinds its stack, and most code is not made for that: a destructor on the way that waits or
/// writes would end the whole process. So threads take a cancel only in the framework's own waits.
class FCancellationPoint
{
public:
    FCancellationPoint();
    ~FCancellationPoint();
    FCancellationPoint(const FCancellationPoint&) = delete;
    FCancellationPoint& operator=(const FCancellationPoint&) = delete;

private:
    int former;
};
