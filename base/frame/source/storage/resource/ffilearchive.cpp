#include "storage/resource/ffilearchive.h"

#include "containers/value/cmtime.h"
#include "foundation/thread/flockscope.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/resource/fconsole.h"
#include "storage/resource/ffilearchiveiterator.h"
#include "storage/stream/fbufferedstream.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/fmemorystream.h"
#include "storage/virtual/innerpath.h"

namespace
{
constexpr uint32 kBlockSize = 4096;

IPtr<FPath> copyOf(const FPath& path)
{
    return adopt(static_cast<FPath*>(static_cast<const CmObject&>(path).newCopy()));
}
} // namespace

FFileArchive::FFileArchive(const FPath* itsPath, int itsFlags) : flags(itsFlags)
{
    if (itsPath)
        path = copyOf(*itsPath);
}

FFileArchive::FFileArchive(FStream* itsSource, int itsFlags) : flags(itsFlags), source(itsSource) {}

FFileArchive::~FFileArchive()
{
    FFileArchive::close();
}

// Opening and closing

bool FFileArchive::open()
{
    if (!close())
        return false;
    if (!path)
        stream = source;
    else
        stream = adopt(openHandle(kFileRead | kFileShare));
    if (stream && (flags & kBuffered))
        stream = adopt(new FBufferedStream(stream, kBlockSize, false, nullptr));
    return stream != nullptr;
}

bool FFileArchive::close()
{
    if (openSubStreams > 0)
        return false;
    const bool isWhole = closeStream();
    root = nullptr;
    tree = nullptr;
    return isWhole;
}

bool FFileArchive::closeStream()
{
    if (!stream)
        return true;
    if (path && gFileSystem)
        return gFileSystem->closeFile(stream.take());
    stream->flush();
    const bool isWhole = stream->verify();
    stream = nullptr;
    return isWhole;
}

FStream* FFileArchive::openHandle(int mode)
{
    if (!path || !gFileSystem)
        return nullptr;
    return gFileSystem->openFile(ownCopy(*path), mode, nullptr);
}

IPtr<FPath> FFileArchive::ownCopy(const FPath& shared) const
{
    FLockScope guard(pathLock);
    return copyOf(shared);
}

// Content

FFileArchiveNode* FFileArchive::lookupNode(const FPath* inner) const
{
    std::vector<FString> components;
    if (!inner || !InnerPath::split(*inner, components))
        return nullptr;
    FFileArchiveNode* node = root;
    for (std::size_t i = 0; node && i < components.size(); i++)
        node = i + 1 < components.size() ? node->getSubFolder(components[i]) : node->getChild(components[i]);
    return node;
}

FStream* FFileArchive::openNode(const FFileArchiveNode* node)
{
    if (!node || node->isFolder())
        return nullptr;
    if (!node->getReference())
        return openSubStream(node);
    const IPtr<FPath> outside = ownCopy(*node->getReference());
    return gFileSystem ? gFileSystem->openFile(outside, kFileRead | kFileShare, nullptr) : nullptr;
}

FStream* FFileArchive::openSubStream(const FFileArchiveNode* node)
{
    if (!stream)
        return nullptr;
    // A window without a length would reach to the end of the archive.
    if (node->getDataSize() == 0)
        return new FStreamProxy(adopt(new FMemoryStream), 0, 0, kFileRead);
    if (!path || !(flags & kOwnHandles))
        return new FStreamProxy(stream, node->getDataOffset(), node->getDataSize(), kFileRead);
    const IPtr<FStream> handle = adopt(openHandle(kFileRead | kFileShare));
    if (!handle)
        return nullptr;
    return new FFileArchiveSubStream(handle, node->getDataOffset(), node->getDataSize(), this);
}

bool FFileArchive::checkUpdatedNodes(bool dropMissing)
{
    CmTime created;
    CmTime archiveTime;
    const bool isDated = path && gFileSystem && gFileSystem->getFileTimes(path, created, archiveTime);
    bool isUpdated = false;
    if (!root || !gFileSystem)
        return false;
    FFileArchiveIterator walk(this, root, true);
    for (; !walk.done(); walk.next())
    {
        auto* node = const_cast<FFileArchiveNode*>(walk.currentNode());
        FNPath* outside = node->getReference();
        if (!outside)
            continue;
        CmTime modified;
        const bool isThere = gFileSystem->getFileTimes(outside, created, modified);
        isUpdated = isUpdated || !isThere || !isDated || archiveTime.compare(&modified) < 0;
        if (!isThere && dropMissing)
            node->setReference(nullptr);
    }
    return isUpdated;
}

void FFileArchive::dumpContent(FConsole* console) const
{
    if (console && root)
        root->dump(console, 0);
}

// The contract

FStream* FFileArchive::openFile(FPath* inner, int mode, int*)
{
    const bool isToWrite = (mode & (kFileWrite | kFileReadWrite)) != 0;
    return isToWrite ? nullptr : openNode(lookupNode(inner));
}

bool FFileArchive::fileExists(FPath* inner)
{
    const FFileArchiveNode* node = lookupNode(inner);
    return node && !node->isFolder();
}

bool FFileArchive::getDirName(FPath* inner, FString& result)
{
    return inner && InnerPath::getDirName(*inner, result);
}

bool FFileArchive::getFileTimes(FPath* inner, CmTime& created, CmTime& modified)
{
    const FFileArchiveNode* node = lookupNode(inner);
    const FPath* dated = path;
    if (node && node->getReference())
        dated = node->getReference();
    return node && dated && gFileSystem && gFileSystem->getFileTimes(ownCopy(*dated), created, modified);
}

int64 FFileArchive::getFileSize(FPath* inner)
{
    const FFileArchiveNode* node = lookupNode(inner);
    if (!node || node->isFolder())
        return -1;
    if (!node->getReference())
        return node->getFileSize();
    const IPtr<FPath> outside = ownCopy(*node->getReference());
    return gFileSystem ? gFileSystem->getFileSize(outside) : -1;
}

int64 FFileArchive::getFileSize(FStream* opened)
{
    if (const auto* packed = FCast(FCompressionStream, opened))
        return packed->getUncompressedSize();
    return gFileSystem ? gFileSystem->getFileSize(opened) : FFileSystem::getFileSize(opened);
}

FFileIterator* FFileArchive::newIterator(const FPath* inner, bool recursive)
{
    const FFileArchiveNode* node = lookupNode(inner);
    return node && node->isFolder() ? new FFileArchiveIterator(this, node, recursive) : nullptr;
}

int64 FFileArchive::countFiles(const FPath* inner, bool recursive, bool withFolders, int64* bytes)
{
    const FFileArchiveNode* node = lookupNode(inner);
    uint64 total = 0;
    const int64 count = node ? node->countFiles(recursive, withFolders, &total) : 0;
    if (bytes)
        *bytes = static_cast<int64>(total);
    return count;
}
