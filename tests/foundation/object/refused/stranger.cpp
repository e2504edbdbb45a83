#include "foundation/object/cmuid.h"

class Stranger : public CmObject
{
    DECLARE_CLASS(Stranger, CmObject)
};

class Derived : public Stranger
{
    DECLARE_COPYABLE(Derived, CmUID)
};
