#include "foundation/object/cmuid.h"

class Derived : public CmUID
{
    DECLARE_TYPE(CmUID, CmObject)
};
