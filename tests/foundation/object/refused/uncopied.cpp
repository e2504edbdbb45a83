#include "foundation/object/cmobject.h"

class Abstract : public CmObject
{
    DECLARE_ABSTRACT_CLASS(Abstract, CmObject)
};

// An abstract class leaves the copy to its descendants, so that none can forget it.
class Derived : public Abstract
{
    DECLARE_TYPE(Derived, Abstract)
};

Derived derived;
