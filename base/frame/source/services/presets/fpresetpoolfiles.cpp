#include "services/presets/ffilepresetlist.h"
#include "services/presets/fpresetlistownfile.h"
#include "services/presets/fpresetpool.h"
#include "services/presets/presetfiles.h"
#include "storage/archive/archivefiles.h"
#include "storage/archive/fbinarchive.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/filesystem/fnfileiterator.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

#include <vector>

// The files of the pool, and when they are read and written.

FPresetPool* gPresetPool = nullptr;

namespace
{
constexpr const char16* kFolderName = u"Presets";
constexpr const char16* kMemoryFileName = u"RAMPresets.xml";
/// For a list that would get the name of that file.
constexpr const char16* kOtherFileName = u"RAMPresets-01.xml";
constexpr const char16* kOlderFileName = u"Presets2";

std::vector<void (*)()>& postLoaders()
{
    static std::vector<void (*)()> functions;
    return functions;
}

FNPath getPresetFolder(int standardFolder)
{
    return FNPath(kFolderName, standardFolder, FPath::kFolder, nullptr, false);
}

bool isArchive(const FNPath& path)
{
    FString extension;
    return path.isFile() && path.getExtension(extension) &&
           FXmlArchive::fileTypeNormal().hasExtension(extension);
}

/// Makes room for a file. One that stands there and isn't `known` couldn't be read: it is left under another name.
bool makeRoom(const FNPath& path, const FNPath& known)
{
    FNPath former(path);
    if (path == known || !gFileSystem->fileExists(&former))
        return true;
    FString name(path.getName());
    name.append(".damaged");
    FNPath aside(path);
    aside.setName(name.text16());
    return aside.uniqueName() && gFileSystem->renameFile(&former, aside.getName().text16());
}

/// The user's presets begin as a copy of those that come with the program.
void makeUserFolder()
{
    FNPath own = getPresetFolder(FNPath::kUserFolder);
    FNPath shipped = getPresetFolder(FNPath::kAppFolder);
    if (!gFileSystem || !own.isAbsolute() || gFileSystem->dirExists(&own) || !shipped.isAbsolute() ||
        !gFileSystem->dirExists(&shipped))
        return;
    // What can't be copied is missing there; the rest serves.
    (void)gFileSystem->copyFolderAndFileStructure(&shipped, &own, nullptr);
}
} // namespace

// Loading

bool FPresetPool::load(const FNPath& folder)
{
    removeAll();
    FNPath place(folder);
    if (!gFileSystem || !place.isAbsolute() || !gFileSystem->dirExists(&place))
        return false;
    const bool isRead = loadMemoryLists(folder);
    FNFileIterator walk(&folder);
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FPath> current = walk.current();
        const auto& entry = *FCast(FNPath, current.get());
        if (entry.isFolder())
            addPresetList(adopt(new FFilePresetList(entry)));
        else if (isArchive(entry) && !(entry.getName() == ConstString(kMemoryFileName)))
            loadOwnFile(entry);
    }
    return isRead || lists.total() > 0;
}

bool FPresetPool::loadMemoryLists(const FNPath& folder)
{
    const FNPath path(kMemoryFileName, &folder, FPath::kFile);
    const IPtr<CmObject> stored = PresetFiles::readGlobalRoot(path, PresetFiles::kPoolRoot, "FPresetPool");
    if (!stored)
        return false;
    memoryFile = path;
    const auto& pool = *FCast(FPresetPool, stored.get());
    for (int i = 0; i < pool.countLists(); i++)
        addPresetList(pool.getListAt(i));
    return true;
}

void FPresetPool::loadOwnFile(const FNPath& path)
{
    const IPtr<CmObject> stored = PresetFiles::readGlobalRoot(path, PresetFiles::kListRoot, "FPresetList");
    if (!stored)
        return;
    IPtr<FPresetListOwnFile> list = FCast(FPresetListOwnFile, stored.get());
    if (!list)
        list = adopt(new FPresetListOwnFile(*FCast(FPresetList, stored.get())));
    list->setFile(path);
    addPresetList(list);
}

bool FPresetPool::loadOlderFile()
{
    FNPath path = getArchivePath(kOlderFileName, FNPath::kAppFolder, FBinArchive::fileType());
    FStream* file =
        gFileSystem && path.isAbsolute() ? gFileSystem->openFile(&path, kFileRead, nullptr) : nullptr;
    if (!file)
        return false;
    bool isRead = false;
    {
        // Objects of classes that are gone are errors of the archive, but the presets around them are good.
        FNewArchive archive(file, false);
        isRead = internalize(archive);
    }
    gFileSystem->closeFile(file);
    if (!isRead)
        removeAll();
    return isRead;
}

// Saving

bool FPresetPool::save(const FNPath& folder)
{
    if (!gFileSystem || !folder.isAbsolute())
        return false;
    bool isSaved = saveMemoryLists(folder);
    for (int i = 0; i < lists.total(); i++)
        if (auto* list = FCast(FPresetListOwnFile, getListAt(i)))
            isSaved = saveOwnFile(folder, *list) && isSaved;
    return isSaved;
}

bool FPresetPool::saveMemoryLists(const FNPath& folder)
{
    FNPath path(kMemoryFileName, &folder, FPath::kFile);
    // An empty file says that there are none any more.
    if (countMemoryLists() == 0 && !gFileSystem->fileExists(&path))
        return true;
    if (!makeRoom(path, memoryFile))
        return false;
    memoryFile = path;
    return PresetFiles::writeGlobalRoot(path, PresetFiles::kPoolRoot, this);
}

bool FPresetPool::saveOwnFile(const FNPath& folder, FPresetListOwnFile& list)
{
    FNPath path(list.getFile().getName().text16(), &folder, FPath::kFile);
    if (path.getName().isEmpty())
    {
        path.setName(PresetFiles::fileName(list.getID(), PresetFiles::kArchiveExtension).text16());
        if (path.getName() == ConstString(kMemoryFileName))
            path.setName(kOtherFileName);
        if (!path.uniqueName())
            return false;
    }
    if (!makeRoom(path, list.getFile()))
        return false;
    list.setFile(path);
    return PresetFiles::writeGlobalRoot(path, PresetFiles::kListRoot, &list);
}

bool FPresetPool::removePresetList(FPresetList* list)
{
    const IPtr<FPresetList> kept = list;
    if (!lists.remove(list))
        return false;
    const auto* own = FCast(FPresetListOwnFile, list);
    // What came with the program stays.
    if (!own || !gFileSystem || !FNFileSystem::isPrivate(own->getFile()))
        return true;
    FNPath file(own->getFile());
    return !gFileSystem->fileExists(&file) || gFileSystem->removeFile(&file);
}

// With the user's settings

void FPresetPool::addPostLoadFunc(void (*function)())
{
    postLoaders().push_back(function);
}

void FPresetPool::callPostLoadFuncs()
{
    for (size_t i = 0; i < postLoaders().size(); i++)
        postLoaders()[i]();
}

void PostDefLoadFPresetPool()
{
    if (!gPresetPool)
        gPresetPool = new FPresetPool;
    PresetFiles::presetType();
    makeUserFolder();
    // Without any presets the program starts all the same.
    if (!gPresetPool->load(getPresetFolder(FNPath::kUserFolder)) &&
        !gPresetPool->load(getPresetFolder(FNPath::kAppFolder)))
        gPresetPool->loadOlderFile();
    FPresetPool::callPostLoadFuncs();
}

void PreDefSaveFPresetPool()
{
    const FNPath folder = getPresetFolder(FNPath::kUserFolder);
    // Nobody is left to be told of a failure; the earlier files then stay.
    if (gPresetPool && folder.isAbsolute())
        gPresetPool->save(folder);
}
