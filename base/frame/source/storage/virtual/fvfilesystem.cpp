#include "storage/virtual/fvfilesystem.h"

#include "containers/sequence/cmarray.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/path/fnpath.h"
#include "storage/virtual/archivecopy.h"
#include "storage/virtual/fvfileiterator.h"
#include "storage/virtual/innerpath.h"

namespace
{
CmArray& handlers()
{
    static auto* const rows = new CmArray(0, 10);
    return *rows;
}

bool isToWrite(int flags)
{
    return (flags & (kFileWrite | kFileReadWrite)) != 0;
}

IPtr<FPath> copyOf(const FPath& path)
{
    return adopt(static_cast<FPath*>(static_cast<const CmObject&>(path).newCopy()));
}
} // namespace

void FVFileSystem::registerHandler(const FFileType* type, FVfsHandler::Factory factory)
{
    if (type && factory)
        handlers().add(new FVfsHandler(type, factory));
}

// Mounting

FVFileSystem::FVFileSystem(FFileSystem* itsTarget, bool isWritable) : target(itsTarget), writable(isWritable)
{
}

FVFileSystem::FVFileSystem(FPath* mounted, bool isWritable) : writable(isWritable)
{
    if (mounted)
        mount(*mounted);
}

FVFileSystem::~FVFileSystem() = default;

void FVFileSystem::mount(FPath& mounted)
{
    if (!mounted.isFolder())
    {
        target = mountFile(mounted);
        return;
    }
    IArchiveLookup* archives = IArchiveLookup::instance();
    target = archives ? adopt(archives->getFileSystem(&mounted)) : nullptr;
    root = target ? adopt(archives->getPath(mounted)) : copyOf(mounted);
    if (!target)
        target = gFileSystem;
}

IPtr<FFileSystem> FVFileSystem::mountFile(FPath& mounted)
{
    const FFileType& type = mounted.getFileType();
    for (int i = 0; i < handlers().total(); i++)
    {
        const auto* row = static_cast<const FVfsHandler*>(handlers().at(i));
        if (*row->getType() == type)
            return adopt(row->getFactory()(&mounted));
    }
    return nullptr;
}

bool FVFileSystem::verify() const
{
    if (!target || !root || target.get() != gFileSystem)
        return target != nullptr;
    const IPtr<FNPath> folder = FNFileSystem::getNativePathFromPath(root);
    return folder && gFileSystem->dirExists(folder);
}

// Paths

IPtr<FPath> FVFileSystem::translatePath(const FPath* path) const
{
    std::vector<FString> components;
    if (!path || !target || !InnerPath::split(*path, components))
        return nullptr;
    const FString text = InnerPath::join(components);
    if (!root && FCast(FNFileSystem, static_cast<FObject*>(target.get())))
        return adopt(new FNPath(text.text16(), path->getPathType()));
    if (!root)
        return adopt(new FPath(text.text16(), path->getPathType()));
    IPtr<FPath> inner = copyOf(*root);
    for (const FString& component : components)
        inner = InnerPath::childOf(*inner, component, FPath::kFolder);
    if (!components.empty())
        inner->setPathType(path->getPathType());
    return inner;
}

IPtr<FPath> FVFileSystem::translateToWrite(const FPath* path) const
{
    return writable ? translatePath(path) : nullptr;
}

IPtr<FPath> FVFileSystem::reverseTranslate(const FPath* inner) const
{
    if (!inner)
        return nullptr;
    FString text;
    inner->getFullPath(text);
    FString base;
    if (root)
        root->getFullPath(base);
    while (!base.isEmpty() && base.testChar16(base.length() - 1, PATH_DELIMITER))
        base.remove(base.length() - 1);
    const int baseLength = static_cast<int>(base.length());
    const bool isBelow = text.length() == base.length() || text.testChar16(base.length(), PATH_DELIMITER);
    if (baseLength > 0 && (text.compare(base, baseLength) != 0 || !isBelow))
        return nullptr;
    text.remove(0, baseLength);
    if (!text.testChar16(0, PATH_DELIMITER))
        text.insertAt(0, PATH_DELIMITER);
    IPtr<FPath> path = adopt(new FPath(text.text16(), inner->getPathType()));
    path->setVisible(inner->isVisible());
    return path;
}

// Files

FStream* FVFileSystem::createFile(FPath* path, int flags, int* error)
{
    const IPtr<FPath> inner = translateToWrite(path);
    return inner ? target->createFile(inner, flags, error) : nullptr;
}

FStream* FVFileSystem::openFile(FPath* path, int flags, int* error)
{
    const IPtr<FPath> inner = isToWrite(flags) ? translateToWrite(path) : translatePath(path);
    return inner ? target->openFile(inner, flags, error) : nullptr;
}

bool FVFileSystem::closeFile(FStream* stream)
{
    return target ? target->closeFile(stream) : FFileSystem::closeFile(stream);
}

bool FVFileSystem::removeFile(FPath* path)
{
    const IPtr<FPath> inner = translateToWrite(path);
    return inner && target->removeFile(inner);
}

bool FVFileSystem::fileExists(FPath* path)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner && target->fileExists(inner);
}

bool FVFileSystem::renameFile(FPath* path, const char16* newName)
{
    const IPtr<FPath> inner = translateToWrite(path);
    if (!inner || !target->renameFile(inner, newName))
        return false;
    path->fromString(InnerPath::textOf(*reverseTranslate(inner)).text16(), path->getPathType());
    return true;
}

bool FVFileSystem::moveFile(FPath* from, FPath* to, bool updateSource)
{
    const IPtr<FPath> source = translateToWrite(from);
    const IPtr<FPath> goal = translateToWrite(to);
    if (!source || !goal || !target->moveFile(source, goal, false))
        return false;
    if (updateSource)
        from->fromString(InnerPath::textOf(*to).text16(), to->getPathType());
    return true;
}

bool FVFileSystem::copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    if (isInArchive(from) || isInArchive(to))
        return copyAcrossArchives(from, to, hook, error);
    const IPtr<FPath> source = translatePath(from);
    const IPtr<FPath> goal = translateToWrite(to);
    return source && goal && target->copyFile(source, goal, hook, error);
}

bool FVFileSystem::getFileTimes(FPath* path, CmTime& created, CmTime& modified)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner && target->getFileTimes(inner, created, modified);
}

int64 FVFileSystem::getFileSize(FPath* path)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner ? target->getFileSize(inner) : -1;
}

int64 FVFileSystem::getFileSize(FStream* stream)
{
    return target ? target->getFileSize(stream) : -1;
}

CmObject* FVFileSystem::getFileIcon(FPath* path)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner ? target->getFileIcon(inner) : nullptr;
}

bool FVFileSystem::isBitwiseCopyable(FPath* path)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner && target->isBitwiseCopyable(inner);
}

bool FVFileSystem::makeValidName(FString& name, char16 replacement, bool trim)
{
    return target ? target->makeValidName(name, replacement, trim)
                  : FFileSystem::makeValidName(name, replacement, trim);
}

// Folders

bool FVFileSystem::createDir(FPath* path)
{
    const IPtr<FPath> inner = translateToWrite(path);
    return inner && target->createDir(inner);
}

bool FVFileSystem::changeDir(FPath* path)
{
    const IPtr<FPath> inner = translatePath(path);
    return inner && target->changeDir(inner);
}

bool FVFileSystem::getDirName(FPath* path, FString& result)
{
    return path && InnerPath::getDirName(*path, result);
}

bool FVFileSystem::removeDir(FPath* path, bool recursive)
{
    const IPtr<FPath> inner = translateToWrite(path);
    return inner && target->removeDir(inner, recursive);
}

FFileIterator* FVFileSystem::newIterator(const FPath* path, bool recursive)
{
    const IPtr<FPath> inner = translatePath(path);
    FFileIterator* walk = inner ? target->newIterator(inner, recursive) : nullptr;
    return walk ? new FVFileIterator(this, walk) : nullptr;
}

int64 FVFileSystem::countFiles(const FPath* path, bool recursive, bool withFolders, int64* bytes)
{
    const IPtr<FPath> inner = translatePath(path);
    if (inner)
        return target->countFiles(inner, recursive, withFolders, bytes);
    if (bytes)
        *bytes = 0;
    return 0;
}
