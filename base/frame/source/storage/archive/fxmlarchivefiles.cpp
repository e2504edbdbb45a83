#include "foundation/text/iuseralert.h"
#include "foundation/text/utranslatedstring.h"
#include "storage/archive/archivefiles.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/stream/ffilestream.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

// XML archives as files of the user folder, and how they are replaced.

namespace
{
UTranslatedString stringDoYouWantToReplace("Do you want to replace ");
UTranslatedString strReplace("Replace");
UTranslatedString strCancel("Cancel");

constexpr int kQuestion = 1;
constexpr int kReplaceButton = 1;
constexpr int kReadShared = kFileRead | kFileShare;

FNPath getUserPath(const char16* name)
{
    return getArchivePath(name, FNPath::kUserFolder, FXmlArchive::fileTypeNormal());
}

FNPath getBackupPath(const char16* name)
{
    return getArchivePath(name, FNPath::kUserFolder, FXmlArchive::fileTypeBackup());
}

bool mayReplace(const char16* name)
{
    IUserAlert* alert = IUserAlert::get();
    if (!alert)
        return false;
    FString question(stringDoYouWantToReplace.text());
    question.append(name);
    question.append("?");
    const int answer = alert->run(question.text16(), kQuestion, strReplace.text(), strCancel.text(), nullptr);
    return answer == kReplaceButton;
}

/// Where a new version grows until it is complete; no archive has a name that ends so.
FNPath getUnfinishedPath(const char16* name)
{
    FNPath path = getUserPath(name);
    FString fileName(path.getName());
    fileName.append(".new");
    path.setName(fileName.text16());
    return path;
}

/// Gives the file a second name, that of its older twin, whose path the caller gets. A rename would leave a moment
/// without any file of the first name, and a program that ends in it loses the settings. Null where it failed, as on
/// a disk without links.
FNPath* addTwin(FNPath& path, const char16* name)
{
    FString oldName(name);
    oldName.append("_old");
    auto twin = adopt(new FNPath(getUserPath(oldName.text16())));
    if (gFileSystem->fileExists(twin))
        gFileSystem->removeFile(twin);
    return gFileSystem->createLink(twin, &path) ? twin.take() : nullptr;
}

void putBack(FNPath& twin, const FNPath& path)
{
    FNPath renamed(twin);
    const bool isBack = gFileSystem->renameFile(&renamed, path.getName().text16());
    // Between two names of one file a rename does nothing.
    if (isBack && gFileSystem->fileExists(&twin))
        gFileSystem->removeFile(&twin);
}

// A disk that refuses leaves it open when the new version is there after a power loss; that it is whole, or the earlier
// one, holds all the same.
void syncFolderOf(const FNPath& path)
{
    FNPath folder(path.getPathName().text16(), FPath::kFolder);
    static_cast<void>(gFileSystem->syncFolder(&folder));
}

bool closeFile(FStream* stream)
{
    return gFileSystem->closeFile(stream);
}

/// What `read` says of the file; false without one.
template <class Read>
bool readUserFile(const char16* name, bool* isUnreadable, Read read)
{
    bool isRefused = false;
    FStream* stream = openArchiveFile(name, kReadShared, FXmlArchive::fileTypeNormal(), &isRefused);
    const bool isRead = stream && read(stream);
    const FFileStream* file = FCast(FFileStream, stream);
    if (isUnreadable)
        *isUnreadable = isRefused || (file && file->error());
    if (stream)
        closeFile(stream);
    return isRead;
}
} // namespace

const FFileType& FXmlArchive::fileTypeNormal()
{
    static const FFileType& type = registerArchiveType("xml", "TEXT", "Vellamoor XML File");
    return type;
}

const FFileType& FXmlArchive::fileTypeBackup()
{
    static const FFileType& type = registerArchiveType("xml.backup", "TEXT", "Vellamoor XML File (Backup)");
    return type;
}

// Replacing

FStream* FXmlArchive::openUserFile(const char16* name)
{
    return openArchiveFile(name, kReadShared, fileTypeNormal());
}

FStream* FXmlArchive::createUserFile(const char16* name, bool askUser, FNPath*& oldPath)
{
    oldPath = nullptr;
    FNPath path = getUserPath(name);
    if (!gFileSystem || !path.isAbsolute())
        return nullptr;
    const bool isReplacing = gFileSystem->fileExists(&path);
    if (isReplacing && askUser && !mayReplace(name))
        return nullptr;
    if (isReplacing)
        oldPath = addTwin(path, name);
    FNPath unfinished = getUnfinishedPath(name);
    FStream* stream = gFileSystem->createFile(&unfinished, kFileWrite, nullptr);
    if (!stream)
    {
        finishXmlArchiveWrite(false, name, oldPath);
        oldPath = nullptr;
    }
    return stream;
}

bool FXmlArchive::finishXmlArchiveWrite(bool success, const char16* name, FNPath* oldPath)
{
    const auto twin = adopt(oldPath);
    const FNPath path = getUserPath(name);
    FNPath unfinished = getUnfinishedPath(name);
    // What was written is on the disk by now; the rename puts it in the place of the earlier version in one step.
    const bool isReplaced = success && gFileSystem->renameFile(&unfinished, path.getName().text16());
    if (!isReplaced)
        gFileSystem->removeFile(&unfinished);
    if (twin && isReplaced)
        gFileSystem->removeFile(twin);
    else if (twin)
        putBack(*twin, path);
    if (isReplaced)
        syncFolderOf(path);
    return isReplaced;
}

// Trees and objects

bool FXmlArchive::saveAttributes(const char16* name, const char* rootTag, const FAttributes& attributes)
{
    FNPath* oldPath = nullptr;
    FStream* file = createUserFile(name, false, oldPath);
    if (!file)
        return false;
    const bool isWritten = FXmlArchive(file, true).saveAttributes(rootTag, attributes);
    const bool isWhole = closeFile(file) && isWritten;
    return finishXmlArchiveWrite(isWhole, name, oldPath);
}

bool FXmlArchive::storeObject(const char16* name, const char* rootTag, CmObject* object, bool askUser)
{
    FNPath* oldPath = nullptr;
    FStream* file = object ? createUserFile(name, askUser, oldPath) : nullptr;
    if (!file)
        return false;
    bool isWritten = false;
    {
        FXmlArchive archive(file, true);
        archive.addRoot(rootTag, object);
        isWritten = archive.save(rootTag);
    }
    const bool isWhole = closeFile(file) && isWritten;
    return finishXmlArchiveWrite(isWhole, name, oldPath);
}

bool FXmlArchive::loadAttributes(const char16* name, const char* rootTag, FAttributes& attributes,
                                 bool* isUnreadable)
{
    // A tree of its own: of a damaged file nothing is used.
    FAttributes tree;
    const auto read = [&](FStream* file) { return FXmlArchive(file, false).loadAttributes(rootTag, tree); };
    const bool isRead = readUserFile(name, isUnreadable, read);
    if (isRead)
        attributes.takeAllFrom(tree);
    return isRead;
}

bool FXmlArchive::restoreObject(const char16* name, const char* rootTag, CmObject* object, bool* isUnreadable)
{
    return readUserFile(name, isUnreadable,
                        [&](FStream* file) { return restoreObject(file, rootTag, object); });
}

// Files

bool FXmlArchive::objectArchiveExists(const char16* name)
{
    return archiveFileExists(name, fileTypeNormal());
}

bool FXmlArchive::removeObjectArchive(const char16* name)
{
    return removeArchiveFile(name, fileTypeNormal());
}

bool FXmlArchive::renameObjectArchive(const char16* oldName, const char16* newName)
{
    return renameArchiveFile(oldName, newName, fileTypeNormal());
}

bool FXmlArchive::backupObjectArchive(const char16* name)
{
    FNPath path = getUserPath(name);
    FNPath backup = getBackupPath(name);
    return gFileSystem && path.isAbsolute() && gFileSystem->copyFile(&path, &backup, nullptr, nullptr);
}

bool FXmlArchive::restoreObjectArchive(const char16* name)
{
    FNPath path = getUserPath(name);
    FNPath backup = getBackupPath(name);
    if (!gFileSystem || !backup.isAbsolute() || !gFileSystem->fileExists(&backup))
        return false;
    const bool isRemoved = gFileSystem->removeFile(&path);
    // The backup goes only when its copy is there.
    const bool isCopied = gFileSystem->copyFile(&backup, &path, nullptr, nullptr);
    return isCopied && gFileSystem->removeFile(&backup) && isRemoved;
}
