#pragma once

class FWorkClass;

/// A thread that works off a queue. Thread-safe; `end` once.
class IWorkerThread
{
public:
    /// Hands `work` over to the worker, which starts with the first one. False where it was not taken.
    virtual bool addWork(FWorkClass* work, void* data) = 0;
    /// Gives up all work, waits for the running one, and deletes the worker.
    virtual void end() = 0;
    /// Blocks the worker after the work that is running.
    virtual void suspend() = 0;
    virtual void resume() = 0;

protected:
    ~IWorkerThread() = default;
};
