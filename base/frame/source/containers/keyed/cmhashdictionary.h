#pragma once

#include "containers/keyed/cmdictionaryof.h"
#include "containers/keyed/cmhashtable.h"

extern template class CmDictionaryOf<CmHashTable>;

/// The dictionary for text keys, found by hash. One thread at a time.
///
/// A hash function that is set gets associations.
class CmHashDictionary : public CmDictionaryOf<CmHashTable>
{
    DECLARE_CLASS(CmHashDictionary, CmHashTable)

    explicit CmHashDictionary(int size = 10) : CmDictionaryOf(size) {}
    CmHashDictionary(const CmHashDictionary& other) : CmDictionaryOf(SettingsOf{other})
    {
        CmContainer::copy(other);
    }
    CmHashDictionary& operator=(const CmHashDictionary& other) { return assign(*this, other); }
};
