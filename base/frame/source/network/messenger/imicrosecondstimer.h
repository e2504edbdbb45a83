#pragma once

#include "foundation/object/types.h"

/// A clock that the messenger takes its time stamps from. Called by any thread.
class IMicrosecondsTimer
{
public:
    /// Microseconds since a moment of its own choice; never fewer than before.
    virtual int64 getMicroseconds() = 0;

protected:
    ~IMicrosecondsTimer() = default;
};
