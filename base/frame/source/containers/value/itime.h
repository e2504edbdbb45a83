#pragma once

#include "foundation/object/funknown.h"

/// A time of day as a component sees it, in local time. Each result is 0, or 2 for a null pointer.
/// One thread at a time.
class ITime : public FUnknown
{
public:
    virtual int32 hour(int* result) = 0;
    virtual int32 minute(int* result) = 0;
    virtual int32 second(int* result) = 0;

    DECLARE_INTERFACE_ID
};
