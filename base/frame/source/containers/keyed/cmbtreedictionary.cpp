#include "containers/keyed/cmbtreedictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmBTree>;

DEFINE_CLASS(CmBTreeDictionary, CmBTree)

CmBTreeDictionary& CmBTreeDictionary::operator=(const CmBTreeDictionary& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}
