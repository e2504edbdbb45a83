#pragma once

#include "foundation/object/funknown.h"

class IAttributes;

/// An object of a component that stores itself under a class identifier. Each result is 0 on success.
class IPersistent : public FUnknown
{
public:
    /// Writes 16 bytes to `uid`.
    virtual int32 getClassID(char* uid) = 0;
    virtual int32 saveAttributes(IAttributes* attributes) = 0;
    virtual int32 loadAttributes(IAttributes* attributes) = 0;

    DECLARE_INTERFACE_ID
};
