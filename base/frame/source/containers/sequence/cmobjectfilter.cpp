#include "containers/sequence/cmobjectfilter.h"

#include "foundation/object/cmobject.h"

bool CmIsAFilter::check(CmObject* object)
{
    return object && object->isA(className);
}

bool CmTypeFilter::check(CmObject* object)
{
    return object && object->isTypeOf(className, true);
}
