#include "containers/sequence/cmlinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

template class CmNodeList<CmLinkedNode>;

DEFINE_CLASS(CmLinkedList, CmContainer)

CmLinkedNode* CmNodeRules<CmLinkedNode>::before(const CmLinkedNode* node, CmLinkedNode* first)
{
    return findBefore(node, first);
}
