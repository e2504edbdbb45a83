#include "containers/keyed/cmassociation.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

namespace
{
constexpr const char* kKey = "Key";
constexpr const char* kObject = "Obj";

// With a reference for the container that will own the association's parts.
CmObject* takeObject(const FAttributes& attributes, const char* key)
{
    CmObject* object = attributes.getObject(key, "CmObject");
    if (object)
        object->addRef();
    return object;
}

// Half a pair is given back.
bool keepPair(CmObject*& key, CmObject*& object)
{
    if (key && object)
        return true;
    for (CmObject** half : {&key, &object})
    {
        if (*half)
            (*half)->release();
        *half = nullptr;
    }
    return false;
}
} // namespace

bool CmAssociation::externalize(FArchive& archive) const
{
    return archive.writeObject(key, true) && archive.writeObject(object, true);
}

bool CmAssociation::internalize(FArchive& archive)
{
    key = archive.readObject("CmObject", true);
    object = archive.readObject("CmObject", true);
    return keepPair(key, object);
}

bool CmAssociation::storeAttributes(FAttributes& attributes) const
{
    const bool isKeySet = attributes.setObject(kKey, key);
    return attributes.setObject(kObject, object) && isKeySet;
}

bool CmAssociation::restoreAttributes(FAttributes& attributes)
{
    key = takeObject(attributes, kKey);
    object = takeObject(attributes, kObject);
    return keepPair(key, object);
}
