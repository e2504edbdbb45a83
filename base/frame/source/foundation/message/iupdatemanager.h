#pragma once

#include "foundation/object/funknown.h"

/// What the owner of the idle pulse does with deferred changes. Results: 0, or 1 for an unusable argument.
/// Thread-safe.
class IUpdateManager : public FUnknown
{
public:
    /// Drops the deferred changes of `object`.
    virtual int32 cancelUpdates(FUnknown* object) = 0;
    /// Carries out the deferred changes of `object`, or of all if it is null.
    virtual int32 triggerDeferedUpdates(FUnknown* object) = 0;

    DECLARE_INTERFACE_ID
};
