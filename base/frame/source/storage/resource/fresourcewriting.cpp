#include "storage/filesystem/ffileiterator.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/resource/archivename.h"
#include "storage/resource/farchiveprogress.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/ffilestream.h"
#include "storage/virtual/innerpath.h"

// Writing new resource files and rebuilding present ones.

namespace
{
/// A file that can't be read to its end looks like a short one.
bool hasFailed(const FStream& source)
{
    const FFileStream* onDisk = FCast(FFileStream, static_cast<const FObject*>(&source));
    return onDisk && onDisk->error();
}
} // namespace

// Beginning and giving up

bool FResourceArchive::create(int createFlags, const FUID* compression)
{
    if (!close())
        return false;
    leftOut.clear();
    if ((createFlags & kCompressContent) && !makeCompressionEngine(compression))
    {
        warnOfCompression();
        return false;
    }
    if (!openToWrite())
    {
        forget();
        return false;
    }
    stream->setByteOrder(0);
    root = adopt(new FResourceEntry(u"", FResourceEntry::kFolder)).get();
    isWriting = true;
    if (stream->writeString8(kResourceHeader, false))
        return true;
    abandon();
    return false;
}

bool FResourceArchive::openToWrite()
{
    if (path && gFileSystem)
        stream = adopt(gFileSystem->createFile(path, kFileRead | kFileWrite | kFileShare, nullptr));
    else if (!path)
        stream = source;
    if (stream)
        stream->rewind();
    return stream != nullptr;
}

void FResourceArchive::abandon()
{
    isWriting = false;
    close();
    if (path && gFileSystem)
        gFileSystem->removeFile(path);
}

// From a folder

bool FResourceArchive::create(FPath* folder, short createFlags, UProgressHook* hook, const FUID* compression,
                              float itsQuality)
{
    const IPtr<FNPath> native = FNFileSystem::getNativePathFromPath(folder);
    if (!native || !gFileSystem || !gFileSystem->dirExists(native))
        return false;
    int64 bytes = 0;
    gFileSystem->countFiles(native, true, false, &bytes);
    if (!create(createFlags, compression))
        return false;
    quality = itsQuality;
    FArchiveProgress progress(hook, bytes);
    if (!addFolder(native, static_cast<FResourceEntry&>(*root), progress))
    {
        abandon();
        return false;
    }
    if (close())
        return true;
    abandon();
    return false;
}

bool FResourceArchive::addFolder(FPath* folder, FResourceEntry& into, FArchiveProgress& progress, int depth)
{
    FFileArchiveNode::Children added;
    if (!folder || depth > kMaxDepth || !collect(*folder, added))
        return false;
    for (const IPtr<FFileArchiveNode>& child : added)
        into.appendChild(child);
    into.sortChildren();
    for (const IPtr<FFileArchiveNode>& child : added)
    {
        if (progress.wasCanceled())
            return false;
        auto& entry = static_cast<FResourceEntry&>(*child);
        const int type = entry.isFolder() ? FPath::kFolder : FPath::kFile;
        const IPtr<FPath> place = InnerPath::childOf(*folder, entry.getName(), type);
        const bool isAdded = entry.isFolder() ? addFolder(place, entry, progress, depth + 1)
                                              : addFile(*place, entry, progress);
        if (!isAdded)
            return false;
    }
    return true;
}

// Makes entries of what is in the folder, in their order. What is a link or no plain file shows in its size.
bool FResourceArchive::collect(FPath& folder, FFileArchiveNode::Children& found)
{
    const IPtr<FFileIterator> walk = adopt(gFileSystem->newIterator(&folder, false));
    if (!walk)
        return false;
    for (walk->first(); !walk->done(); walk->next())
    {
        const IPtr<FPath> place = walk->current();
        const bool isFolder = place->isFolder();
        if (path && *place == *path)
            continue;
        const bool isTaken = ArchiveName::isSafe(place->getName()) &&
                             ArchiveName::isStorable(place->getName()) &&
                             (isFolder || gFileSystem->getFileSize(place) >= 0);
        if (isTaken)
            found.push_back(adopt(new FResourceEntry(place->getName(), isFolder ? FResourceEntry::kFolder
                                                                                : FResourceEntry::kFile))
                                .get());
        else
            leftOut.add(InnerPath::textOf(*place));
    }
    FFileArchiveNode::sort(found);
    return true;
}

bool FResourceArchive::addFile(FPath& file, FResourceEntry& entry, FArchiveProgress& progress)
{
    const IPtr<FStream> content = adopt(gFileSystem->openFile(&file, kFileRead | kFileShare, nullptr));
    return content && copyInto(*content, *stream, entry, progress.nextFile(entry.getName()));
}

bool FResourceArchive::copyInto(FStream& from, FStream& to, FResourceEntry& entry, UProgressHook* hook)
{
    const int64 start = to.tell();
    const int64 sourceStart = from.tell();
    entry.setDataOffset(start);
    if (engine && copyCompressed(from, to, entry, hook))
        return !hasFailed(from);
    if (hook && hook->wasCanceled())
        return false;
    if (from.seek(sourceStart, kSeekStart) != sourceStart || to.seek(start, kSeekStart) != start ||
        !copyContent(from, to, hook))
        return false;
    entry.setPlain(to.tell() - start);
    return !hasFailed(from);
}

// False also where it would be no smaller.
bool FResourceArchive::copyCompressed(FStream& from, FStream& to, FResourceEntry& entry, UProgressHook* hook)
{
    int64 plainSize = 0;
    {
        // What is left in the compressor is written at the end of its stream.
        const IPtr<FCompressionStream> packed = adopt(new FCompressionStream(&to, engine));
        if (!packed->beginCompress(quality) || !copyContent(from, *packed, hook))
            return false;
        plainSize = packed->tell();
    }
    const int64 storedSize = to.tell() - entry.getDataOffset();
    if (storedSize >= plainSize)
        return false;
    entry.setCompressed(storedSize, plainSize);
    return true;
}

// Rebuilding

bool FResourceArchive::compact(int createFlags, const FUID* compression, UProgressHook* hook)
{
    const IPtr<FNPath> native = FNFileSystem::getNativePathFromPath(path);
    if (!native || !gFileSystem || !root || isWriting || hasOpenStreams() || damage > 0)
        return false;
    // The file is replaced where it is, and not a link to it.
    FNPath goal(*native);
    if (!gFileSystem->checkResolveLink(&goal))
        return false;
    FNPath place(goal);
    if (!place.uniqueName())
        return false;
    uint64 bytes = 0;
    root->countFiles(true, false, &bytes);
    FArchiveProgress progress(hook, static_cast<int64>(bytes));
    const IPtr<FResourceArchive> rebuilt = adopt(new FResourceArchive(&place, 0));
    rebuilt->quality = quality;
    if (!rebuilt->create(createFlags, compression))
        return false;
    // Before any content is in it: nobody else may read that meanwhile.
    if (!gFileSystem->copyRights(&goal, &place) ||
        !compactFolder(*root, *rebuilt, static_cast<FResourceEntry&>(*rebuilt->root), progress) ||
        !rebuilt->close())
    {
        rebuilt->abandon();
        return false;
    }
    return exchange(place, goal);
}

bool FResourceArchive::compactFolder(const FFileArchiveNode& from, FResourceArchive& target,
                                     FResourceEntry& to, FArchiveProgress& progress)
{
    for (const IPtr<FFileArchiveNode>& child : from.getChildren())
    {
        const bool isFolder = child->isFolder();
        const IPtr<FResourceEntry> entry = adopt(
            new FResourceEntry(child->getName(), isFolder ? FResourceEntry::kFolder : FResourceEntry::kFile));
        to.appendChild(entry);
        if (isFolder)
        {
            if (!compactFolder(*child, target, *entry, progress))
                return false;
            continue;
        }
        const IPtr<FStream> content = adopt(openNode(child));
        if (!content ||
            !target.copyInto(*content, *target.stream, *entry, progress.nextFile(child->getName())))
            return false;
        if (!child->getReference() && entry->getFileSize() != child->getFileSize())
            return false;
    }
    return true;
}

bool FResourceArchive::exchange(FNPath& rebuilt, FNPath& former)
{
    // The former file stays open until the other has its name: nothing is lost where that fails.
    if (!gFileSystem->moveFile(&rebuilt, &former, false))
    {
        gFileSystem->removeFile(&rebuilt);
        return false;
    }
    return open();
}

bool FResourceArchive::replaceFileInArchive(FPath* inner, const FNPath* newContent, int createFlags,
                                            const FUID* compression, UProgressHook* hook)
{
    FFileArchiveNode* node = lookupNode(inner);
    if (!node || node->isFolder() || !newContent)
        return false;
    const IPtr<FNPath> former = node->getReference() ? adopt(new FNPath(*node->getReference())) : nullptr;
    node->setReference(newContent);
    if (compact(createFlags, compression, hook))
        return true;
    // Where the archive was opened anew after all, the node is gone.
    if (FFileArchiveNode* present = lookupNode(inner))
        present->setReference(former);
    return false;
}
