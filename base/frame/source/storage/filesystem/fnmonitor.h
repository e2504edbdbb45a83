#pragma once

#include "containers/sequence/cmarray.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/thread/flock.h"
#include "storage/path/fnpath.h"

#include <atomic>
#include <memory>

class FileSystemChange;
class FNMonitorThread;
class IFileSystemListener;

/// A folder that is watched, with how many asked for it.
class FNPathEntry : public CmObject
{
    DECLARE_COPYABLE(FNPathEntry, CmObject)

    FNPathEntry(const FNPath* watchedPath, int watchFlags);

    FNPath path;
    int flags;
    int useCount = 1;
};

/// A listener and the folders of which it wants to hear.
class FNListenerEntry : public CmObject
{
    DECLARE_COPYABLE(FNListenerEntry, CmObject)

    explicit FNListenerEntry(IFileSystemListener* entryListener);

    IFileSystemListener* listener;
    /// Of FNPath.
    CmArray paths;
};

/// Watches folders and tells listeners what changed in them or below them.
///
/// The watching thread and the file system post their news as messages "PathChanged"; listeners hear of them
/// on the main thread. Listeners aren't owned and must be removed before they go. Whoever wants to hear of changes
/// starts the monitor; the end of the program ends it. Exclude filters are thread-safe; all else belongs to the main
/// thread.
class FNMonitor : public CmObject
{
    DECLARE_TYPE(FNMonitor, CmObject)

    FNMonitor(const FNMonitor&) = delete;
    FNMonitor& operator=(const FNMonitor&) = delete;
    ~FNMonitor() override;
    CmObject* newCopy() const override { return nullptr; }

    /// Made by the first call. Null at the end of the process.
    static FNMonitor* instance();
    /// The instance if there is one, without making it. Thread-safe: the reference keeps it for as long as the caller
    /// needs it.
    static IPtr<FNMonitor> existing();

    /// Creates the thread. True if it runs.
    bool start();
    /// Ends the thread; what it posted still arrives.
    void stop();
    /// Thread-safe.
    bool isRunning() const { return running; }

    // Listeners
    /// `listener` hears of changes in `path` and below; the folder itself is watched, folders below it are
    /// watched by `addPath`. False where it is no folder that can be watched.
    bool registerPath(IFileSystemListener* listener, const FNPath* path);
    /// Takes the listener off all its paths.
    void removeRegistry(IFileSystemListener* listener);
    /// Watches a folder for nobody in particular. With kRecursive the folders below it too, as they are now.
    bool addPath(const FNPath* path, int flags);
    void removePath(const FNPath* path);

    // Exclude filters: patterns with wildcards for full paths
    /// Adds a pattern once.
    void addExcludeFilter(const char16* pattern);
    void removeExcludeFilter(const char16* pattern);
    bool isPathExcluded(const char16* fullPath) const;
    /// A folder also counts as the beginning of its content, with a delimiter at its end.
    bool isPathExcluded(const FNPath& path) const;
    /// The pattern that fits `path` itself or, with `withContent`, a folder and all below it: "/a/b" or
    /// "/a/b/" and a star.
    static void prepareExcludeFilter(const FPath* path, bool withContent, FString& pattern);

    /// Posts a change in a folder to this monitor, if there is a messenger. Thread-safe.
    void post(int kind, const FNPath& folder, const FNPath* newFolder);

    int notify(FMessage* message) override;

    static constexpr int kRecursive = 1;

private:
    FNMonitor();
    FNPathEntry* findEntry(const FNPath& path) const;
    FNListenerEntry* findListener(const IFileSystemListener* listener) const;
    int findExclude(const char16* pattern) const;
    bool watch(const FNPath& path, int flags);
    void unwatch(const FNPath& path);
    static bool concerns(const FNListenerEntry& entry, const FileSystemChange& change);
    void tell(const FileSystemChange& change);

    CmArray pathEntries;
    CmArray listeners;
    mutable FLock lock{"file monitor"};
    CmArray excludes;
    std::unique_ptr<FNMonitorThread> thread;
    std::atomic<bool> running{false};
};

/// Ends the monitor and takes the instance down. Main thread.
void termFNMonitor();
