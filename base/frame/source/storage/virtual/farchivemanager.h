#pragma once

#include "containers/typed/thashdictionary.h"
#include "containers/typed/tlinkedlist.h"
#include "foundation/thread/flock.h"
#include "storage/filesystem/iarchivelookup.h"
#include "storage/virtual/archiveentry.h"
#include "storage/virtual/fremovablefilesystem.h"

/// The registry of mounted archives: finds the file system behind a path like "archive://name/folder/file".
///
/// The paths are texts of FPath or FUrl, whose escapes are resolved; the protocol is one of archiveprotocols.h, and
/// names differ in more than the case of letters. The native file system asks here before it goes to the disk.
/// *Thread-safe*, but for `instance` and `terminate`, which belong to the main thread.
class FArchiveManager : public CmObject, public IArchiveLookup
{
    DECLARE_TYPE(FArchiveManager, CmObject)

    /// Made when it is first asked for, and then the one that file systems ask; null at the end of the process.
    static FArchiveManager* instance();
    static void terminate();

    FArchiveManager(const FArchiveManager&) = delete;
    FArchiveManager& operator=(const FArchiveManager&) = delete;
    ~FArchiveManager() override;
    CmObject* newCopy() const override { return nullptr; }

    // Archives
    /// Adds a reference to `files`. Where the key is taken, the file system that has it stays and counts once more.
    /// Each registration needs an `unregisterArchive`. False for an empty name or key.
    bool registerArchive(FFileSystem* files, const FString& name, const FString& key);
    /// Takes back one registration of the file system that is found under its key. False where there is none.
    bool unregisterArchive(FFileSystem* files);
    /// With a reference for the caller; null where there is none.
    FFileSystem* lookupArchive(const FString& key);
    bool containsArchive(const FString& key);
    /// How many registrations a key has.
    int getUseCount(const FString& key);
    /// Unmounts what can go away and has no stream open, and forgets it.
    void unmountUnusedVirtualFileSystems();

    // Paths
    bool isArchivePath(const FPath* path) override;
    static bool isArchivePath(const FString& text);
    /// Whether the text names an archive and nothing in it:
    ///
    /// | text               | result |
    /// |--------------------|--------|
    /// | "archive://name"   | true   |
    /// | "archive://name/"  | true   |
    /// | "archive://name/a" | false  |
    /// | "archive://"       | false  |
    static bool isRoot(const FString& text);
    /// The index of "://" behind a word of letters; -1 where there is none.
    static int findFirstProtocolPostfix(const FString& text);
    /// Whether the file can be copied byte by byte where it is, as any file on disk.
    bool isBitwiseCopyable(const FPath* path);
    FFileSystem* getFileSystem(const FPath* path) override;
    /// Begins with a delimiter; empty for an archive's root without one.
    FPath* getPath(const FPath& path) override;

private:
    using Entries = THashDictionary<FString, IPtr<ArchiveEntry>, ArchiveEntry::hashKey>;

    FArchiveManager();
    IPtr<FFileSystem> find(const FString& key);
    void forget(FFileSystem* files);
    bool isRemovable(FFileSystem* files) const;
    static bool splitText(const FPath& path, FString& name, FString& inner);

    Entries entries{31};
    FLock lock{"archive manager"};
    TLinkedList<IPtr<FRemovableFileSystem>> removable;

    static FObject* theInstance;
};
