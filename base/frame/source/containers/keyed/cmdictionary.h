#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/sequence/cmdlinkedlist.h"

extern template class CmDictionaryOf<CmDLinkedList>;

/// A dictionary for few pairs, whose order of insertion counts. One thread at a time.
class CmDictionary : public CmDictionaryOf<CmDLinkedList>
{
    DECLARE_CLASS(CmDictionary, CmDLinkedList)

    CmDictionary() = default;
    CmDictionary(const CmDictionary& other) : CmDictionaryOf() { CmContainer::copy(other); }
    CmDictionary& operator=(const CmDictionary& other) { return assign(*this, other); }

    /// The first key whose object is equal to `object`, borrowed.
    CmObject* lookupKey(const CmObject* object) const;
};
