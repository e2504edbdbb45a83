#pragma once

#include "foundation/object/idependent.h"

/// Keeps who depends on whom and carries changes to them. Results: 0, or 1 for a null or unusable argument.
class IUpdateHandler : public FUnknown
{
public:
    virtual int32 addDependent(FUnknown* object, IDependent* dependent) = 0;
    virtual int32 removeDependent(FUnknown* object, IDependent* dependent) = 0;
    virtual int32 triggerUpdates(FUnknown* object, int message) = 0;
    virtual int32 deferUpdates(FUnknown* object, int message) = 0;

    DECLARE_INTERFACE_ID
};
