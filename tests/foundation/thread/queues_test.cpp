#include "foundation/thread/flockfreequeue.h"
#include "foundation/thread/fpreferqueue.h"
#include "foundation/thread/fqueue.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

namespace
{
int gDeleted = 0;
int items[8];

void countDeleted(void*)
{
    gDeleted++;
}
} // namespace

TEST(FQueue, HasTwoEnds)
{
    FQueue queue;
    EXPECT_EQ(queue.removeFirst(), nullptr);
    EXPECT_EQ(queue.removeLast(), nullptr);
    queue.append(&items[1]);
    queue.append(&items[2]);
    queue.prepend(&items[0]);
    EXPECT_EQ(queue.removeLast(), &items[2]);
    EXPECT_EQ(queue.removeFirst(), &items[0]);
    EXPECT_EQ(queue.removeFirst(), &items[1]);
    EXPECT_TRUE(queue.isEmpty());
}

TEST(FPreferQueue, MovesTheFirstEntryOfAnIdToTheFront)
{
    FPreferQueue queue;
    int id[3];
    queue.append(&items[0], &id[0]);
    queue.append(&items[1], &id[1]);
    queue.append(&items[2], &id[1]);
    queue.prepend(&items[3], nullptr);

    EXPECT_FALSE(queue.prefer(&id[2])) << "an unknown id";
    EXPECT_FALSE(queue.idExists(&id[2]));
    EXPECT_TRUE(queue.prefer(&id[1]));
    EXPECT_TRUE(queue.prefer(&id[1])) << "is the first already";

    void* found = nullptr;
    EXPECT_EQ(queue.removeFirst(&found), &items[1]);
    EXPECT_EQ(found, &id[1]);
    EXPECT_TRUE(queue.idExists(&id[1])) << "its second entry";
    EXPECT_EQ(queue.removeLast(&found), &items[2]);
    EXPECT_EQ(found, &id[1]);
    EXPECT_EQ(queue.removeFirst(nullptr), &items[3]);
    EXPECT_EQ(queue.removeFirst(&found), &items[0]);
    EXPECT_EQ(queue.removeFirst(&found), nullptr);
    EXPECT_EQ(found, nullptr);
}

TEST(FLockFreeQueue, RefusesThePushThatWouldMeetTheReader)
{
    FLockFreeQueue queue(4, nullptr);
    EXPECT_EQ(queue.pop(), nullptr);
    EXPECT_EQ(queue.peek(), nullptr);
    ASSERT_TRUE(queue.push(&items[0]));
    EXPECT_EQ(queue.pop(), &items[0]);
    for (int i = 1; i <= 3; i++)
        EXPECT_TRUE(queue.push(&items[i]));
    EXPECT_FALSE(queue.push(&items[4]));
    EXPECT_EQ(queue.peek(), &items[1]);
    for (int i = 1; i <= 3; i++)
        EXPECT_EQ(queue.pop(), &items[i]);
}

TEST(FLockFreeQueue, DoesNotKnowAFullRingWhileTheReaderStandsAtTheStart)
{
    FLockFreeQueue queue(4, nullptr);
    for (int i = 0; i < 4; i++)
        EXPECT_TRUE(queue.push(&items[i]));
    EXPECT_TRUE(queue.isEmpty());
    EXPECT_EQ(queue.pop(), nullptr);
}

TEST(FLockFreeQueue, GivesWhatIsLeftToItsDeleter)
{
    gDeleted = 0;
    {
        FLockFreeQueue queue(8, &countDeleted);
        for (int i = 0; i < 5; i++)
            queue.push(&items[i]);
        queue.pop();
        queue.flush();
        EXPECT_EQ(gDeleted, 4);
        queue.push(&items[0]);
    }
    EXPECT_EQ(gDeleted, 5);
    FLockFreeQueue none(0, &countDeleted);
    EXPECT_FALSE(none.push(&items[0]));
}

TEST(FLockFreeQueue, CarriesEverythingFromOneThreadToAnother)
{
    constexpr intptr_t kCount = 20000;
    FLockFreeQueue queue(64, nullptr);
    std::atomic<intptr_t> taken{0};
    std::thread producer(
        [&]
        {
            // Never so many at once that the ring's edge is reached.
            for (intptr_t number = 1; number <= kCount;)
                if (number - taken < 60 && queue.push(reinterpret_cast<void*>(number)))
                    number++;
                else
                    std::this_thread::yield();
        });
    while (taken < kCount)
    {
        void* item = queue.pop();
        if (!item)
            std::this_thread::yield();
        else
            ASSERT_EQ(reinterpret_cast<intptr_t>(item), ++taken);
    }
    producer.join();
    EXPECT_TRUE(queue.isEmpty());
}
