#include "storage/filesystem/fnmonitor.h"

#include "containers/match/cmregularexpression.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/singleton.h"
#include "foundation/thread/flockscope.h"
#include "storage/filesystem/filesystemchange.h"
#include "storage/filesystem/fnfilesystemscanner.h"
#include "storage/filesystem/fnmonitorthread.h"
#include "storage/filesystem/ifilesystemlistener.h"

#include <mutex>
#include <utility>
#include <vector>

namespace
{
constexpr const char* kPathChanged = "PathChanged";
constexpr const char* kChange = "change";

FObject* theMonitor = nullptr;
// Guards the pointer: any thread may ask for the monitor while the main thread takes it down.
std::mutex theMonitorLock;

bool isAtOrBelow(const FNPath& path, const FNPath& folder)
{
    return path == folder || path.isInDir(&folder);
}

// The characters of the pattern language stand for themselves.
void appendQuoted(FString& pattern, const FString& text)
{
    for (const char16* next = text.text16(); *next; next++)
    {
        if (*next == u'*' || *next == u'?' || *next == u'\\')
            pattern.append(u'\\');
        pattern.append(*next);
    }
}
} // namespace

FNPathEntry::FNPathEntry(const FNPath* watchedPath, int watchFlags) : path(*watchedPath), flags(watchFlags) {}

FNListenerEntry::FNListenerEntry(IFileSystemListener* entryListener) : listener(entryListener)
{
    paths.takeElements();
}

// The instance

FNMonitor::FNMonitor()
{
    pathEntries.takeElements();
    listeners.takeElements();
    excludes.takeElements();
}

FNMonitor::~FNMonitor()
{
    stop();
    if (gMessenger)
        gMessenger->killMessages(this, nullptr);
}

FNMonitor* FNMonitor::instance()
{
    if (!theMonitor && !Singleton::isTerminated())
    {
        const std::lock_guard<std::mutex> guard(theMonitorLock);
        theMonitor = new FNMonitor;
        Singleton::registerInstance(&theMonitor);
    }
    return static_cast<FNMonitor*>(theMonitor);
}

IPtr<FNMonitor> FNMonitor::existing()
{
    const std::lock_guard<std::mutex> guard(theMonitorLock);
    return static_cast<FNMonitor*>(theMonitor);
}

void termFNMonitor()
{
    FNMonitor* monitor = nullptr;
    {
        const std::lock_guard<std::mutex> guard(theMonitorLock);
        monitor = static_cast<FNMonitor*>(std::exchange(theMonitor, nullptr));
    }
    if (!monitor)
        return;
    // Ended here, since the last reference may be that of another thread which is just telling of a change.
    monitor->stop();
    monitor->release();
}

bool FNMonitor::start()
{
    if (isRunning())
        return true;
    auto starting = std::make_unique<FNMonitorThread>(*this);
    if (!starting->begin())
        return false;
    for (int i = 0; i < pathEntries.total(); i++)
        starting->add(static_cast<FNPathEntry*>(pathEntries.at(i))->path);
    thread = std::move(starting);
    running = true;
    return true;
}

void FNMonitor::stop()
{
    running = false;
    thread.reset();
}

// Folders

FNPathEntry* FNMonitor::findEntry(const FNPath& path) const
{
    for (int i = 0; i < pathEntries.total(); i++)
    {
        auto* entry = static_cast<FNPathEntry*>(pathEntries.at(i));
        if (entry->path == path)
            return entry;
    }
    return nullptr;
}

bool FNMonitor::watch(const FNPath& path, int flags)
{
    if (FNPathEntry* known = findEntry(path))
    {
        known->useCount++;
        // A folder that was removed and made again has lost its watch.
        return !thread || thread->add(path);
    }
    if (thread && !thread->add(path))
        return false;
    return pathEntries.add(new FNPathEntry(&path, flags));
}

void FNMonitor::unwatch(const FNPath& path)
{
    FNPathEntry* entry = findEntry(path);
    if (!entry || --entry->useCount > 0)
        return;
    if (thread)
        thread->remove(path);
    pathEntries.remove(entry);
}

bool FNMonitor::addPath(const FNPath* path, int flags)
{
    if (!path || !watch(*path, flags))
        return false;
    if ((flags & kRecursive) == 0)
        return true;
    FNFileSystemScanner walk(path);
    for (walk.first(); !walk.done(); walk.next())
    {
        const IPtr<FPath> entry = walk.current();
        if (entry->isFolder())
            watch(*FCast(FNPath, entry.get()), 0);
    }
    return true;
}

void FNMonitor::removePath(const FNPath* path)
{
    const FNPathEntry* entry = path ? findEntry(*path) : nullptr;
    if (!entry)
        return;
    const FNPath folder(*path);
    const bool isRecursive = (entry->flags & kRecursive) != 0;
    unwatch(folder);
    if (!isRecursive)
        return;
    std::vector<FNPath> below;
    for (int i = 0; i < pathEntries.total(); i++)
    {
        const FNPath& other = static_cast<FNPathEntry*>(pathEntries.at(i))->path;
        if (other.isInDir(&folder))
            below.push_back(other);
    }
    for (const FNPath& other : below)
        unwatch(other);
}

// Listeners

FNListenerEntry* FNMonitor::findListener(const IFileSystemListener* listener) const
{
    for (int i = 0; i < listeners.total(); i++)
    {
        auto* entry = static_cast<FNListenerEntry*>(listeners.at(i));
        if (entry->listener == listener)
            return entry;
    }
    return nullptr;
}

bool FNMonitor::registerPath(IFileSystemListener* listener, const FNPath* path)
{
    if (!listener || !path)
        return false;
    FNListenerEntry* entry = findListener(listener);
    if (entry && entry->paths.contains(path))
        return true;
    if (!watch(*path, 0))
        return false;
    if (!entry)
    {
        entry = new FNListenerEntry(listener);
        listeners.add(entry);
    }
    return entry->paths.add(new FNPath(*path));
}

void FNMonitor::removeRegistry(IFileSystemListener* listener)
{
    FNListenerEntry* entry = findListener(listener);
    if (!entry)
        return;
    for (int i = 0; i < entry->paths.total(); i++)
        unwatch(*static_cast<FNPath*>(entry->paths.at(i)));
    listeners.remove(entry);
}

// Exclude filters

int FNMonitor::findExclude(const char16* pattern) const
{
    for (int i = 0; pattern && i < excludes.total(); i++)
        if (ConstString(static_cast<CmRegularExpression*>(excludes.at(i))->getExpression())
                .compare(pattern) == 0)
            return i;
    return -1;
}

void FNMonitor::addExcludeFilter(const char16* pattern)
{
    FLockScope guard(lock);
    if (pattern && *pattern && findExclude(pattern) < 0)
        excludes.add(new CmRegularExpression(pattern));
}

void FNMonitor::removeExcludeFilter(const char16* pattern)
{
    FLockScope guard(lock);
    excludes.removeAt(findExclude(pattern));
}

bool FNMonitor::isPathExcluded(const char16* fullPath) const
{
    FLockScope guard(lock);
    for (int i = 0; i < excludes.total(); i++)
        if (static_cast<CmRegularExpression*>(excludes.at(i))->match(fullPath))
            return true;
    return false;
}

bool FNMonitor::isPathExcluded(const FNPath& path) const
{
    FString text;
    path.getFullPath(text);
    if (isPathExcluded(text.text16()))
        return true;
    if (!path.isFolder())
        return false;
    text.append(PATH_DELIMITER);
    return isPathExcluded(text.text16());
}

void FNMonitor::prepareExcludeFilter(const FPath* path, bool withContent, FString& pattern)
{
    pattern.assign(u"");
    if (!path)
        return;
    FString text;
    path->getFullPath(text);
    appendQuoted(pattern, text);
    if (!withContent)
        return;
    if (!pattern.testChar16(pattern.length() - 1, PATH_DELIMITER))
        pattern.append(PATH_DELIMITER);
    pattern.append(u'*');
}

// News

void FNMonitor::post(int kind, const FNPath& folder, const FNPath* newFolder)
{
    if (!gMessenger)
        return;
    const IPtr<FileSystemChange> change = adopt(new FileSystemChange(kind, &folder, newFolder));
    auto* message = new FMessage(kPathChanged);
    message->add(kChange, change, true);
    gMessenger->postMessage(this, message);
}

int FNMonitor::notify(FMessage* message)
{
    if (!message || !message->isType(kPathChanged))
        return CmObject::notify(message);
    if (const FileSystemChange* change = FCast(FileSystemChange, message->get(kChange)))
        tell(*change);
    return 1;
}

// A change is that of a folder's content, so the folder itself counts as much as those above it. Listeners
// may come and go while they are told.
void FNMonitor::tell(const FileSystemChange& change)
{
    std::vector<IFileSystemListener*> told;
    for (int i = 0; i < listeners.total(); i++)
    {
        const auto* entry = static_cast<FNListenerEntry*>(listeners.at(i));
        if (concerns(*entry, change))
            told.push_back(entry->listener);
    }
    for (IFileSystemListener* listener : told)
        if (findListener(listener))
            listener->onFileSystemChanged(change);
}

bool FNMonitor::concerns(const FNListenerEntry& entry, const FileSystemChange& change)
{
    for (int i = 0; i < entry.paths.total(); i++)
    {
        const FNPath& folder = *static_cast<FNPath*>(entry.paths.at(i));
        if (isAtOrBelow(*change.getPath(), folder))
            return true;
        if (change.getNewPath() && isAtOrBelow(*change.getNewPath(), folder))
            return true;
    }
    return false;
}
