#pragma once

#include "foundation/object/types.h"

/// How many processors there are, as read when the object was made. One thread at a time.
class FCpuInfo
{
public:
    FCpuInfo();

    /// Reads the numbers again.
    void initialize();
    int32 countPhysical() const { return present; }
    /// Those on which this process may run.
    int32 countAvailable() const { return available; }
    bool isLogicalAvailable(int n) const { return n < available; }

private:
    int32 present = 1;
    int32 available = 1;
};
