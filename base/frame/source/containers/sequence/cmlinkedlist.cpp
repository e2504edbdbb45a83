#include "containers/sequence/cmlinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

template class CmNodeList<CmLinkedNode>;

DEFINE_CLASS(CmLinkedList, CmContainer)

CmLinkedList& CmLinkedList::operator=(const CmContainer& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}

CmLinkedNode* CmNodeRules<CmLinkedNode>::before(const CmLinkedNode* node, CmLinkedNode* first)
{
    CmLinkedNode* found = first == node ? nullptr : first;
    while (found && found->next != node)
        found = found->next;
    return found;
}
