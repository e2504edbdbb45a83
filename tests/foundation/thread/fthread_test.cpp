#include "foundation/thread/fcondition.h"
#include "foundation/thread/fthread.h"

#include <gtest/gtest.h>

#include <sys/resource.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <functional>
#include <string>
#include <vector>

namespace
{
class Task : public FThread
{
public:
    explicit Task(std::function<void()> body) : FThread("task"), work(std::move(body)) {}
    int entry() override
    {
        work();
        return 0;
    }

private:
    std::function<void()> work;
};

int nicenessOfCaller()
{
    return getpriority(PRIO_PROCESS, static_cast<id_t>(syscall(SYS_gettid)));
}

int nicenessAtLevel(int level)
{
    int niceness = 0;
    Task task([&] { niceness = nicenessOfCaller(); });
    task.setPriority(level);
    EXPECT_EQ(task.run(), 0);
    EXPECT_TRUE(task.waitDead(-1));
    return niceness;
}
} // namespace

TEST(FThread, RunsItsEntryOnAThreadOfItsOwnAndCanRunAgain)
{
    int runs = 0;
    FThreadID worker = 0;
    bool wasInContext = false;
    bool wasRunning = false;
    Task task(
        [&]
        {
            runs++;
            worker = FThread::currentThreadID();
            wasInContext = task.isInThreadContext();
            wasRunning = task.isThreadRunning();
        });

    for (int round = 1; round <= 3; round++)
    {
        EXPECT_EQ(task.run(), 0);
        EXPECT_TRUE(task.waitDead(-1));
        EXPECT_EQ(runs, round);
        EXPECT_FALSE(task.isThreadRunning());
    }
    EXPECT_NE(worker, FThread::currentThreadID());
    EXPECT_TRUE(wasInContext);
    EXPECT_TRUE(wasRunning);
    EXPECT_FALSE(task.isInThreadContext());
}

TEST(FThread, RunWaitsForAFormerRunThatNobodyWaitedFor)
{
    std::vector<int> marks;
    Task task(
        [&]
        {
            marks.push_back(1);
            FThreadSleep(5);
            marks.push_back(2);
        });
    task.run();
    task.run();
    EXPECT_TRUE(task.waitDead(-1));
    EXPECT_EQ(marks, (std::vector<int>{1, 2, 1, 2}));
}

TEST(FThread, WaitDeadIgnoresItsTimeLimit)
{
    Task never([] {});
    EXPECT_TRUE(never.waitDead(10)) << "a thread that was never run is dead";

    bool isFinished = false;
    Task busy(
        [&]
        {
            FThreadSleep(60);
            isFinished = true;
        });
    busy.run();
    EXPECT_TRUE(busy.waitDead(1));
    EXPECT_TRUE(isFinished);
}

TEST(FThread, WorksAtItsPriorityFromTheStart)
{
    const int lowest = nicenessAtLevel(0);
    const int low = nicenessAtLevel(1);
    const int normal = nicenessAtLevel(2);
    EXPECT_EQ(normal, nicenessOfCaller());
    EXPECT_GE(lowest, low);
    EXPECT_GE(low, normal);
    EXPECT_GT(lowest, normal);
    EXPECT_EQ(nicenessAtLevel(7), lowest) << "what is no level is the lowest one";
    EXPECT_EQ(nicenessAtLevel(-1), lowest);
}

TEST(FThread, PriorityIsKeptForAThreadThatDoesNotExistYet)
{
    Task task([] {});
    EXPECT_FALSE(task.setPriority(4));
    EXPECT_EQ(task.getPriority(), 4);
    EXPECT_EQ(task.run(), 0) << "a system that refuses the priority is no error";
    EXPECT_TRUE(task.setPriority(5));
    EXPECT_TRUE(task.waitDead(-1));
}

TEST(FThread, TerminateEndsAThreadThatWaits)
{
    bool wasUnwound = false;
    bool wentOn = false;
    Task task(
        [&]
        {
            struct Unwound
            {
                ~Unwound() { flag = true; }
                bool& flag;
            } unwound{wasUnwound};
            FThreadSleep(-1);
            wentOn = true;
        });
    task.run();
    task.terminate();
    EXPECT_TRUE(task.waitDead(-1));
    EXPECT_TRUE(wasUnwound);
    EXPECT_FALSE(wentOn);
    EXPECT_FALSE(task.isThreadRunning());
}

TEST(FThread, ACancelledWaitLeavesTheConditionUsable)
{
    FCondition condition;
    Task task([&] { condition.wait(); });
    task.run();
    task.terminate();
    EXPECT_TRUE(task.waitDead(-1));

    condition.signalAll();
    EXPECT_TRUE(condition.waitTimeout(0));
    EXPECT_FALSE(condition.waitTimeout(0)) << "the cancelled thread must not count as waiting";
}

TEST(FThread, MayDeleteItsOwnObject)
{
    struct Suicide : FThread
    {
        explicit Suicide(FCondition& toSignal) : FThread("suicide"), gone(toSignal) {}
        int entry() override
        {
            FCondition& signalled = gone;
            delete this;
            signalled.signal();
            return 0;
        }

        FCondition& gone;
    };
    FCondition gone;
    EXPECT_EQ((new Suicide(gone))->run(), 0);
    gone.wait();
}

TEST(FThread, StandsForTheCallingThread)
{
    FThread* self = FThread::newForCallingThread("GUI");
    EXPECT_TRUE(self->isThreadRunning());
    EXPECT_TRUE(self->isInThreadContext());
    EXPECT_FALSE(self->waitDead(0)) << "nobody can wait for himself";
    self->terminate();
    delete self;
    FThreadSleep(1);
    SUCCEED() << "the thread lives on";
}

TEST(FThread, TellsItsSpy)
{
    struct Spy : IThreadSpy
    {
        void threadCreated(FThread* thread) override { told.push_back("created " + nameOf(thread)); }
        void threadDestroyed(FThread* thread) override { told.push_back("destroyed " + nameOf(thread)); }
        static std::string nameOf(FThread* thread) { return thread->getName().text8(); }

        std::vector<std::string> told;
    } spy;
    FThread::setSpy(&spy);
    {
        FThread watched("watched");
    }
    FThread::setSpy(nullptr);
    FThread unwatched("unwatched");
    EXPECT_EQ(spy.told, (std::vector<std::string>{"created watched", "destroyed watched"}));
}
