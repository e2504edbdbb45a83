#include "services/presets/ffilepreset.h"

#include "services/presets/presetfiles.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"

namespace
{
constexpr const char* kCanModify = "Can Modify";
}

FFilePreset::FFilePreset(const FNPath& file) : path(file)
{
    takeName();
}

FFilePreset::FFilePreset(const FNPath& file, CmObject* itsObject, uint32 itsFlags)
    : FPreset(nullptr, itsObject, itsFlags),
      path(file),
      isRead(true)
{
    takeName();
}

void FFilePreset::takeName()
{
    path.getNameWithoutExtension(name, false);
}

void FFilePreset::read()
{
    if (isRead)
        return;
    isRead = true;
    PresetFiles::readRoot(path, PresetFiles::kPresetRoot, this);
}

void FFilePreset::unuse()
{
    object = nullptr;
    isRead = false;
}

bool FFilePreset::resetRenamed()
{
    read();
    if (!isRenamed())
        return true;
    setFlag(kRenamed, false);
    // A file that can't be read is not written over.
    if (!object || write())
        return true;
    setFlag(kRenamed, true);
    return false;
}

bool FFilePreset::write()
{
    return PresetFiles::writeRoot(path, PresetFiles::kPresetRoot, this);
}

bool FFilePreset::remove()
{
    return gFileSystem && gFileSystem->removeFile(&path);
}

bool FFilePreset::rename(const char16* text)
{
    const FString newName = PresetFiles::fileName(text, PresetFiles::kPresetExtension);
    FNPath target(path);
    target.setName(newName.text16());
    const bool isSame = target.getName() == path.getName();
    if (!gFileSystem || (!isSame && gFileSystem->fileExists(&target)))
        return false;
    if (!isSame && !gFileSystem->renameFile(&path, newName.text16()))
        return false;
    FString shown;
    path.getNameWithoutExtension(shown, false);
    setName(shown.text16());
    return true;
}

bool FFilePreset::storeAttributes(FAttributes& attributes) const
{
    return FPreset::storeAttributes(attributes) && attributes.set(kCanModify, mayBeModified());
}

bool FFilePreset::restoreAttributes(FAttributes& attributes)
{
    const FString fileName(name);
    FPreset::restoreAttributes(attributes);
    bool canModify = mayBeModified();
    attributes.get(kCanModify, canModify);
    setFlag(kMayBeModified, canModify);
    if (!(name == fileName))
        setFlag(kRenamed, true);
    name = fileName;
    return true;
}
