#include "services/presets/fpresetpool.h"

#include "services/presets/ffilepresetlist.h"
#include "services/presets/fpresetlistownfile.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/ringguard.h"

DEFINE_CLASS(FPresetPool, CmObject)

namespace
{
constexpr const char* kLists = "Lists";

/// Whether the list is kept with the others in memory.
bool isInMemory(const FPresetList& list)
{
    return !FCast(FFilePresetList, &list) && !FCast(FPresetListOwnFile, &list);
}
} // namespace

FPresetPool::FPresetPool()
{
    lists.retainElements();
}

FPresetList* FPresetPool::getListAt(int index) const
{
    return static_cast<FPresetList*>(lists.at(index));
}

FPresetList* FPresetPool::getPresetList(const char16* id) const
{
    for (int i = 0; i < lists.total(); i++)
        if (ConstString(getListAt(i)->getID()) == ConstString(id))
            return getListAt(i);
    return nullptr;
}

bool FPresetPool::addPresetList(FPresetList* list)
{
    return list && !lists.containsAbs(list) && lists.add(list);
}

bool FPresetPool::removeFilePreset(FFilePresetList* list)
{
    return lists.remove(list);
}

void FPresetPool::removeAll()
{
    lists.removeAll();
}

int FPresetPool::countMemoryLists() const
{
    int count = 0;
    for (int i = 0; i < lists.total(); i++)
        count += isInMemory(*getListAt(i)) ? 1 : 0;
    return count;
}

// Storage

bool FPresetPool::storeAttributes(FAttributes& attributes) const
{
    for (int i = 0; i < lists.total(); i++)
        if (isInMemory(*getListAt(i)))
            attributes.queueMember(kLists, *getListAt(i));
    return true;
}

bool FPresetPool::restoreAttributes(FAttributes& attributes)
{
    removeAll();
    const RingGuard guard(*this);
    attributes.resetQueue(kLists);
    for (int i = attributes.countQueueItems(kLists); i > 0; i--)
    {
        auto list = adopt(new FPresetList);
        if (attributes.unqueueMember(kLists, *list) && !guard.isRing())
            addPresetList(list);
    }
    return true;
}

bool FPresetPool::externalize(FArchive& archive) const
{
    if (!archive.writeCount(countMemoryLists()))
        return false;
    for (int i = 0; i < lists.total(); i++)
        if (isInMemory(*getListAt(i)) && !archive.writeObject(getListAt(i), true))
            return false;
    return true;
}

bool FPresetPool::internalize(FArchive& archive)
{
    removeAll();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    const RingGuard guard(*this);
    for (int i = 0; i < count; i++)
    {
        auto list = adopt(archive.readObject("FPresetList", true));
        if (!list || guard.isRing())
            return false;
        addPresetList(FCast(FPresetList, list.get()));
    }
    return true;
}
