#include "foundation/object/metaclasstables.h"

#include "foundation/object/stringhash.h"

#include <cstring>

namespace MetaClasses
{
bool SorterByName::operator==(const SorterByName& other) const
{
    return strcmp(name, other.name) == 0;
}

unsigned SorterByName::hash(const SorterByName& entry, unsigned size)
{
    return hashString8(entry.name, size);
}

bool SorterByCID::operator==(const SorterByCID& other) const
{
    return classID == other.classID;
}

unsigned SorterByCID::hash(const SorterByCID& entry, unsigned size)
{
    const FUID& id = entry.classID;
    return (id.getLong1() + id.getLong2() + id.getLong3() + id.getLong4()) % size;
}
} // namespace MetaClasses
