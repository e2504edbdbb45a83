#include "network/socket/nhostsearch.h"

#include "network/socket/nsocket.h"
#include "network/socket/platformsocket.h"

#include <algorithm>
#include <chrono>

namespace
{
/// How soon a stop is noticed.
constexpr int kSliceMs = 50;
} // namespace

/// Question and answer; held by the asker and by the thread.
struct NHostSearch::Search
{
    void run()
    {
        if (host.empty())
            name = PlatformSocket::findName(address);
        else
            addresses = PlatformSocket::findHost(host);
        done.signal();
    }

    std::string host;
    NAddress address;
    // Written before `done` is signalled and read after.
    std::vector<NAddress> addresses;
    std::string name;
    FCondition started{"host search started"};
    FCondition done{"host search done"};
};

class NHostSearch::SearchThread : public FThread
{
public:
    explicit SearchThread(const std::shared_ptr<Search>& toRun) : FThread("Host Search"), search(toRun) {}

    int entry() override
    {
        // This object may be gone once `started` is signalled.
        const std::shared_ptr<Search> running = search;
        running->started.signal();
        running->run();
        return 0;
    }

private:
    std::shared_ptr<Search> search;
};

NHostSearch::NHostSearch(const char* host) : search(std::make_shared<Search>())
{
    search->host = host;
    start();
}

NHostSearch::NHostSearch(const NAddress& address) : search(std::make_shared<Search>())
{
    search->address = address;
    start();
}

void NHostSearch::start()
{
    thread = std::make_unique<SearchThread>(search);
    if (thread->run() == 0)
        search->started.wait();
    else
        search->done.signal();
}

bool NHostSearch::wait(int timeout, const NSocket* canceller)
{
    using Clock = std::chrono::steady_clock;
    const auto end = Clock::now() + std::chrono::milliseconds(timeout);
    for (;;)
    {
        if (canceller && canceller->isStopped())
            return false;
        int slice = kSliceMs;
        if (timeout >= 0)
            slice = static_cast<int>(std::min<int64>(
                slice, std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now()).count()));
        if (search->done.waitTimeout(std::max(slice, 0)))
            return true;
        if (timeout >= 0 && Clock::now() >= end)
            return false;
    }
}

const std::vector<NAddress>& NHostSearch::getAddresses() const
{
    return search->addresses;
}

const std::string& NHostSearch::getName() const
{
    return search->name;
}
