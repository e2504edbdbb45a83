#include "containers/sequence/cmarrayiterator.h"

#include <algorithm>

CmObject* CmArrayIterator::first()
{
    cursor = 0;
    return current();
}

CmObject* CmArrayIterator::last()
{
    cursor = total - 1;
    return current();
}

CmObject* CmArrayIterator::operator+=(int count)
{
    if (count > 0 && !done())
        cursor += std::min(count, total - cursor);
    return current();
}

CmObject* CmArrayIterator::operator-=(int count)
{
    if (count > 0 && !done())
        cursor -= std::min(count, cursor + 1);
    return current();
}
