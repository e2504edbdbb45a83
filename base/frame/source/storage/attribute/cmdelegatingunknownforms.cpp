#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/cmuid.h"
#include "foundation/object/fmodule.h"
#include "foundation/object/ipersistent.h"
#include "services/components/fcomponentregistry.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"

namespace
{
constexpr const char* kObjectData = "ObjData";

bool getClassID(IPersistent& persistent, CmUID& uid)
{
    char bytes[16] = {};
    if (persistent.getClassID(bytes) != kResultOk)
        return false;
    uid = bytes;
    return true;
}
} // namespace

bool CmDelegatingUnknown::externalize(FArchive& archive) const
{
    const IPtr<IPersistent> persistent = adopt(askInterface<IPersistent>(delegate));
    // The archive knows by their addresses the texts and objects that it wrote, so these stay as long as it does.
    auto* attributes = new FAttributes;
    archive.forgetLater(attributes);
    CmUID uid;
    if (!persistent || persistent->saveAttributes(attributes) != kResultOk || !::getClassID(*persistent, uid))
        return false;
    uid.externalize(archive);
    return attributes->externalize(archive);
}

bool CmDelegatingUnknown::internalize(FArchive& archive)
{
    CmUID uid;
    uid.internalize(archive);
    makeDelegate(uid);
    const IPtr<IPersistent> persistent = adopt(askInterface<IPersistent>(delegate));
    FAttributes attributes;
    return persistent && attributes.internalize(archive) &&
           persistent->loadAttributes(&attributes) == kResultOk;
}

bool CmDelegatingUnknown::storeAttributes(FAttributes& attributes) const
{
    const IPtr<IPersistent> persistent = adopt(askInterface<IPersistent>(delegate));
    CmUID uid;
    if (!persistent || !::getClassID(*persistent, uid))
        return false;
    uid.storeAttributes(attributes);
    const IPtr<FAttributes> data = adopt(new FAttributes);
    return persistent->saveAttributes(data) == kResultOk && attributes.setAttributes(kObjectData, data);
}

bool CmDelegatingUnknown::restoreAttributes(FAttributes& attributes)
{
    CmUID uid;
    if (!uid.restoreAttributes(attributes))
        return false;
    makeDelegate(uid);
    const IPtr<IPersistent> persistent = adopt(askInterface<IPersistent>(delegate));
    FAttributes* data = attributes.getAttributes(kObjectData);
    return persistent && data && persistent->loadAttributes(data) == kResultOk;
}

void CmDelegatingUnknown::makeDelegate(const FUID& uid)
{
    // The delegate's code is in its module, so it goes first.
    delegate = nullptr;
    setModule(nullptr);
    FModule* maker = nullptr;
    if (gComponentRegistry)
        delegate = adopt(gComponentRegistry->createUnknownComponent(uid, &maker));
    setModule(maker);
}
