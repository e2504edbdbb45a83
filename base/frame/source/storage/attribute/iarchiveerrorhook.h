#pragma once

#include "foundation/object/funknown.h"

class FArchive;

/// Hears of each error of an archive, as often as it occurs.
class IArchiveErrorHook : public FUnknown
{
public:
    virtual void onArchiveError(FArchive& archive, int32 error) = 0;

    DECLARE_INTERFACE_ID
};
