#include "foundation/thread/fcondition.h"
#include "foundation/thread/fcpuinfo.h"
#include "foundation/thread/flockscope.h"
#include "foundation/thread/frwlock.h"
#include "foundation/thread/fsemaphore.h"
#include "foundation/thread/fthread.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

TEST(FLock, IsRecursiveAndKeepsOthersOut)
{
    FLock lock("lock");
    lock.lock();
    EXPECT_TRUE(lock.trylock());
    std::thread([&] { EXPECT_FALSE(lock.trylock()); }).join();
    lock.unlock();
    std::thread([&] { EXPECT_FALSE(lock.trylock()) << "still held once"; }).join();
    lock.unlock();
    std::thread(
        [&]
        {
            EXPECT_TRUE(lock.trylock());
            lock.unlock();
        })
        .join();
}

TEST(FCondition, SignalSticksUntilItIsUsedOrReset)
{
    FCondition condition;
    EXPECT_FALSE(condition.waitTimeout(0));
    condition.signal();
    condition.signal();
    EXPECT_TRUE(condition.waitTimeout(-1)) << "no limit";
    EXPECT_FALSE(condition.waitTimeout(1)) << "two signals with nobody waiting are one";
    condition.signalAll();
    condition.reset();
    EXPECT_FALSE(condition.waitTimeout(0));
}

TEST(FCondition, SignalAllLetsAllGoAndLeavesNothing)
{
    // A round counts if one signal sufficed: a waiter that comes late has to be let go by another one, which may stick.
    bool wasClean = false;
    while (!wasClean)
    {
        FCondition condition;
        FSemaphore passed(0, "passed");
        const auto body = [&]
        {
            condition.wait();
            passed.release(1);
        };
        std::thread first(body), second(body);
        FThreadSleep(20);
        condition.signalAll();
        int count = 0;
        wasClean = true;
        while (count < 2)
            if (passed.acquire(500))
                count++;
            else
            {
                wasClean = false;
                condition.signalAll();
            }
        first.join();
        second.join();
        EXPECT_TRUE(!wasClean || !condition.waitTimeout(0)) << "the last one leaves no signal behind";
    }
}

TEST(FCondition, SignalLetsOneOfTwoGo)
{
    FCondition condition;
    FCondition passed;
    std::atomic<int> count{0};
    const auto body = [&]
    {
        condition.wait();
        count++;
        passed.signal();
    };
    std::thread first(body), second(body);
    condition.signal();
    passed.wait();
    EXPECT_EQ(count, 1);
    condition.signal();
    passed.wait();
    first.join();
    second.join();
    EXPECT_EQ(count, 2);
}

TEST(FSemaphore, CountsPermits)
{
    FSemaphore semaphore(2, "permits");
    EXPECT_TRUE(semaphore.acquire(0));
    EXPECT_TRUE(semaphore.acquire(-1));
    EXPECT_FALSE(semaphore.acquire(1));
    semaphore.release(3);
    for (int i = 0; i < 3; i++)
        EXPECT_TRUE(semaphore.acquire(0));
    EXPECT_FALSE(semaphore.acquire(0));
}

TEST(FSemaphore, ReleaseOfAllLeavesNoPermitBehind)
{
    FSemaphore semaphore(0, "gate");
    semaphore.release(0);
    EXPECT_FALSE(semaphore.acquire(0));

    std::atomic<int> passed{0};
    std::vector<std::thread> waiters;
    for (int i = 0; i < 3; i++)
        waiters.emplace_back([&] { passed += semaphore.acquire(-1) ? 1 : 0; });
    while (passed < 3)
        semaphore.release(0);
    for (std::thread& waiter : waiters)
        waiter.join();
    EXPECT_FALSE(semaphore.acquire(0));
}

TEST(FSemaphore, HoldsNothingWhereItCannotBeMade)
{
    FSemaphore semaphore(-1, "none");
    semaphore.release(5);
    EXPECT_FALSE(semaphore.acquire(-1));
}

TEST(FRwLock, TheWriterMayReadAndWriteAgain)
{
    FRwLock lock("rw");
    lock.waitToWrite();
    lock.waitToWrite();
    lock.waitToRead();
    lock.doneReading();
    lock.doneWriting();
    lock.doneWriting();
    EXPECT_TRUE(lock.verify());
    lock.waitToRead();
    lock.waitToRead();
    lock.doneReading();
    lock.doneReading();
    EXPECT_TRUE(lock.verify());
    lock.doneReading();
    EXPECT_FALSE(lock.verify());
}

TEST(FRwLock, AReaderThatWantsToWriteWaitsForItself)
{
    struct Reader : FThread
    {
        Reader() : FThread("reader") {}
        int entry() override
        {
            lock.waitToRead();
            reads.signal();
            lock.waitToWrite();
            hasWritten = true;
            return 0;
        }
        FRwLock lock{"rw"};
        FCondition reads;
        std::atomic<bool> hasWritten{false};
    } reader;
    reader.run();
    reader.reads.wait();
    reader.terminate();
    EXPECT_TRUE(reader.waitDead(-1));
    EXPECT_FALSE(reader.hasWritten);
}

TEST(FRwLock, WritersExcludeEverybodyAndNobodyIsForgotten)
{
    FRwLock lock("rw");
    int value = 0;
    int copy = 0;
    std::atomic<int> torn{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < 2; i++)
        threads.emplace_back(
            [&]
            {
                for (int round = 0; round < 500; round++)
                {
                    lock.waitToWrite();
                    copy = ++value;
                    lock.doneWriting();
                }
            });
    for (int i = 0; i < 4; i++)
        threads.emplace_back(
            [&]
            {
                for (int round = 0; round < 500; round++)
                {
                    lock.waitToRead();
                    torn += value != copy ? 1 : 0;
                    lock.doneReading();
                }
            });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(value, 1000);
    EXPECT_EQ(torn, 0);
    EXPECT_TRUE(lock.verify());
}

// The last reader to come must not sleep on because others used up the signal of the only writer.
TEST(FRwLock, ReadersThatWaitForOneWriterAllComeIn)
{
    for (int round = 0; round < 200; round++)
    {
        FRwLock lock("rw");
        lock.waitToWrite();
        std::vector<std::thread> readers;
        for (int i = 0; i < 4; i++)
            readers.emplace_back(
                [&]
                {
                    lock.waitToRead();
                    lock.doneReading();
                });
        std::this_thread::yield();
        lock.doneWriting();
        for (std::thread& reader : readers)
            reader.join();
    }
}

TEST(FCpuInfo, TellsHowManyProcessorsThereAre)
{
    const FCpuInfo info;
    EXPECT_GE(info.countAvailable(), 1);
    EXPECT_GE(info.countPhysical(), 1);
    EXPECT_TRUE(info.isLogicalAvailable(info.countAvailable() - 1));
    EXPECT_FALSE(info.isLogicalAvailable(info.countAvailable()));
}
