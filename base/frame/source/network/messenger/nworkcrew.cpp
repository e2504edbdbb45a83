#include "network/messenger/nworkcrew.h"

#include "foundation/thread/flockscope.h"
#include "foundation/thread/fworkclass.h"

#include <algorithm>
#include <chrono>

class NWorkCrew::Worker : public FThread
{
public:
    Worker(NWorkCrew& owner, FWorkClass* firstWork) : FThread(owner.name), current(firstWork), crew(owner) {}
    ~Worker() override { waitDead(-1); }

    int entry() override
    {
        for (FWorkClass* work = current; work; work = crew.exchangeWork(*this))
            work->performThreadWork(nullptr);
        crew.workerIdle.signal();
        return 0;
    }

    // Guarded by the crew's lock once the thread runs; null when it has nothing more to do.
    FWorkClass* current;

private:
    NWorkCrew& crew;
};

NWorkCrew::NWorkCrew(const char* threadName, FThreadPriority threadPriority)
    : name(threadName),
      priority(threadPriority)
{
}

NWorkCrew::~NWorkCrew()
{
    end(0);
}

void NWorkCrew::add(FWorkClass* work)
{
    // Waited for at the end, outside the lock.
    std::vector<std::unique_ptr<Worker>> idle;
    FLockScope guard(lock);
    idle = takeIdle();
    if (workers.size() >= kMaxThreads)
    {
        if (waiting.size() < kMaxWaiting)
            waiting.push_back(work);
        else
            work->finished();
        return;
    }
    auto worker = std::make_unique<Worker>(*this, work);
    worker->setPriority(priority);
    if (worker->run() == 0)
        workers.push_back(std::move(worker));
    else
        work->finished();
}

/// Ends the worker's work and gives it the next one, null where there is none.
FWorkClass* NWorkCrew::exchangeWork(Worker& worker)
{
    FLockScope guard(lock);
    worker.current->finished();
    worker.current = nullptr;
    if (!waiting.empty())
    {
        worker.current = waiting.front();
        waiting.pop_front();
    }
    return worker.current;
}

std::vector<std::unique_ptr<NWorkCrew::Worker>> NWorkCrew::takeIdle()
{
    const auto firstIdle =
        std::partition(workers.begin(), workers.end(), [](const auto& worker) { return worker->current; });
    std::vector<std::unique_ptr<Worker>> idle(std::make_move_iterator(firstIdle),
                                              std::make_move_iterator(workers.end()));
    workers.erase(firstIdle, workers.end());
    return idle;
}

size_t NWorkCrew::countBusy()
{
    FLockScope guard(lock);
    return static_cast<size_t>(
        std::count_if(workers.begin(), workers.end(), [](const auto& worker) { return worker->current; }));
}

void NWorkCrew::cancelAll()
{
    FLockScope guard(lock);
    for (FWorkClass* work : waiting)
        work->finished();
    waiting.clear();
    for (const auto& worker : workers)
        if (worker->current)
            worker->current->cancelWork();
}

void NWorkCrew::end(int grace)
{
    using Clock = std::chrono::steady_clock;
    const auto limit = Clock::now() + std::chrono::milliseconds(grace);
    while (countBusy() > 0 && Clock::now() < limit)
        workerIdle.waitTimeout(std::min(grace, 20));
    cancelAll();
    std::vector<std::unique_ptr<Worker>> ending;
    FLockScope guard(lock);
    ending.swap(workers);
}
