#pragma once

#include "foundation/object/funknown.h"

/// The message of an object that is going away; no `updateDone` follows it.
inline constexpr int kMessageDestroyed = 2;

/// Somebody who hears of changes in another object.
class IDependent : public FUnknown
{
public:
    virtual void update(FUnknown* changedUnknown, int message) = 0;

    DECLARE_INTERFACE_ID
};
