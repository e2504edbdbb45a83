#include "containers/keyed/cmassociation.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/ringguard.h"

namespace
{
constexpr const char* kKey = "Key";
constexpr const char* kObject = "Obj";
} // namespace

bool CmAssociation::externalize(FArchive& archive) const
{
    return archive.writeObject(key, true) && archive.writeObject(object, true);
}

bool CmAssociation::internalize(FArchive& archive)
{
    const RingGuard guard(*this);
    auto restoredKey = adopt(archive.readObject("CmObject", true));
    auto restoredObject = adopt(archive.readObject("CmObject", true));
    if (guard.isRing())
        restoredObject = nullptr;
    return restorePair(restoredKey.take(), restoredObject.take());
}

bool CmAssociation::storeAttributes(FAttributes& attributes) const
{
    const bool isKeySet = attributes.setObject(kKey, key);
    return attributes.setObject(kObject, object) && isKeySet;
}

bool CmAssociation::restoreAttributes(FAttributes& attributes)
{
    const RingGuard guard(*this);
    IPtr<CmObject> restoredKey = attributes.getObject(kKey, "CmObject");
    IPtr<CmObject> restoredObject = attributes.getObject(kObject, "CmObject");
    if (guard.isRing())
        restoredObject = nullptr;
    return restorePair(restoredKey.take(), restoredObject.take());
}
