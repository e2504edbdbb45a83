#include "foundation/object/cmobject.h"

MetaClass CmObject::__fClass("CmObject", &CmObject::__fCreate, nullptr, nullptr, 0);

FUnknown* CmObject::__fCreate()
{
    return new CmObject;
}

void CmObject::update(FUnknown* changedUnknown, int message)
{
    if (CmObject* changedObject = toCmObject(changedUnknown))
        update(changedObject, message);
}

bool CmObject::isEqual(const CmObject* other) const
{
    return this == other;
}

int CmObject::compare(const CmObject* other) const
{
    if (this == other)
        return 0;
    return reinterpret_cast<uintptr_t>(this) > reinterpret_cast<uintptr_t>(other) ? 1 : -1;
}

unsigned CmObject::hash(unsigned size) const
{
    return static_cast<unsigned>((reinterpret_cast<uintptr_t>(this) >> 4) % size);
}

void CmObject::update(CmObject*, int) {}

bool CmObject::internalize(FArchive&)
{
    return true;
}

bool CmObject::externalize(FArchive&) const
{
    return true;
}

bool CmObject::storeAttributes(FAttributes&) const
{
    return false;
}

bool CmObject::restoreAttributes(FAttributes&)
{
    return false;
}

int CmObject::notify(FMessage*)
{
    return 0;
}

CmObject* toCmObject(FUnknown* unknown)
{
    return FCast(CmObject, toFObject(unknown));
}
