#include "containers/keyed/cmhashdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

DEFINE_CLASS(CmHashDictionary, CmHashTable)

template <>
CmAssociation* CmDictionaryOf<CmAssociationTable, CmHashAssociation>::findPair(const CmObject* key) const
{
    return lookupKey(key);
}

template <>
CmAssociation* CmDictionaryOf<CmAssociationTable, CmHashAssociation>::takePair(const CmObject* key)
{
    return takeKey(key);
}

template class CmDictionaryOf<CmAssociationTable, CmHashAssociation>;

namespace
{
bool holds(const CmAssociation* association, const CmObject* key)
{
    const CmObject* held = association->getKey();
    return held && held->isEqual(key);
}
} // namespace

CmAssociation* CmAssociationTable::lookupKey(const CmObject* key) const
{
    if (!isSearchedByKey())
    {
        const CmAssociation probe(const_cast<CmObject*>(key));
        return static_cast<CmAssociation*>(CmHashTable::lookup(&probe));
    }
    for (CmHashNode* node = bucketAt(key->hash(static_cast<unsigned>(_size))).first; node; node = node->next)
        if (CmAssociation* association = CmHashAssociation::around(node); holds(association, key))
            return association;
    return nullptr;
}

CmAssociation* CmAssociationTable::takeKey(const CmObject* key)
{
    if (!isSearchedByKey())
    {
        const CmAssociation probe(const_cast<CmObject*>(key));
        return static_cast<CmAssociation*>(takeEqual(&probe));
    }
    CmHashBucket& bucket = bucketAt(key->hash(static_cast<unsigned>(_size)));
    CmHashNode* predecessor = nullptr;
    CmHashNode* node = bucket.first;
    for (; node && !holds(CmHashAssociation::around(node), key); node = node->next)
        predecessor = node;
    if (!node)
        return nullptr;
    unlink(bucket, predecessor, node);
    node->object = nullptr;
    return CmHashAssociation::around(node);
}

CmHashNode* CmAssociationTable::makeNode(CmObject* object)
{
    // An association may stand in several dictionaries, but its own node only in one.
    CmHashNode* own = static_cast<CmAssociation*>(object)->ownNode();
    CmHashNode* node = own && !own->object ? own : CmHashTable::makeNode(object);
    if (!node)
        return nullptr;
    node->object = object;
    if (node != own)
        _apart++;
    return node;
}

void CmAssociationTable::dropNode(CmHashNode* node)
{
    if (static_cast<CmAssociation*>(node->object)->ownNode() == node)
    {
        node->object = nullptr;
        return;
    }
    _apart--;
    CmHashTable::dropNode(node);
}
