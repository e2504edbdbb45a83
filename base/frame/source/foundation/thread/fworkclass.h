#pragma once

/// A unit of work for a worker thread. Made by whoever needs the work; then it belongs to the worker. Thread-safe as to
/// `cancelWork`; the rest is called by one thread at a time.
class FWorkClass
{
public:
    /// The work itself, on the worker thread.
    virtual void performThreadWork(void* data) = 0;
    /// Gives the object up, after its work or without it; here it deletes itself.
    virtual void finished() = 0;
    /// Asks the running work to stop early. Called by any thread.
    virtual void cancelWork() {}

protected:
    ~FWorkClass() = default;
};
