#include "services/presets/storedobject.h"

#include "foundation/object/classfactory.h"
#include "storage/attribute/fxmlinstance.h"
#include "storage/attribute/fxmlreference.h"

namespace
{
/// An unmade object, of which this program can't make one. Asking it for the object would throw its tree away.
FXmlInstance* findUnknown(CmObject* stored)
{
    auto* placeholder = FCast(FXmlObject, stored);
    FXmlInstance* instance = placeholder ? placeholder->getInstance() : nullptr;
    if (!instance || !instance->getStoredAttributes())
        return nullptr;
    const ClassFactory* factory = ClassFactory::instance(false);
    const bool isKnown = factory && factory->getMetaClassByName(instance->getClassName());
    return isKnown ? nullptr : instance;
}
} // namespace

IPtr<CmObject> keepStoredObject(CmObject* stored)
{
    if (FXmlInstance* unknown = findUnknown(stored))
    {
        // Whoever holds the stored form of what leads to the holder is never released.
        const auto* reference = FCast(FXmlReference, stored);
        return unknown->leadsBack() || (reference && !reference->countsTarget()) ? nullptr : unknown;
    }
    return resolveObject(stored, nullptr);
}

CmObject* resolveKeptObject(CmObject* kept)
{
    return findUnknown(kept) ? nullptr : resolveObject(kept, nullptr);
}
