#include "services/presets/ffilepresetlist.h"

#include "services/presets/ffilepreset.h"
#include "services/presets/presetfiles.h"
#include "storage/filesystem/fnfileiterator.h"
#include "storage/filesystem/fnfilesystem.h"

#include <algorithm>

namespace
{
bool comesBefore(const IPtr<FPresetItem>& left, const IPtr<FPresetItem>& right)
{
    return ConstString(left->getName()).naturalCompare(right->getName(), kCaseInsensitive) < 0;
}

/// What a folder's entry is in the list; null where it is nothing.
IPtr<FPresetItem> makeItem(FNPath& entry)
{
    if (entry.isFolder())
        return adopt(new FFilePresetList(entry));
    FString extension;
    // A link may lead to a preset, but not to a folder, which could be one above.
    if (!entry.getExtension(extension) || !PresetFiles::presetType().hasExtension(extension))
        return nullptr;
    entry.setPathType(FPath::kFile);
    return adopt(new FFilePreset(entry));
}
} // namespace

FFilePresetList::FFilePresetList(const FNPath& itsFolder)
    : FPresetList(itsFolder.getName().text16()),
      folder(itsFolder)
{
    folder.setPathType(FPath::kFolder);
}

FFilePresetList::FFilePresetList(const FFilePresetList& other)
    : FPresetList(other.getID(), other.getName()),
      folder(other.folder)
{
}

void FFilePresetList::prepare()
{
    if (isPrepared)
        return;
    isPrepared = true;
    std::vector<IPtr<FPresetItem>> found;
    FNFileIterator walk(&folder);
    for (walk.first(); !walk.done(); walk.next())
        if (const IPtr<FPresetItem> item = makeItem(*FCast(FNPath, walk.current().get())))
            found.push_back(item);
    std::stable_sort(found.begin(), found.end(), comesBefore);
    for (const IPtr<FPresetItem>& item : found)
        addItem(item);
}

void FFilePresetList::unuse()
{
    for (FPreset* preset : getPresets())
        static_cast<FFilePreset*>(preset)->unuse();
    for (FPresetList* list : getSubLists())
        static_cast<FFilePresetList*>(list)->unuse();
}

// Presets

FFilePreset* FFilePresetList::filePreset(int index)
{
    return static_cast<FFilePreset*>(getPreset(index));
}

FFilePreset* FFilePresetList::readPreset(int index)
{
    FFilePreset* preset = filePreset(index);
    if (preset)
        preset->read();
    return preset;
}

CmObject* FFilePresetList::getPresetObject(int index)
{
    readPreset(index);
    return FPresetList::getPresetObject(index);
}

bool FFilePresetList::canModifiyPreset(int index)
{
    readPreset(index);
    return FPresetList::canModifiyPreset(index);
}

bool FFilePresetList::presetRenamed(int index)
{
    readPreset(index);
    return FPresetList::presetRenamed(index);
}

bool FFilePresetList::resetRenameState(int index)
{
    FFilePreset* preset = filePreset(index);
    return preset && preset->resetRenamed();
}

bool FFilePresetList::setPresetName(int index, const char16* presetName)
{
    FFilePreset* preset = filePreset(index);
    return preset && preset->rename(presetName);
}

int FFilePresetList::addPreset(CmObject* object, const char16* presetName, bool mayBeModified, bool isRenamed)
{
    prepare();
    const FString fileName = PresetFiles::fileName(presetName, PresetFiles::kPresetExtension);
    FNPath path(fileName.text16(), &folder, FPath::kFile);
    if (!object || !path.uniqueName())
        return -1;
    const uint32 flags =
        (mayBeModified ? FPreset::kMayBeModified : 0u) | (isRenamed ? FPreset::kRenamed : 0u);
    auto preset = adopt(new FFilePreset(path, object, flags));
    return preset->write() && addItem(preset) ? countPresets() - 1 : -1;
}

bool FFilePresetList::removePresetAt(int index)
{
    FFilePreset* preset = filePreset(index);
    return preset && preset->remove() && removeItem(preset);
}

FPresetList* FFilePresetList::addSubList(const char16* listName)
{
    const FString valid = PresetFiles::validName(listName);
    if (FPresetList* present = getSubListByName(valid.text16()))
        return present;
    FNPath path(valid.text16(), &folder, FPath::kFolder);
    if (!gFileSystem || !gFileSystem->createDir(&path))
        return nullptr;
    auto list = adopt(new FFilePresetList(path));
    return addItem(list) ? list.get() : nullptr;
}

// Storage

bool FFilePresetList::storeAttributes(FAttributes&) const
{
    return false;
}

bool FFilePresetList::restoreAttributes(FAttributes&)
{
    return false;
}

bool FFilePresetList::internalize(FArchive&)
{
    return false;
}

bool FFilePresetList::externalize(FArchive&) const
{
    return false;
}
