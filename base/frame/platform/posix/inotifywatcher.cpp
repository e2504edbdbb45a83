#include "storage/filesystem/ifilewatcher.h"

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <deque>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/inotify.h>
#include <unistd.h>

namespace
{
/// Closes a descriptor at the end of its life.
class Descriptor
{
public:
    explicit Descriptor(int number) : descriptor(number) {}
    ~Descriptor()
    {
        if (descriptor >= 0)
            close(descriptor);
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    int get() const { return descriptor; }

private:
    int descriptor;
};

/// Watches folders by the kernel's inotify.
class InotifyWatcher : public IFileWatcher
{
public:
    InotifyWatcher()
        : queue(inotify_init1(IN_CLOEXEC | IN_NONBLOCK)),
          waker(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK))
    {
    }

    bool isUsable() const { return queue.get() >= 0 && waker.get() >= 0; }

    int add(const char* folder) override
    {
        return inotify_add_watch(queue.get(), folder, kWatched | IN_ONLYDIR);
    }
    void remove(int number) override { inotify_rm_watch(queue.get(), number); }
    Happening wait(int timeoutMs, int& number) override;
    void wake() override;

private:
    struct News
    {
        Happening happening;
        int number;
    };

    static constexpr uint32_t kGone = IN_DELETE_SELF | IN_MOVE_SELF | IN_UNMOUNT;
    static constexpr uint32_t kWatched = IN_CREATE | IN_DELETE | IN_MODIFY | IN_ATTRIB | IN_MOVED_FROM |
                                         IN_MOVED_TO | IN_DELETE_SELF | IN_MOVE_SELF;

    bool readNews();
    void note(const inotify_event& event);

    Descriptor queue;
    Descriptor waker;
    std::deque<News> news;
};

IFileWatcher::Happening InotifyWatcher::wait(int timeoutMs, int& number)
{
    while (news.empty())
    {
        pollfd sources[] = {{waker.get(), POLLIN, 0}, {queue.get(), POLLIN, 0}};
        const int ready = poll(sources, 2, timeoutMs);
        if (ready == 0)
            return Happening::kTimeout;
        if (ready < 0 && errno != EINTR)
            return Happening::kFailed;
        // Never read, so that every later wait returns as well.
        if (ready > 0 && sources[0].revents != 0)
            return Happening::kWoken;
        if (ready > 0 && !readNews())
            return Happening::kFailed;
    }
    const News first = news.front();
    news.pop_front();
    number = first.number;
    return first.happening;
}

void InotifyWatcher::wake()
{
    const uint64_t one = 1;
    // Only a counter that is full already refuses, and that wakes too.
    [[maybe_unused]] const ssize_t written = write(waker.get(), &one, sizeof(one));
}

bool InotifyWatcher::readNews()
{
    char buffer[16384];
    const ssize_t length = read(queue.get(), buffer, sizeof(buffer));
    if (length <= 0)
        return length < 0 && (errno == EAGAIN || errno == EINTR);
    for (ssize_t place = 0; place < length;)
    {
        inotify_event event = {};
        memcpy(&event, buffer + place, sizeof(event));
        note(event);
        place += static_cast<ssize_t>(sizeof(event) + event.len);
    }
    return true;
}

void InotifyWatcher::note(const inotify_event& event)
{
    if (event.mask & IN_Q_OVERFLOW)
        news.push_back({Happening::kLost, -1});
    else if (event.mask & kGone)
    {
        // A folder that was moved would go on telling under its old name.
        if (event.mask & IN_MOVE_SELF)
            remove(event.wd);
        news.push_back({Happening::kRemoved, event.wd});
    }
    else if (!(event.mask & IN_IGNORED))
        news.push_back({Happening::kChanged, event.wd});
}
} // namespace

std::unique_ptr<IFileWatcher> IFileWatcher::make()
{
    auto watcher = std::make_unique<InotifyWatcher>();
    if (!watcher->isUsable())
        return nullptr;
    return watcher;
}
