#include "services/components/fcomponentregistry.h"

#include "foundation/object/iptr.h"
#include "services/components/fcomponententry.h"

FComponentRegistry* gComponentRegistry = nullptr;

FComponentRegistry::FComponentRegistry()
{
    components.retainElements();
}

void FComponentRegistry::bringUp()
{
    if (gComponentRegistry)
        return;
    gComponentRegistry = new FComponentRegistry;
    FComponentEntry::registerAll(*gComponentRegistry);
}

bool FComponentRegistry::registerComponent(FComponentDescription* description)
{
    const IPtr<FComponentDescription> held = adopt(description);
    if (!held || !held->getClassID().isValid() || find(held->getClassID()))
        return false;
    return components.add(held);
}

bool FComponentRegistry::unregisterComponent(const FUID& uid)
{
    return components.remove(find(uid));
}

int FComponentRegistry::countComponents(const char* category) const
{
    int count = 0;
    while (getComponent(category, count))
        count++;
    return count;
}

const FComponentDescription* FComponentRegistry::getComponent(const char* category, int index) const
{
    if (index < 0)
        return nullptr;
    for (int i = 0; i < components.total(); i++)
    {
        const auto* description = static_cast<const FComponentDescription*>(components.at(i));
        if (description->isOfCategory(category) && index-- == 0)
            return description;
    }
    return nullptr;
}

const FComponentDescription* FComponentRegistry::findComponent(const FUID& uid) const
{
    return find(uid);
}

FUnknown* FComponentRegistry::createComponent(const char* category, int index) const
{
    const FComponentDescription* description = getComponent(category, index);
    return description ? description->create() : nullptr;
}

FUnknown* FComponentRegistry::createUnknownComponent(const FUID& uid, FModule** module) const
{
    const FComponentDescription* description = find(uid);
    if (module)
        *module = description ? description->getModule() : nullptr;
    return description ? description->create() : nullptr;
}

FComponentDescription* FComponentRegistry::find(const FUID& uid) const
{
    for (int i = 0; i < components.total(); i++)
    {
        auto* description = static_cast<FComponentDescription*>(components.at(i));
        if (description->getClassID() == uid)
            return description;
    }
    return nullptr;
}
