#include "storage/archive/archivefiles.h"
#include "storage/archive/fbinarchive.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

// The older archive as files of the user folder.

const FFileType& FBinArchive::fileType()
{
    static const FFileType& type = registerArchiveType("bin", "DATA", "Vellamoor BIN File");
    return type;
}

bool FNewArchive::storeObject(const char16* name, const CmObject* object)
{
    FNPath path = getArchivePath(name, FNPath::kUserFolder, FBinArchive::fileType());
    if (!object || !gFileSystem || !path.isAbsolute())
        return false;
    FStream* file = gFileSystem->createFile(&path, kFileWrite, nullptr);
    if (!file)
        return false;
    bool isWritten = false;
    {
        FNewArchive archive(file, true);
        isWritten = object->externalize(archive) && archive.getLastError() == 0;
    }
    if (gFileSystem->closeFile(file) && isWritten)
        return true;
    gFileSystem->removeFile(&path);
    return false;
}

bool FNewArchive::restoreObject(const char16* name, CmObject* object)
{
    FStream* file = object ? openArchiveFile(name, kFileRead, FBinArchive::fileType()) : nullptr;
    if (!file)
        return false;
    bool isRead = false;
    {
        FNewArchive archive(file, false);
        isRead = object->internalize(archive) && archive.getLastError() == 0;
    }
    gFileSystem->closeFile(file);
    return isRead;
}

bool FNewArchive::objectArchiveExists(const char16* name)
{
    return archiveFileExists(name, FBinArchive::fileType());
}

bool FNewArchive::removeObjectArchive(const char16* name)
{
    return removeArchiveFile(name, FBinArchive::fileType());
}

bool FNewArchive::renameObjectArchive(const char16* oldName, const char16* newName)
{
    return renameArchiveFile(oldName, newName, FBinArchive::fileType());
}
