#include "storage/filesystem/iarchivelookup.h"

namespace
{
IArchiveLookup* theLookup = nullptr;
}

IArchiveLookup* IArchiveLookup::instance()
{
    return theLookup;
}

void IArchiveLookup::setInstance(IArchiveLookup* lookup)
{
    theLookup = lookup;
}
