#include "storage/archive/archivefiles.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fstream.h"

namespace
{
/// Whether the folders are known: otherwise the path would lead to wherever the process was started.
bool isUsable(const FNPath& path)
{
    return gFileSystem && path.isAbsolute();
}
} // namespace

FNPath getArchivePath(const char16* name, int standardFolder, const FFileType& type)
{
    FNPath path(nullptr, standardFolder, FPath::kFile, nullptr, standardFolder == FNPath::kUserFolder);
    // The type goes first: set on a name, it would replace what stands behind a dot there.
    path.setFileType(type);
    path.setName(name);
    path.updateExtension(false);
    return path;
}

bool archiveFileExists(const char16* name, const FFileType& type)
{
    FNPath path = getArchivePath(name, FNPath::kUserFolder, type);
    return isUsable(path) && gFileSystem->fileExists(&path);
}

bool removeArchiveFile(const char16* name, const FFileType& type)
{
    FNPath path = getArchivePath(name, FNPath::kUserFolder, type);
    return isUsable(path) && gFileSystem->removeFile(&path);
}

bool renameArchiveFile(const char16* oldName, const char16* newName, const FFileType& type)
{
    FNPath path = getArchivePath(oldName, FNPath::kUserFolder, type);
    const FNPath renamed = getArchivePath(newName, FNPath::kUserFolder, type);
    return isUsable(path) && gFileSystem->renameFile(&path, renamed.getName().text16());
}

FStream* openArchiveFile(const char16* name, int flags, const FFileType& type, bool* isUnreadable)
{
    for (const int folder : {FNPath::kUserFolder, FNPath::kAppFolder})
    {
        FNPath path = getArchivePath(name, folder, type);
        int error = 0;
        if (FStream* stream = isUsable(path) ? gFileSystem->openFile(&path, flags, &error) : nullptr)
            return stream;
        if (isUnreadable && folder == FNPath::kUserFolder)
            *isUnreadable =
                error != 0 && FNFileSystem::fromPlatformErrorCode(error) != FNFileSystem::kNotFound;
    }
    return nullptr;
}

const FFileType& registerArchiveType(const char* extension, const char (&macType)[5], const char* typeName)
{
    auto* type = new FFileType(nullptr, extension, extension, fourCharCode(macType), typeName);
    FFileType::registerType(type);
    return *type;
}
