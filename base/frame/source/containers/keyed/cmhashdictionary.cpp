#include "containers/keyed/cmhashdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmAssociationTable, CmHashAssociation>;

DEFINE_CLASS(CmHashDictionary, CmHashTable)

CmHashNode* CmAssociationTable::makeNode(CmObject* object)
{
    // An association may stand in several dictionaries, but its own node only in one.
    CmHashNode* node = static_cast<CmAssociation*>(object)->ownNode();
    if (!node || node->object)
        return CmHashTable::makeNode(object);
    node->object = object;
    return node;
}

void CmAssociationTable::dropNode(CmHashNode* node)
{
    if (static_cast<CmAssociation*>(node->object)->ownNode() != node)
        return CmHashTable::dropNode(node);
    node->object = nullptr;
}
