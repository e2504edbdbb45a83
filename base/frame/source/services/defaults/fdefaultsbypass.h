#pragma once

#include "foundation/object/types.h"

/// A switch that leaves the file of the user's settings alone: while it is set, they are neither loaded nor saved.
/// Nothing in the program sets it. Main thread.
class FDefaultsBypass
{
public:
    /// Made on first use.
    static FDefaultsBypass& instance();

    bool isSet() const { return flag != 0; }
    void set(bool state) { flag = state ? 1 : 0; }

private:
    int32 flag = 0;
};
