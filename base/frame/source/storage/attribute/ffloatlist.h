#pragma once

#include "storage/attribute/tnumberlist.h"

/// A queue of doubles. One thread at a time.
class FFloatList : public TNumberList<double>
{
    DECLARE_CLASS(FFloatList, FAttrList)
};
