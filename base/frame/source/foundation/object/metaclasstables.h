#pragma once

#include "containers/typed/thashtable.h"
#include "foundation/object/metaclass.h"

namespace MetaClasses
{
/// A descriptor as the table of names holds it: equal by name.
struct SorterByName
{
    bool operator==(const SorterByName& other) const;
    static unsigned hash(const SorterByName& entry, unsigned size);

    const char* name = nullptr;
    MetaClass* meta = nullptr;
};

/// A descriptor as the table of identifiers holds it: equal by the 16 bytes.
struct SorterByCID
{
    bool operator==(const SorterByCID& other) const;
    static unsigned hash(const SorterByCID& entry, unsigned size);

    FUID classID;
    MetaClass* meta = nullptr;
};

/// The two ways to a descriptor. New entries go to the end of their chain, so the first one of a name counts.
struct Tables
{
    THashTable<SorterByName> byName{50, &SorterByName::hash};
    THashTable<SorterByCID> byID{20, &SorterByCID::hash};
};
} // namespace MetaClasses
