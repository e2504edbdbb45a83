#pragma once

#include "storage/attribute/tnumberlist.h"

/// A queue of integers. One thread at a time.
class FIntList : public TNumberList<long long>
{
    DECLARE_CLASS(FIntList, FAttrList)
};
