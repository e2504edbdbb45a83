#include "containers/sequence/cmdlinkedlist.h"

#include "containers/sequence/cmnodelistbodies.h"

template class CmNodeList<CmDLinkedNode>;

DEFINE_CLASS(CmDLinkedList, CmContainer)

CmDLinkedList& CmDLinkedList::operator=(const CmContainer& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}
