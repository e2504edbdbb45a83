#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmiterator.h"
#include "containers/sequence/cmobjectfilter.h"
#include "foundation/thread/fcpuinfo.h"
#include "foundation/thread/fthread.h"

#include <atomic>
#include <memory>
#include <vector>

namespace
{
/// What the threads of one iteration share. The flag is only ever set, and tells the others to end early.
struct SharedWork
{
    const CmContainer& container;
    CmObjectFilter& filter;
    std::atomic<bool> abort{false};
};

// Checks `count` elements from `start` on, until one doesn't pass on any thread.
void checkStretch(SharedWork& work, int start, int count)
{
    const std::unique_ptr<CmIterator> it(work.container.newIterator());
    *it += start;
    while (count-- > 0 && !work.abort.load(std::memory_order_relaxed))
        if (!work.filter.check(it->next()))
            work.abort.store(true, std::memory_order_relaxed);
}

/// Checks one stretch of a container.
class ConcurrencyIteratorThread : public FThread
{
public:
    ConcurrencyIteratorThread(SharedWork& shared, int firstIndex, int elementCount)
        : FThread("ConcurrencyIteratorThread"),
          work(shared),
          start(firstIndex),
          count(elementCount)
    {
    }

    int entry() override
    {
        checkStretch(work, start, count);
        return 0;
    }

private:
    SharedWork& work;
    const int start;
    const int count;
};

bool checkConcurrently(SharedWork& work, int threads, int perThread)
{
    std::vector<std::unique_ptr<ConcurrencyIteratorThread>> running;
    int start = 0;
    for (int i = 1; i < threads && !work.abort.load(std::memory_order_relaxed); i++, start += perThread)
    {
        auto thread = std::make_unique<ConcurrencyIteratorThread>(work, start, perThread);
        if (thread->run() == 0)
            running.push_back(std::move(thread));
        else
            thread->entry();
    }
    checkStretch(work, start, work.container.total() - start);
    for (const auto& thread : running)
        thread->waitDead(-1);
    return work.abort;
}
} // namespace

bool CmContainer::concurrentIteration(CmObjectFilter& filter, int threads, int minPerThread) const
{
    if (threads < 1)
        threads = FCpuInfo().countAvailable();
    const int count = total();
    while (threads >= 2 && count / threads < minPerThread)
        threads--;
    const int perThread = threads > 0 ? count / threads : 0;
    if (threads <= 1 || perThread < minPerThread)
        return forEach(filter);

    // The result is the reverse of the one above: true where an element did not pass. Callers rely on both.
    SharedWork work{*this, filter};
    return checkConcurrently(work, threads, perThread);
}
