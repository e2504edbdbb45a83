#include "storage/filesystem/iarchivelookup.h"

#include <atomic>

namespace
{
std::atomic<IArchiveLookup*> theLookup{nullptr};
}

IArchiveLookup* IArchiveLookup::instance()
{
    return theLookup;
}

void IArchiveLookup::setInstance(IArchiveLookup* lookup)
{
    theLookup = lookup;
}
