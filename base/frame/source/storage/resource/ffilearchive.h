#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/flock.h"
#include "storage/filesystem/ffilesystem.h"
#include "storage/path/fnpath.h"
#include "storage/resource/boundedtexts.h"
#include "storage/resource/ffilearchivenode.h"
#include "storage/resource/ffilearchivesubstream.h"

#include <atomic>

class FArchiveProgress;
class FConsole;

/// One file that holds a tree of files, to be read as a file system; a derived class knows its form.
///
/// Paths count from the archive's root, with or without a leading delimiter; ".." never leads above it. Nothing is
/// changed through this contract. An archive that was opened with kOwnHandles may serve several threads, each with
/// streams of its own; otherwise it and all its streams belong to one thread at a time. Opening, closing, extracting
/// and the cache folder are for one thread in any case.
class FFileArchive : public FFileSystem
{
    DECLARE_TYPE(FFileArchive, FFileSystem)

    enum Flags
    {
        kPrivateCache = 1, ///< no other archive of the same name shares the cache folder
        kOwnHandles = 2,   ///< each stream has its own handle; nobody may replace the file meanwhile
        kBuffered = 4      ///< the archive's own handle is read through a cache of one block
    };

    /// The archive's file; the path is copied. Nothing is opened yet.
    FFileArchive(const FPath* itsPath, int itsFlags);
    /// An archive in any stream, to which a reference is added.
    FFileArchive(FStream* itsSource, int itsFlags);
    FFileArchive(const FFileArchive&) = delete;
    FFileArchive& operator=(const FFileArchive&) = delete;
    ~FFileArchive() override;
    CmObject* newCopy() const override { return nullptr; }

    /// Closes first what was open.
    virtual bool open();
    /// False, with everything as it was, while streams with handles of their own are open. The destructor closes.
    virtual bool close();
    bool isOpen() const { return stream != nullptr; }

    // Content
    /// Null for an archive in a stream. Borrowed.
    const FPath* getArchivePath() const { return path; }
    /// Null while the archive is closed. Borrowed, as all nodes.
    FFileArchiveNode* getRoot() const { return root; }
    /// Null where there is no such file or folder.
    FFileArchiveNode* lookupNode(const FPath* inner) const;
    /// Null for a folder, and where the content can't be read. The caller closes it by `closeFile`.
    virtual FStream* openNode(const FFileArchiveNode* node);
    /// Whether a stream on the archive is open that has a handle of its own.
    bool hasOpenStreams() const { return openSubStreams > 0; }
    /// Whether a file that stands for a node is missing or newer than the archive. With `dropMissing`, a node whose
    /// file is gone has its own content again.
    bool checkUpdatedNodes(bool dropMissing);
    void dumpContent(FConsole* console) const;
    /// What a viewer keeps with the archive while it is open, counted; null for none.
    void setTree(CmObject* newTree) { tree = newTree; }
    CmObject* getTree() const { return tree; }

    // Extraction. A name that would lead out of the target folder, also through a link that lies there, is left out.
    // False where anything is missing afterwards. A file that is there already is replaced by a whole one or stays. The hook
    // may be null.
    bool extractFile(const FFileArchiveNode* node, const FNPath& target, UProgressHook* hook);
    bool extractFolder(const FFileArchiveNode* node, const FNPath& target, UProgressHook* hook);
    /// All of the archive, below `target`.
    bool extractAll(const FNPath& target, UProgressHook* hook);
    /// Full paths of what the last extraction, or the last writing, could not take.
    const BoundedTexts& getLeftOut() const { return leftOut; }

    // Cache folder: where files are extracted to for others to open
    /// Null where it can't be told. Borrowed.
    const FNPath* getCacheFolder();
    void setCacheFolder(const FNPath* folder);
    /// `result` becomes the place of a node below the cache folder. False for names that lead elsewhere.
    bool makeCachedPath(FNPath& result, const FFileArchiveNode* node);

    FStream* openFile(FPath* inner, int mode, int* error) override;
    bool fileExists(FPath* inner) override;
    /// Copies out of the archive. Paths into mounted archives are taken too, and then the other one is any.
    bool copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error) override;
    bool getDirName(FPath* inner, FString& result) override;
    /// Those of the archive's file, or of the file that stands for the node.
    bool getFileTimes(FPath* inner, CmTime& created, CmTime& modified) override;
    int64 getFileSize(FPath* inner) override;
    int64 getFileSize(FStream* opened) override;
    FFileIterator* newIterator(const FPath* inner, bool recursive) override;
    int64 countFiles(const FPath* inner, bool recursive, bool withFolders, int64* bytes) override;

protected:
    friend class FFileArchiveSubStream;

    /// The bytes of a node as they are stored.
    FStream* openSubStream(const FFileArchiveNode* node);
    /// The archive's file, opened anew; null for an archive in a stream.
    FStream* openHandle(int mode);
    /// Lets go of the stream; false where what was written to it may not be whole.
    bool closeStream();

    IPtr<FPath> path;
    IPtr<FStream> stream;
    IPtr<FFileArchiveNode> root;
    IPtr<FNPath> cacheFolder;
    int flags;
    std::atomic<int> openSubStreams{0};
    IPtr<CmObject> tree;
    /// What an archive without a file is in.
    IPtr<FStream> source;
    BoundedTexts leftOut;

private:
    bool extractInto(const FFileArchiveNode& folder, const FNPath& target, FArchiveProgress& progress);
    bool extractChild(const FFileArchiveNode& child, const FNPath& folder, FArchiveProgress& progress);
    bool extractContent(const FFileArchiveNode& node, FNPath& target, UProgressHook* hook);
    bool leaveOut(const FFileArchiveNode& node);
    FString archiveName() const;
    /// A path is for one thread at a time, so each question has its own.
    IPtr<FPath> ownCopy(const FPath& shared) const;

    mutable FLock pathLock{"paths of an archive"};
};
