#include "foundation/object/cmobject.h"
#include "foundation/thread/flockscope.h"
#include "foundation/thread/fpreferworkerthread.h"
#include "foundation/thread/fworkerthread.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

namespace
{
/// What happened, in order, told by several threads.
class Log
{
public:
    void add(const std::string& line)
    {
        FLockScope guard(lock);
        lines.push_back(line);
    }
    std::vector<std::string> get()
    {
        FLockScope guard(lock);
        return lines;
    }

private:
    FLock lock;
    std::vector<std::string> lines;
};

using Lines = std::vector<std::string>;

class Work : public FWorkClass
{
public:
    Work(Log& record, std::string label, FCondition* signalled = nullptr, FCondition* awaited = nullptr)
        : log(record),
          name(std::move(label)),
          started(signalled),
          mayEnd(awaited)
    {
    }
    virtual ~Work() = default;
    void performThreadWork(void* data) override
    {
        // What the work needs after it was given up must not be in the object.
        FCondition* end = mayEnd;
        log.add(name + " works" + (data ? " with data" : ""));
        if (started)
            started->signal();
        if (end)
            end->wait();
    }
    void finished() override
    {
        log.add(name + " finished");
        delete this;
    }
    void cancelWork() override
    {
        log.add(name + " cancelled");
        if (mayEnd)
            mayEnd->signal();
    }

private:
    Log& log;
    std::string name;
    FCondition* started;
    FCondition* mayEnd;
};

/// The last of a series: its end says that the others are done.
class LastWork : public FWorkClass
{
public:
    explicit LastWork(FCondition& signalled) : done(signalled) {}
    virtual ~LastWork() = default;
    void performThreadWork(void*) override {}
    void finished() override
    {
        FCondition& signalled = done;
        delete this;
        signalled.signal();
    }

private:
    FCondition& done;
};
} // namespace

TEST(FWorkerThread, WorksInOrderAndPrependedFirst)
{
    Log log;
    FCondition started, mayEnd, done;
    auto* worker = new FWorkerThread(nullptr, kThreadPriorityLow);
    EXPECT_EQ(gWorkerThread, worker) << "the first one is known to all";
    EXPECT_STREQ(worker->getName().text8(), "WorkerThread");
    EXPECT_FALSE(worker->isThreadRunning()) << "there is no work yet";

    int data = 0;
    worker->addWork(new Work(log, "a", &started, &mayEnd), nullptr);
    started.wait();
    EXPECT_EQ(worker->getPriority(), kThreadPriorityLow);
    auto* second = new FWorkerThread("second", kThreadPriorityNormal);
    EXPECT_EQ(gWorkerThread, worker);
    second->end();
    worker->addWork(new Work(log, "b"), &data);
    worker->addWork(new LastWork(done), nullptr);
    worker->prependWork(new Work(log, "c"), nullptr);
    mayEnd.signal();
    done.wait();
    worker->end();

    EXPECT_EQ(log.get(),
              (Lines{"a works", "a finished", "c works", "c finished", "b works with data", "b finished"}));
    EXPECT_EQ(gWorkerThread, nullptr);
}

TEST(FWorkerThread, SuspendLetsTheRunningWorkEnd)
{
    Log log;
    FCondition started, mayEnd, done;
    auto* worker = new FWorkerThread("worker", kThreadPriorityLowest);
    worker->addWork(new Work(log, "a", &started, &mayEnd), nullptr);
    started.wait();
    worker->suspend();
    worker->addWork(new Work(log, "b", &started), nullptr);
    mayEnd.signal();
    EXPECT_FALSE(started.waitTimeout(30));
    worker->resume();
    started.wait();
    worker->addWork(new LastWork(done), nullptr);
    done.wait();
    worker->end();
    EXPECT_EQ(log.get(), (Lines{"a works", "a finished", "b works", "b finished"}));
}

TEST(FWorkerThread, CancelledWorkIsDoneAgainOrGivenUp)
{
    Log log;
    FCondition started, mayEnd, done;
    auto* worker = new FWorkerThread("worker", kThreadPriorityNormal);
    worker->cancelCurrent(true);
    worker->addWork(new Work(log, "a", &started, &mayEnd), nullptr);
    started.wait();
    worker->addWork(new LastWork(done), nullptr);
    worker->cancelCurrent(false);
    started.wait();
    worker->cancelCurrent(true);
    done.wait();
    worker->end();
    EXPECT_EQ(log.get(), (Lines{"a works", "a cancelled", "a works", "a cancelled", "a finished"}));
}

TEST(FWorkerThread, EndCancelsTheRunningWorkAndGivesUpTheRest)
{
    Log log;
    FCondition started, mayEnd;
    auto* worker = new FWorkerThread("worker", kThreadPriorityNormal);
    worker->addWork(new Work(log, "a", &started, &mayEnd), nullptr);
    started.wait();
    worker->addWork(new Work(log, "b"), nullptr);
    worker->suspend();
    worker->end();

    Lines lines = log.get();
    // The running work ends on its own thread, at any time after it was cancelled.
    EXPECT_EQ(std::count(lines.begin(), lines.end(), "a finished"), 1);
    lines.erase(std::remove(lines.begin(), lines.end(), "a finished"), lines.end());
    EXPECT_EQ(lines, (Lines{"a works", "a cancelled", "b cancelled", "b finished"}));
}

TEST(FWorkerThread, EndsWithoutHavingWorked)
{
    (new FWorkerThread("idle", kThreadPriorityNormal))->end();
}

TEST(FWorkerThread, MayBeEndedByItsOwnWork)
{
    struct Ending : FWorkClass
    {
        Ending(FWorkerThread* toEnd, FCondition& awaited, FCondition& signalled)
            : worker(toEnd),
              handedOver(awaited),
              done(signalled)
        {
        }
        virtual ~Ending() = default;
        void performThreadWork(void*) override
        {
            FCondition& ended = done;
            handedOver.wait();
            worker->end();
            ended.signal();
        }
        void finished() override { delete this; }

        FWorkerThread* worker;
        FCondition& handedOver;
        FCondition& done;
    };
    FCondition handedOver, done;
    auto* worker = new FWorkerThread("worker", kThreadPriorityNormal);
    worker->addWork(new Ending(worker, handedOver, done), nullptr);
    handedOver.signal();
    done.wait();
}

TEST(FPreferWorkerThread, HoldsEachIdOnceAndPrefersIt)
{
    Log log;
    FCondition started, mayEnd, done;
    CmObject first, second;
    auto* worker = new FPreferWorkerThread("prefer");
    worker->addWork(new Work(log, "running", &started, &mayEnd), &first, nullptr);
    started.wait();
    EXPECT_EQ(first.getRefCount(), 2u) << "held while its work runs";
    EXPECT_EQ(worker->getPriority(), kThreadPriorityLowest);

    EXPECT_TRUE(worker->addWork(new Work(log, "a"), nullptr));
    EXPECT_TRUE(worker->addWork(new Work(log, "b"), &second, nullptr));
    Work refused(log, "refused");
    EXPECT_FALSE(worker->addWork(&refused, &second, nullptr));
    EXPECT_EQ(second.getRefCount(), 2u) << "a refused work adds no reference";
    EXPECT_TRUE(worker->addWork(new Work(log, "c"), &first, nullptr)) << "the running one no longer waits";

    CmObject unknown;
    EXPECT_FALSE(worker->prefer(&unknown));
    EXPECT_TRUE(worker->prefer(&second));
    worker->addWork(new LastWork(done), nullptr);
    mayEnd.signal();
    done.wait();
    worker->end();

    EXPECT_EQ(log.get(), (Lines{"running works", "running finished", "b works", "b finished", "a works",
                                "a finished", "c works", "c finished"}));
    EXPECT_EQ(first.getRefCount(), 1u);
    EXPECT_EQ(second.getRefCount(), 1u);
}

TEST(FPreferWorkerThread, ClearKeepsTheThreadAndSuspendCancels)
{
    Log log;
    FCondition started, mayEnd, done;
    CmObject id;
    auto* worker = new FPreferWorkerThread("prefer");
    worker->addWork(new Work(log, "a", &started, &mayEnd), nullptr);
    started.wait();
    worker->addWork(new Work(log, "b"), &id, nullptr);
    worker->clear();
    EXPECT_EQ(id.getRefCount(), 1u);
    worker->suspend();
    worker->addWork(new Work(log, "c", &started), nullptr);
    EXPECT_FALSE(started.waitTimeout(30));
    worker->resume();
    started.wait();
    worker->addWork(new LastWork(done), nullptr);
    done.wait();
    worker->end();
    EXPECT_EQ(log.get(), (Lines{"a works", "b cancelled", "b finished", "a cancelled", "a finished",
                                "c works", "c finished"}));
}

TEST(FPreferWorkerThread, EndReleasesAllIds)
{
    Log log;
    FCondition started, mayEnd;
    CmObject running, waiting;
    auto* worker = new FPreferWorkerThread("prefer");
    worker->addWork(new Work(log, "a", &started, &mayEnd), &running, nullptr);
    started.wait();
    worker->addWork(new Work(log, "b"), &waiting, nullptr);
    worker->end();
    EXPECT_EQ(running.getRefCount(), 1u);
    EXPECT_EQ(waiting.getRefCount(), 1u);
}
