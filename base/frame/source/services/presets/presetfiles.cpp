#include "services/presets/presetfiles.h"

#include "storage/archive/fxmlarchive.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

namespace
{
constexpr char16 kReplacement = u'_';
/// A name that is taken gets a number, for which the longest ones have room.
constexpr const char* kRoomForNumber = "-9999";
/// Has another extension than what is read.
constexpr const char16* kUnfinished = u"Presets.tmp";

using AddRoot = void (FXmlArchive::*)(const char* name, CmObject* object);

bool write(const FNPath& path, AddRoot addRoot, const char* rootName, CmObject* object)
{
    FNPath unfinished(path);
    unfinished.setName(kUnfinished);
    FStream* file =
        gFileSystem && object ? gFileSystem->createFile(&unfinished, kFileWrite, nullptr) : nullptr;
    if (!file)
        return false;
    bool isWritten = false;
    {
        FXmlArchive archive(file, true);
        (archive.*addRoot)(rootName, object);
        isWritten = archive.save(PresetFiles::kRootTag);
    }
    const bool isWhole = gFileSystem->closeFile(file) && isWritten;
    if (isWhole && gFileSystem->renameFile(&unfinished, path.getName().text16()))
        return true;
    gFileSystem->removeFile(&unfinished);
    return false;
}

FStream* open(const FNPath& path)
{
    FNPath file(path);
    // A device, to which a link may lead, has no size and perhaps no end.
    const bool hasContent = gFileSystem && gFileSystem->getFileSize(&file) > 0;
    return hasContent ? gFileSystem->openFile(&file, kFileRead | kFileShare, nullptr) : nullptr;
}
} // namespace

const FFileType& PresetFiles::presetType()
{
    static const FFileType& type = []() -> const FFileType&
    {
        auto* made = new FFileType(nullptr, kPresetExtension, kPresetExtension, 0, "Vellamoor Preset File");
        FFileType::registerType(made);
        return *made;
    }();
    return type;
}

bool PresetFiles::writeGlobalRoot(const FNPath& path, const char* rootName, CmObject* object)
{
    return write(path, &FXmlArchive::addGlobalRoot, rootName, object);
}

bool PresetFiles::writeRoot(const FNPath& path, const char* rootName, CmObject* object)
{
    return write(path, &FXmlArchive::addRoot, rootName, object);
}

IPtr<CmObject> PresetFiles::readGlobalRoot(const FNPath& path, const char* rootName, const char* className)
{
    FStream* file = open(path);
    if (!file)
        return nullptr;
    IPtr<CmObject> object;
    {
        FXmlArchive archive(file, false);
        if (archive.load(kRootTag))
            object = archive.getGlobalRoot(rootName, className);
    }
    gFileSystem->closeFile(file);
    return object;
}

bool PresetFiles::readRoot(const FNPath& path, const char* rootName, CmObject* object)
{
    FStream* file = open(path);
    if (!file)
        return false;
    bool isRestored = false;
    {
        FXmlArchive archive(file, false);
        const bool isRead = archive.load(kRootTag);
        auto* tree = isRead ? FCast(FAttributes, archive.getRoot(rootName, "FAttributes")) : nullptr;
        isRestored = tree && object->restoreAttributes(*tree);
        file->rewind();
        // Some files have the name of the root as their root tag.
        isRestored = isRestored || (!isRead && FXmlArchive::restoreObject(file, rootName, object));
    }
    gFileSystem->closeFile(file);
    return isRestored;
}

FString PresetFiles::validName(const char16* text)
{
    FString result(text);
    if (gFileSystem)
        gFileSystem->makeValidFileName(result, kReplacement, true);
    return result;
}

FString PresetFiles::fileName(const char16* text, const char* extension)
{
    FString result = validName(text);
    result.append(u'.').append(extension).append(kRoomForNumber);
    FNFileSystem::makeSystemName(result);
    result.remove(result.length() - ConstString(kRoomForNumber).length());
    return result;
}
