#pragma once

#include "foundation/object/iptr.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/fthread.h"
#include "storage/filesystem/ifilewatcher.h"
#include "storage/path/fnpath.h"

#include <chrono>
#include <map>
#include <memory>
#include <set>

class FNMonitor;

/// The thread that waits for changes in watched folders and posts them to the monitor.
///
/// Changes of one folder that come close together are told once. `add` and `remove` are thread-safe.
class FNMonitorThread : public FThread
{
public:
    explicit FNMonitorThread(FNMonitor& owner);
    ~FNMonitorThread() override;

    /// Starts; false where the platform can't watch.
    bool begin();
    /// Wakes the thread and waits for its end.
    void end();
    bool add(const FNPath& folder);
    void remove(const FNPath& folder);

    int entry() override;

private:
    using Folders = std::map<int, IPtr<FNPath>>;

    bool handle(IFileWatcher::Happening happening, int number);
    void note(int number);
    void noteAll();
    void postPending();
    void post(int number, int kind);
    void forget(int number);
    IPtr<FNPath> folderOf(int number) const;

    FNMonitor& monitor;
    std::unique_ptr<IFileWatcher> watcher;
    mutable FLock lock{"watched folders"};
    Folders folders;
    // Of the thread alone
    std::set<int> pending;
    std::chrono::steady_clock::time_point pendingSince;
};
