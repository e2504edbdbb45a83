#include "storage/resource/fresourcearchive.h"
#include "storage/virtual/farchivemanager.h"
#include "storage/virtual/fvfilesystem.h"

#include <cstring>

// How resource files are known and mounted.

FFileType& qzrFileType()
{
    static auto* const type = new FFileType(nullptr, "qzr", "qzr", 0, "Vellamoor Resource File");
    return *type;
}

FFileType* checkQzrFileType(unsigned char* header, int length)
{
    const bool isOne =
        length >= kResourceHeaderSize && memcmp(header, kResourceHeader, kResourceHeaderSize) == 0;
    return isOne ? &qzrFileType() : nullptr;
}

FFileSystem* createQzrArchive(FPath* path)
{
    IPtr<FResourceArchive> archive =
        adopt(new FResourceArchive(path, FFileArchive::kOwnHandles | FFileArchive::kBuffered));
    return archive->open() ? archive.take() : nullptr;
}

void initFResourceArchive()
{
    static bool isDone = false;
    if (isDone)
        return;
    isDone = true;
    FFileType::registerType(&qzrFileType());
    FFileType::registerTypeIdentifier(checkQzrFileType);
    FVFileSystem::registerHandler(&qzrFileType(), createQzrArchive);
    // From now on file systems ask it, on whatever thread.
    FArchiveManager::instance();
}
