#include "containers/sequence/cmcontainer.h"
#include "storage/stream/fstream.h"

bool CmContainer::readBase(FStream& stream)
{
    return stream.readInt16(_ownsObjects);
}

bool CmContainer::writeBase(FStream& stream) const
{
    return stream.writeInt16(_ownsObjects);
}
