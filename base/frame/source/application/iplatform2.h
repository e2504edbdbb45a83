#pragma once

#include "foundation/object/funknown.h"

/// Identifies the controller of the application to components. Main thread.
class IPlatform2 : public FUnknown
{
public:
    DECLARE_INTERFACE_ID
};
