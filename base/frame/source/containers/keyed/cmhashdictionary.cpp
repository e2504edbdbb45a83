#include "containers/keyed/cmhashdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmHashTable>;

DEFINE_CLASS(CmHashDictionary, CmHashTable)

CmHashDictionary& CmHashDictionary::operator=(const CmHashDictionary& other)
{
    if (&other == this)
        return *this;
    removeAll();
    copy(other);
    return *this;
}
