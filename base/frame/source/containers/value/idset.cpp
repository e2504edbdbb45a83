#include "containers/value/idset.h"

IDSet::IDSet(int first, int count)
    : BitSet(count < 1 ? 1 : static_cast<uint32>(count)),
      firstID(first),
      growStep(getSize())
{
}

int IDSet::newID()
{
    int index = getFirstNotSet();
    if (index < 0)
    {
        index = static_cast<int>(getSize());
        setSize(getSize() + growStep);
    }
    setBit(static_cast<uint32>(index));
    return firstID + index;
}

void IDSet::releaseID(int id)
{
    if (id >= firstID)
        clearBit(static_cast<uint32>(id) - static_cast<uint32>(firstID));
}
