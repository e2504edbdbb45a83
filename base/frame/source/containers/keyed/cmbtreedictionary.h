#pragma once

#include "containers/keyed/cmbtree.h"
#include "containers/keyed/cmdictionaryof.h"

extern template class CmDictionaryOf<CmBTree>;

/// The dictionary that is read in the order of its keys. One thread at a time.
class CmBTreeDictionary : public CmDictionaryOf<CmBTree>
{
    DECLARE_CLASS(CmBTreeDictionary, CmBTree)

    explicit CmBTreeDictionary(int order = kDefaultOrder) : CmDictionaryOf(order) {}
    CmBTreeDictionary(const CmBTreeDictionary& other) : CmDictionaryOf(other.getOrder())
    {
        CmContainer::copy(other);
    }
    CmBTreeDictionary& operator=(const CmBTreeDictionary& other) { return assign(*this, other); }
};
