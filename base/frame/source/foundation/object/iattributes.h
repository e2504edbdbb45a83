#pragma once

#include "foundation/object/funknown.h"

/// Identifies an attribute tree that crosses a component boundary.
class IAttributes : public FUnknown
{
public:
    DECLARE_INTERFACE_ID
};
