#pragma once

#include "foundation/thread/flock.h"

/// Holds a lock to the end of a scope. One thread at a time.
class [[nodiscard]] FLockScope
{
public:
    explicit FLockScope(FLock& guard) : held(guard) { held.lock(); }
    ~FLockScope() { held.unlock(); }
    FLockScope(const FLockScope&) = delete;
    FLockScope& operator=(const FLockScope&) = delete;

private:
    FLock& held;
};
