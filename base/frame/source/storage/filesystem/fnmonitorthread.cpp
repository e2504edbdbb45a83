#include "storage/filesystem/fnmonitorthread.h"

#include "foundation/thread/flockscope.h"
#include "storage/filesystem/diskname.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/fnmonitor.h"

namespace
{
// Changes that follow one another within this time are one, but none is kept longer than ten times that.
constexpr int kBurstMs = 100;
constexpr auto kLongestBurst = std::chrono::milliseconds(10 * kBurstMs);
} // namespace

FNMonitorThread::FNMonitorThread(FNMonitor& owner) : FThread("File Monitor"), monitor(owner) {}

FNMonitorThread::~FNMonitorThread()
{
    end();
}

bool FNMonitorThread::begin()
{
    watcher = IFileWatcher::make();
    return watcher && run() == 0;
}

void FNMonitorThread::end()
{
    if (!watcher)
        return;
    watcher->wake();
    waitDead(-1);
    watcher.reset();
}

bool FNMonitorThread::add(const FNPath& folder)
{
    const int number = watcher->add(DiskName::find(folder).c_str());
    if (number < 0)
        return false;
    FLockScope guard(lock);
    const IPtr<FNPath> own = adopt(new FNPath(folder));
    own->setPathType(FPath::kFolder);
    folders[number] = own;
    return true;
}

void FNMonitorThread::remove(const FNPath& folder)
{
    int number = -1;
    {
        FLockScope guard(lock);
        for (auto entry = folders.begin(); number < 0 && entry != folders.end(); ++entry)
            if (*entry->second == folder)
                number = entry->first;
        folders.erase(number);
    }
    if (number >= 0)
        watcher->remove(number);
}

int FNMonitorThread::entry()
{
    bool goesOn = true;
    while (goesOn)
    {
        int number = -1;
        const IFileWatcher::Happening happening = watcher->wait(pending.empty() ? -1 : kBurstMs, number);
        goesOn = handle(happening, number);
    }
    postPending();
    return 0;
}

// False when the thread is to end.
bool FNMonitorThread::handle(IFileWatcher::Happening happening, int number)
{
    switch (happening)
    {
    case IFileWatcher::Happening::kWoken:
    case IFileWatcher::Happening::kFailed:
        return false;
    case IFileWatcher::Happening::kTimeout:
        postPending();
        return true;
    case IFileWatcher::Happening::kRemoved:
        pending.erase(number);
        post(number, FileSystemChange::kRemoved);
        forget(number);
        return true;
    case IFileWatcher::Happening::kLost:
        noteAll();
        return true;
    default:
        note(number);
    }
    if (std::chrono::steady_clock::now() - pendingSince > kLongestBurst)
        postPending();
    return true;
}

void FNMonitorThread::note(int number)
{
    if (pending.empty())
        pendingSince = std::chrono::steady_clock::now();
    pending.insert(number);
}

void FNMonitorThread::noteAll()
{
    FLockScope guard(lock);
    for (const auto& folder : folders)
        note(folder.first);
}

void FNMonitorThread::postPending()
{
    for (const int number : pending)
        post(number, FileSystemChange::kChanged);
    pending.clear();
}

void FNMonitorThread::post(int number, int kind)
{
    const IPtr<FNPath> folder = folderOf(number);
    if (folder && !monitor.isPathExcluded(*folder))
        monitor.post(kind, *folder, nullptr);
}

void FNMonitorThread::forget(int number)
{
    FLockScope guard(lock);
    folders.erase(number);
}

IPtr<FNPath> FNMonitorThread::folderOf(int number) const
{
    FLockScope guard(lock);
    const auto found = folders.find(number);
    // A copy, since texts convert themselves even when they are only read.
    return found == folders.end() ? nullptr : adopt(new FNPath(*found->second));
}
