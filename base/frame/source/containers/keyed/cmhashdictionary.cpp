#include "containers/keyed/cmhashdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmAssociationTable, CmHashAssociation>;

DEFINE_CLASS(CmHashDictionary, CmHashTable)

namespace
{
/// The association's own node, if it has one.
CmHashNode* nodeOf(CmObject* association)
{
    CmHashAssociation* pair = static_cast<CmAssociation*>(association)->withNode();
    return pair ? pair->ownNode() : nullptr;
}

bool holds(const CmAssociation* association, const CmObject* key)
{
    const CmObject* held = association->getKey();
    return held && held->isEqual(key);
}
} // namespace

CmObject* CmAssociationTable::lookup(const CmAssociation* probe) const
{
    if (!isSearchedByKey())
        return CmHashTable::lookup(probe);
    const CmObject* key = probe->getKey();
    CmHashNode* node = bucketAt(key->hash(static_cast<unsigned>(_size))).first;
    while (node && !holds(CmHashAssociation::around(node), key))
        node = node->next;
    return node ? CmHashAssociation::around(node) : nullptr;
}

CmObject* CmAssociationTable::takeEqual(const CmAssociation* probe)
{
    if (!isSearchedByKey())
        return CmHashTable::takeEqual(probe);
    const CmObject* key = probe->getKey();
    CmHashBucket& bucket = bucketAt(key->hash(static_cast<unsigned>(_size)));
    CmHashNode* predecessor = nullptr;
    CmHashNode* node = bucket.first;
    for (; node && !holds(CmHashAssociation::around(node), key); node = node->next)
        predecessor = node;
    if (!node)
        return nullptr;
    unlink(bucket, predecessor, node);
    // What dropNode does for a pair's own node.
    node->object = nullptr;
    return CmHashAssociation::around(node);
}

CmHashNode* CmAssociationTable::makeNode(CmObject* object)
{
    // An association may stand in several dictionaries, but its own node only in one: it is free while it has no object.
    CmHashNode* own = nodeOf(object);
    if (own && !own->object)
    {
        own->object = object;
        return own;
    }
    CmHashNode* made = CmHashTable::makeNode(object);
    if (made)
        _apart++;
    return made;
}

void CmAssociationTable::dropNode(CmHashNode* node)
{
    if (nodeOf(node->object) == node)
    {
        node->object = nullptr;
        return;
    }
    _apart--;
    CmHashTable::dropNode(node);
}
