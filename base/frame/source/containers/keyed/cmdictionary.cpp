#include "containers/keyed/cmdictionary.h"

#include "containers/keyed/cmdictionaryofbodies.h"

template class CmDictionaryOf<CmDLinkedList>;

DEFINE_CLASS(CmDictionary, CmDLinkedList)

CmObject* CmDictionary::lookupKey(const CmObject* object) const
{
    for (CmDLinkedListIterator it(*this); !it.done(); it.next())
    {
        const auto* association = static_cast<const CmAssociation*>(it.current());
        if (object && association->getObject() && association->getObject()->isEqual(object))
            return association->getKey();
    }
    return nullptr;
}
