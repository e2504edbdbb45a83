#include "services/defaults/fdefaultpool.h"

#include "containers/sequence/cmiterator.h"
#include "services/defaults/fdefaultsbypass.h"
#include "storage/archive/fxmlarchive.h"

#include <memory>
#include <vector>

DEFINE_CLASS(FDefaultPool, CmObject)

FDefaultPool* gDefaultPool = nullptr;

DEFINE_INTERFACE_HOST(IDefaultPool, gDefaultPool)

namespace
{
constexpr const char16* kFileName = u"Defaults";
constexpr const char* kRootTag = "Defaults";
constexpr const char* kEntries = "Entries";
constexpr const char* kAutoSavers = "AutoSavers";

using Functions = std::vector<void (*)()>;

// Made by the first use: classes register during static start-up.
Functions& preSavers()
{
    static Functions functions;
    return functions;
}

Functions& postLoaders()
{
    static Functions functions;
    return functions;
}

void callAll(const Functions& functions)
{
    // By index: a function may register another.
    for (size_t i = 0; i < functions.size(); i++)
        functions[i]();
}

template <class Visit>
void forEach(const CmContainer& container, Visit visit)
{
    const std::unique_ptr<CmIterator> iterator(container.newIterator());
    while (CmObject* element = iterator->next())
        visit(element);
}
} // namespace

FDefaultPool::FDefaultPool()
{
    defaults.takeElements();
    autoSavers.retainElements();
}

FDefaultPool::~FDefaultPool() = default;

int32 FDefaultPool::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IDefaultPool::iid))
        return offerInterface<IDefaultPool>(this, object);
    if (isSameInterface(interfaceID, IDefaultPool2::iid))
        return offerInterface<IDefaultPool2>(this, object);
    if (isSameInterface(interfaceID, IDefaultPool3::iid))
        return offerInterface<IDefaultPool3>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

// Groups

FDefaults* FDefaultPool::findGroup(const char* group) const
{
    const FDefaults wanted(group, 0);
    return FCast(FDefaults, defaults.lookup(&wanted));
}

FDefaults* FDefaultPool::getDefaults(const char* group, int version, bool create)
{
    if (terminated || !group || !*group)
        return nullptr;
    FDefaults* found = findGroup(group);
    if (found && found->getVersion() == version)
        return found;
    if (found)
        defaults.removeAbs(found);
    if (!create)
        return nullptr;
    auto* made = new FDefaults(group, version);
    defaults.addSorted(made);
    return made;
}

bool FDefaultPool::removeDefaults(const char* group, int version)
{
    FDefaults* found = group ? findGroup(group) : nullptr;
    return found && found->getVersion() == version && defaults.removeAbs(found);
}

void FDefaultPool::removeAll()
{
    defaults.removeAll();
}

void FDefaultPool::terminate()
{
    terminated = true;
}

// The file

void FDefaultPool::load()
{
    if (!FDefaultsBypass::instance().isSet())
        FXmlArchive::restoreObject(kFileName, kRootTag, this, &isFileUnreadable);
}

bool FDefaultPool::save(bool callPreSavers)
{
    if (!saveEnabled)
        return false;
    if (callPreSavers)
        callAll(preSavers());
    // A file that could not be read holds settings that this pool doesn't have: they wait there for a better day.
    if (!FDefaultsBypass::instance().isSet() && !isFileUnreadable)
        FXmlArchive::storeObject(kFileName, kRootTag, this, false);
    return true;
}

void FDefaultPool::postInit()
{
    restoreAutoSavers();
    callAll(postLoaders());
    saveEnabled = true;
}

void FDefaultPool::addPreSaveFunc(void (*function)())
{
    preSavers().push_back(function);
}

void FDefaultPool::addPostLoadFunc(void (*function)())
{
    postLoaders().push_back(function);
}

bool FDefaultPool::storeAttributes(FAttributes& attributes) const
{
    forEach(defaults,
            [&](CmObject* element)
            {
                if (!static_cast<FDefaults*>(element)->isEmpty())
                    attributes.queueMember(kEntries, *element);
            });
    if (autoSavers.isEmpty())
        return true;
    auto savers = adopt(new FAttributes);
    forEach(autoSavers, [&](CmObject* saver) { savers->setMember(saver->isA(), *saver); });
    return attributes.setAttributes(kAutoSavers, savers);
}

bool FDefaultPool::restoreAttributes(FAttributes& attributes)
{
    removeAll();
    attributes.resetQueue(kEntries);
    for (int i = attributes.countQueueItems(kEntries); i > 0; i--)
    {
        auto group = adopt(new FDefaults);
        if (attributes.unqueueMember(kEntries, *group) && *group->getGroup() && !findGroup(group->getGroup()))
            defaults.addSorted(group.take());
    }
    pendingAutoSavers = attributes.getAttributes(kAutoSavers);
    return true;
}

// Auto savers

void FDefaultPool::addGlobalAutoSaver(CmObject* saver)
{
    autoSavers.add(saver);
}

void FDefaultPool::restoreAutoSavers()
{
    const IPtr<FAttributes> stored = std::move(pendingAutoSavers);
    if (stored)
        forEach(autoSavers, [&](CmObject* saver) { stored->getMember(saver->isA(), *saver); });
}
