#include "services/presets/fpresetlist.h"

#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/ringguard.h"

#include <algorithm>

DEFINE_CLASS(FPresetList, FPresetItem)

namespace
{
constexpr const char* kID = "ID";
constexpr const char* kName = "Name";
constexpr const char* kItems = "Items";
constexpr const char* kOlderPresets = "Presets";
constexpr const char* kOlderSubLists = "SubLists";

template <class Item>
Item* itemAt(const std::vector<Item*>& list, int index)
{
    return index >= 0 && index < static_cast<int>(list.size()) ? list[static_cast<size_t>(index)] : nullptr;
}

/// The index of the first item of that name; -1 where there is none.
template <class Item>
int findByName(const std::vector<Item*>& list, const ConstString& name)
{
    const auto place = std::find_if(list.begin(), list.end(),
                                    [&](const Item* item) { return ConstString(item->getName()) == name; });
    return place == list.end() ? -1 : static_cast<int>(place - list.begin());
}
} // namespace

FPresetList::FPresetList() : FPresetList(nullptr) {}

FPresetList::FPresetList(const char16* listID, const char16* listName)
    : name(listName ? listName : listID),
      id(listID)
{
    items.takeElements();
}

FPresetList::FPresetList(const FPresetList& other) : FPresetItem(other), name(other.name), id(other.id)
{
    items.takeElements();
    for (int i = 0; i < other.items.total(); i++)
        addItem(adopt(static_cast<FPresetItem*>(other.items.at(i)->newCopy())));
}

FPresetList::~FPresetList()
{
    removeAll();
}

// Items

bool FPresetList::isWithin(const FPresetItem* item) const
{
    for (const FPresetList* list = this; list; list = list->getOwner())
        if (list == item)
            return true;
    return false;
}

bool FPresetList::addItem(const IPtr<FPresetItem>& item)
{
    if (!item || item->owner || isWithin(item) || !items.add(item))
        return false;
    item->addRef();
    item->owner = this;
    if (auto* preset = FCast(FPreset, item.get()))
        presets.push_back(preset);
    else if (auto* list = FCast(FPresetList, item.get()))
        subLists.push_back(list);
    return true;
}

bool FPresetList::removeItem(FPresetItem* item)
{
    const IPtr<FPresetItem> kept = item;
    if (!items.remove(item))
        return false;
    item->owner = nullptr;
    std::erase(presets, item);
    std::erase(subLists, item);
    return true;
}

void FPresetList::removeAll()
{
    for (int i = 0; i < items.total(); i++)
        static_cast<FPresetItem*>(items.at(i))->owner = nullptr;
    presets.clear();
    subLists.clear();
    items.removeAll();
}

// Presets

int FPresetList::countPresets()
{
    prepare();
    return static_cast<int>(presets.size());
}

FPreset* FPresetList::getPreset(int index)
{
    prepare();
    return itemAt(presets, index);
}

int FPresetList::findPreset(const char16* presetName)
{
    prepare();
    return findByName(presets, presetName);
}

const char16* FPresetList::getPresetName(int index)
{
    const FPreset* preset = getPreset(index);
    return preset ? preset->getName() : nullptr;
}

CmObject* FPresetList::getPresetObject(int index)
{
    const FPreset* preset = getPreset(index);
    return preset ? preset->getObject() : nullptr;
}

bool FPresetList::setPresetName(int index, const char16* presetName)
{
    FPreset* preset = getPreset(index);
    if (preset)
        preset->setName(presetName);
    return preset != nullptr;
}

bool FPresetList::canModifiyPreset(int index)
{
    const FPreset* preset = getPreset(index);
    return preset && preset->mayBeModified();
}

bool FPresetList::presetRenamed(int index)
{
    const FPreset* preset = getPreset(index);
    return preset && preset->isRenamed();
}

bool FPresetList::resetRenameState(int index)
{
    FPreset* preset = getPreset(index);
    if (preset)
        preset->setFlag(FPreset::kRenamed, false);
    return preset != nullptr;
}

int FPresetList::addPreset(CmObject* object, const char16* presetName, bool mayBeModified, bool isRenamed)
{
    if (!object)
        return -1;
    auto preset = adopt(new FPreset(presetName, object, 0));
    preset->setFlag(FPreset::kMayBeModified, mayBeModified);
    preset->setFlag(FPreset::kRenamed, isRenamed);
    return addItem(preset) ? countPresets() - 1 : -1;
}

bool FPresetList::removePresetAt(int index)
{
    FPreset* preset = getPreset(index);
    return preset && removeItem(preset);
}

void FPresetList::removeNonModifyPresets()
{
    for (int i = countPresets() - 1; i >= 0; i--)
        if (!canModifiyPreset(i))
            removePresetAt(i);
}

int FPresetList::collectPresetObjects(CmContainer& result)
{
    int collected = 0;
    for (int i = 0, count = countPresets(); i < count; i++)
    {
        CmObject* object = getPresetObject(i);
        if (!object || !result.add(object))
            continue;
        // Such a container took over a reference that it wasn't given.
        if (result.getOwnership() == CmContainer::kTaken)
            object->addRef();
        collected++;
    }
    for (int i = 0, count = countSubLists(); i < count; i++)
        collected += getSubList(i)->collectPresetObjects(result);
    return collected;
}

// Lists below this one

int FPresetList::countSubLists()
{
    prepare();
    return static_cast<int>(subLists.size());
}

FPresetList* FPresetList::getSubList(int index)
{
    prepare();
    return itemAt(subLists, index);
}

FPresetList* FPresetList::getSubListByName(const char16* listName)
{
    prepare();
    return itemAt(subLists, findByName(subLists, listName));
}

FPresetList* FPresetList::addSubList(const char16* listName)
{
    if (FPresetList* present = getSubListByName(listName))
        return present;
    auto list = adopt(new FPresetList(listName));
    return addItem(list) ? list.get() : nullptr;
}

// Storage

bool FPresetList::storeAttributes(FAttributes& attributes) const
{
    attributes.set(kID, id);
    attributes.set(kName, name);
    for (int i = 0; i < items.total(); i++)
        attributes.queueObject(kItems, items.at(i)->newCopy(), true);
    return true;
}

bool FPresetList::restoreAttributes(FAttributes& attributes)
{
    removeAll();
    if (!attributes.get(kID, id))
        return false;
    if (!attributes.get(kName, name))
        name = id;
    const RingGuard guard(*this);
    attributes.resetQueue(kItems);
    while (const auto stored = adopt(attributes.unqueueObject(kItems, "FPresetItem")))
        if (!guard.isRing())
            addItem(static_cast<FPresetItem*>(stored.get()));
    if (!items.isEmpty())
        return true;
    restoreMembers<FPreset>(attributes, kOlderPresets, guard);
    restoreMembers<FPresetList>(attributes, kOlderSubLists, guard);
    return true;
}

/// The older form of the items: trees in a queue for each kind.
template <class Item>
void FPresetList::restoreMembers(FAttributes& attributes, const char* key, const RingGuard& guard)
{
    attributes.resetQueue(key);
    for (int i = attributes.countQueueItems(key); i > 0; i--)
    {
        auto item = adopt(new Item);
        if (attributes.unqueueMember(key, *item) && !guard.isRing())
            addItem(item);
    }
}

bool FPresetList::externalize(FArchive& archive) const
{
    if (!id.externalize(archive) || !name.externalize(archive) || !archive.writeCount(items.total()))
        return false;
    for (int i = 0; i < items.total(); i++)
        if (!archive.writeObject(items.at(i), true))
            return false;
    return true;
}

bool FPresetList::internalize(FArchive& archive)
{
    removeAll();
    int count = 0;
    if (!id.internalize(archive) || !name.internalize(archive) || !archive.readCount(count))
        return false;
    const RingGuard guard(*this);
    for (int i = 0; i < count; i++)
    {
        const auto item = adopt(archive.readObject("FPresetItem", true));
        if (!item || guard.isRing())
            return false;
        addItem(static_cast<FPresetItem*>(item.get()));
    }
    return true;
}
