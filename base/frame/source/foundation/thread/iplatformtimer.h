#pragma once

#include "foundation/object/fobject.h"

/// Hears the ticks of a timer. Main thread.
class ITimerCallback
{
public:
    virtual void onTimer() = 0;

protected:
    ~ITimerCallback() = default;
};

/// A repeating timer on the thread of the main event loop.
///
/// Ticks come while the loop runs, also in loops begun inside a tick. The last release stops it. *Main thread*.
class IPlatformTimer : public FObject
{
    DECLARE_TYPE(IPlatformTimer, FObject)

    /// Made and running, with one reference for the caller. `callback` is borrowed until `stop`.
    static IPlatformTimer* make(ITimerCallback* callback, unsigned intervalMs);

    /// No tick comes afterwards. May be called again.
    virtual void stop() = 0;
};
