#include "foundation/thread/fcondition.h"
#include "foundation/thread/fthread.h"

#include <gtest/gtest.h>

#include <pthread.h>
#include <sched.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <functional>
#include <iterator>
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

/// How far the caller goes before others: round robin before all time sharing, a low niceness before a high one.
int rankOfCaller()
{
    int policy = 0;
    sched_param parameters{};
    pthread_getschedparam(pthread_self(), &policy, &parameters);
    return policy == SCHED_RR ? 100 + parameters.sched_priority : -nicenessOfCaller();
}

int rankAtLevel(int level)
{
    int rank = 0;
    Task task([&] { rank = rankOfCaller(); });
    task.setPriority(level);
    EXPECT_EQ(task.run(), 0);
    EXPECT_TRUE(task.waitDead(-1));
    return rank;
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
    const int lowest = rankAtLevel(0);
    int below = lowest;
    for (int level = 1; level <= 5; level++)
    {
        const int rank = rankAtLevel(level);
        // What the system refuses may make neighbours equal, but never turns them around.
        EXPECT_GE(rank, below) << level;
        EXPECT_TRUE(rank > below || rank < 100) << "where round robin is permitted, each level has its own";
        below = rank;
    }
    EXPECT_EQ(rankAtLevel(2), rankOfCaller());
    EXPECT_LT(lowest, rankAtLevel(2)) << "going down is always permitted";
    EXPECT_EQ(rankAtLevel(7), lowest) << "what is no level is the lowest one";
    EXPECT_EQ(rankAtLevel(-1), lowest);
}

TEST(FThread, ChangesThePriorityOfARunningThread)
{
    FCondition hasLooked, mayLook;
    std::vector<int> ranks;
    Task task(
        [&]
        {
            for (int i = 0; i < 2; i++)
            {
                mayLook.wait();
                ranks.push_back(rankOfCaller());
                hasLooked.signal();
            }
        });
    task.setPriority(5);
    task.run();
    const int expected[] = {rankAtLevel(5), rankAtLevel(1)};
    mayLook.signal();
    hasLooked.wait();
    EXPECT_TRUE(task.setPriority(1));
    mayLook.signal();
    task.waitDead(-1);
    EXPECT_EQ(ranks, std::vector<int>(std::begin(expected), std::end(expected)));
}

TEST(FThread, NamesItselfForDebuggers)
{
    struct Named : FThread
    {
        using FThread::FThread;
        int entry() override { return pthread_getname_np(pthread_self(), found, sizeof found); }
        char found[16] = {};
    } brief("brief"), lengthy("a name that is too long");
    for (Named* thread : {&brief, &lengthy})
    {
        thread->run();
        thread->waitDead(-1);
    }
    EXPECT_STREQ(brief.found, "brief");
    EXPECT_STREQ(lengthy.found, "a name that is ") << "as much of it as the system takes";
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

TEST(FThread, ThatDeletesItsOwnObjectEndsAtItsNextWait)
{
    struct Suicide : FThread
    {
        struct LastWords
        {
            ~LastWords() { gone.signal(); }
            FCondition& gone;
        };

        explicit Suicide(FCondition& toSignal) : FThread("suicide"), gone(toSignal) {}
        int entry() override
        {
            const LastWords lastWords{gone};
            delete this;
            FThreadSleep(-1);
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
