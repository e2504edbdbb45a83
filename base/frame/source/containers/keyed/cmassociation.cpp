#include "containers/keyed/cmassociation.h"

#include "foundation/object/fastcast.h"

#include <utility>

DEFINE_CLASS(CmAssociation, CmObject)

namespace
{
void put(CmObject*& member, bool& isHeld, CmObject* newMember)
{
    if (newMember == member)
        return;
    CmObject* left = std::exchange(member, newMember);
    if (std::exchange(isHeld, false))
        left->release();
}
} // namespace

CmAssociation::CmAssociation(const CmAssociation& other) : CmObject(other)
{
    *this = other;
}

CmAssociation& CmAssociation::operator=(const CmAssociation& other)
{
    if (this == &other)
        return *this;
    if (other.isKeyHeld)
        other.key->addRef();
    if (other.isObjectHeld)
        other.object->addRef();
    clear();
    key = other.key;
    object = other.object;
    isKeyHeld = other.isKeyHeld;
    isObjectHeld = other.isObjectHeld;
    return *this;
}

void CmAssociation::setKey(CmObject* newKey)
{
    put(key, isKeyHeld, newKey);
}

void CmAssociation::setObject(CmObject* newObject)
{
    put(object, isObjectHeld, newObject);
}

bool CmAssociation::isEqual(const CmObject* other) const
{
    const CmAssociation* association = FCastLikely(CmAssociation, other);
    return association && key && key->isEqual(association->key);
}

int CmAssociation::compare(const CmObject* other) const
{
    const CmAssociation* association = FCastLikely(CmAssociation, other);
    return association && key ? key->compare(association->key) : -1;
}

unsigned CmAssociation::hash(unsigned size) const
{
    return key ? key->hash(size) : CmObject::hash(size);
}

bool CmAssociation::restorePair(CmObject* restoredKey, CmObject* restoredObject)
{
    const bool isWhole = restoredKey && restoredObject;
    clear();
    key = restoredKey;
    object = restoredObject;
    isKeyHeld = restoredKey != nullptr;
    isObjectHeld = restoredObject != nullptr;
    if (!isWhole)
        clear();
    return isWhole;
}

void CmAssociation::clear()
{
    setKey(nullptr);
    setObject(nullptr);
}
