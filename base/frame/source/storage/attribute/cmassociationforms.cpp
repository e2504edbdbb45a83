#include "containers/keyed/cmassociation.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

namespace
{
constexpr const char* kKey = "Key";
constexpr const char* kObject = "Obj";

CmObject* takeObject(const FAttributes& attributes, const char* key)
{
    CmObject* object = attributes.getObject(key, "CmObject");
    if (object)
        object->addRef();
    return object;
}
} // namespace

bool CmAssociation::externalize(FArchive& archive) const
{
    return archive.writeObject(key, true) && archive.writeObject(object, true);
}

bool CmAssociation::internalize(FArchive& archive)
{
    CmObject* restoredKey = archive.readObject("CmObject", true);
    return restorePair(restoredKey, archive.readObject("CmObject", true));
}

bool CmAssociation::storeAttributes(FAttributes& attributes) const
{
    const bool isKeySet = attributes.setObject(kKey, key);
    return attributes.setObject(kObject, object) && isKeySet;
}

bool CmAssociation::restoreAttributes(FAttributes& attributes)
{
    return restorePair(takeObject(attributes, kKey), takeObject(attributes, kObject));
}
