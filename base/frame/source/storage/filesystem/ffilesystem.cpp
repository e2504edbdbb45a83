#include "storage/filesystem/ffilesystem.h"

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/path/fpath.h"
#include "storage/stream/ffilestream.h"
#include "storage/stream/uprogresshook.h"

#include <algorithm>
#include <vector>

DEFINE_ABSTRACT_CLASS(FFileSystem, CmObject)

namespace
{
constexpr size_t kCopyBlock = 65536;
constexpr unsigned kMaxNameLength = 1024;
constexpr char16 kInvalidInNames[] = u"/*?";

int errorOf(FStream* stream)
{
    const FFileStream* file = FCast(FFileStream, stream);
    return file ? file->getFirstError(true) : 0;
}
} // namespace

FStream* FFileSystem::createFile(FPath*, int, int*)
{
    return nullptr;
}

FStream* FFileSystem::openFile(FPath*, int, int*)
{
    return nullptr;
}

bool FFileSystem::closeFile(FStream* stream)
{
    if (!stream)
        return false;
    stream->flush();
    const bool isWhole = stream->verify();
    stream->release();
    return isWhole;
}

bool FFileSystem::removeFile(FPath*)
{
    return false;
}

bool FFileSystem::fileExists(FPath*)
{
    return false;
}

bool FFileSystem::renameFile(FPath*, const char16*)
{
    return false;
}

bool FFileSystem::moveFile(FPath*, FPath*, bool)
{
    return false;
}

bool FFileSystem::copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error)
{
    FStream* source = openFile(from, kFileRead | kFileShare, error);
    if (!source)
        return false;
    FStream* target = createFile(to, kFileWrite, error);
    if (!target)
    {
        closeFile(source);
        return false;
    }
    const IPtr<FStream> held(target);
    bool isWhole = copyContent(*source, *target, hook) && errorOf(source) == 0;
    const int sourceError = errorOf(source);
    closeFile(source);
    isWhole = closeFile(target) && isWhole;
    if (isWhole)
        return true;
    if (error)
        *error = sourceError ? sourceError : errorOf(held);
    removeFile(to);
    return false;
}

bool FFileSystem::copyContent(FStream& from, FStream& to, UProgressHook* hook)
{
    std::vector<char> block(kCopyBlock);
    int64 total = 0;
    for (;;)
    {
        if (hook && hook->wasCanceled())
            return false;
        const int64 count = from.readRaw(block.data(), static_cast<int64>(block.size()));
        if (count <= 0)
            return count == 0;
        if (to.writeRaw(block.data(), count) != count)
            return false;
        total += count;
        if (hook)
            hook->setValue(total / hook->getValueCompression());
    }
}

bool FFileSystem::createDir(FPath*)
{
    return false;
}

bool FFileSystem::changeDir(FPath*)
{
    return false;
}

bool FFileSystem::getDirName(FPath*, FString&)
{
    return false;
}

bool FFileSystem::removeDir(FPath*, bool)
{
    return false;
}

bool FFileSystem::getFileTimes(FPath*, CmTime&, CmTime&)
{
    return false;
}

int64 FFileSystem::getFileSize(FPath*)
{
    return -1;
}

int64 FFileSystem::getFileSize(FStream* stream)
{
    if (!stream)
        return -1;
    const int64 position = stream->tell();
    const int64 size = stream->seek(0, kSeekEnd);
    stream->seek(position, kSeekStart);
    return size;
}

CmObject* FFileSystem::getFileIcon(FPath*)
{
    return nullptr;
}

bool FFileSystem::makeValidName(FString& name, char16 replacement, bool trim)
{
    return replaceInvalid(name, replacement, trim);
}

bool FFileSystem::replaceInvalid(FString& name, char16 replacement, bool trim)
{
    const FString former(name);
    if (trim)
        name.trim();
    if (name.length() > kMaxNameLength)
        name.remove(kMaxNameLength);
    name.toWideString();
    name.replaceChars16(kInvalidInNames, replacement ? replacement : u'_');
    return !(name == former);
}

bool FFileSystem::isBitwiseCopyable(FPath*)
{
    return true;
}

FFileIterator* FFileSystem::newIterator(const FPath*, bool)
{
    return nullptr;
}

int64 FFileSystem::countFiles(const FPath* path, bool recursive, bool withFolders, int64* bytes)
{
    const IPtr<FFileIterator> walk = adopt(newIterator(path, recursive));
    int64 files = 0;
    int64 total = 0;
    if (walk)
        for (walk->first(); !walk->done(); walk->next())
        {
            const IPtr<FPath> entry = walk->current();
            if (!entry->isFolder())
                total += std::max<int64>(getFileSize(entry), 0);
            if (withFolders || !entry->isFolder())
                files++;
        }
    if (bytes)
        *bytes = total;
    return files;
}
