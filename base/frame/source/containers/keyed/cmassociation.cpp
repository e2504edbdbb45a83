#include "containers/keyed/cmassociation.h"

#include "foundation/object/fastcast.h"

DEFINE_CLASS(CmAssociation, CmObject)

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

void CmAssociation::handOver()
{
    static_cast<void>(heldKey.take());
    static_cast<void>(heldObject.take());
}

bool CmAssociation::restorePair(CmObject* restoredKey, CmObject* restoredObject)
{
    const bool isWhole = restoredKey && restoredObject;
    heldKey = adopt(restoredKey);
    heldObject = adopt(restoredObject);
    if (!isWhole)
        heldKey = heldObject = nullptr;
    key = heldKey;
    object = heldObject;
    return isWhole;
}
