#pragma once

#include <mutex>

/// A lock that the thread which holds it may take again. Thread-safe.
class FLock
{
public:
    /// The name serves the reader of the code only.
    explicit FLock(const char* name = nullptr);
    FLock(const FLock&) = delete;
    FLock& operator=(const FLock&) = delete;
    virtual ~FLock() = default;

    void lock() { mutex.lock(); }
    void unlock() { mutex.unlock(); }
    /// Takes the lock if that needs no waiting; tells whether it did.
    bool trylock() { return mutex.try_lock(); }

private:
    std::recursive_mutex mutex;
};
