#pragma once

#include "foundation/object/funknown.h"

/// Identifies an object that can make a copy of itself.
class ICloneable : public FUnknown
{
public:
    DECLARE_INTERFACE_ID
};
