#include "containers/sequence/cmiterator.h"

#include "foundation/object/cmobject.h"

bool CmIterator::setCurrent(CmObject* object)
{
    first();
    while (!done() && current() != object)
        next();
    return !done();
}

CmObject* CmIterator::operator+=(int count)
{
    while (count-- > 0 && !done())
        next();
    return current();
}

CmObject* CmIterator::operator-=(int count)
{
    while (count-- > 0 && !done())
        previous();
    return current();
}

CmObject* CmIterator::next(CmObject* key)
{
    while (!done() && !current()->isEqual(key))
        next();
    return next();
}

CmObject* CmIterator::previous(CmObject* key)
{
    while (!done() && !current()->isEqual(key))
        previous();
    return previous();
}
