#include "uploadmanager/silencewatch.h"

#include <gtest/gtest.h>

namespace
{
using namespace std::chrono_literals;
using Bytes = SilenceWatch::Bytes;
using Verdict = SilenceWatch::Verdict;

class Silence : public testing::Test
{
protected:
    /// Looks once a second while nothing changes. Gives the last verdict.
    Verdict pass(const Bytes& bytes, std::chrono::seconds time)
    {
        Verdict verdict = watch.look(bytes, now);
        for (const auto end = now + time; now < end;)
            verdict = watch.look(bytes, now += 1s);
        return verdict;
    }

    /// Shows the bytes, and gives how long they may stand still before the verdict.
    std::chrono::seconds limitOf(const Bytes& bytes, Verdict expected)
    {
        watch = SilenceWatch();
        const auto start = now;
        Verdict verdict = watch.look(bytes, now);
        while (verdict == Verdict::kMoving && now - start < 1h)
            verdict = watch.look(bytes, now += 1s);
        EXPECT_EQ(verdict, expected);
        EXPECT_EQ(watch.isNetworkSilent(), expected == Verdict::kNetworkSilent);
        return std::chrono::duration_cast<std::chrono::seconds>(now - start) - 1s;
    }

    SilenceWatch watch;
    SilenceWatch::Time now{1h};
};
} // namespace

TEST_F(Silence, HasALimitForEachStageOfATransfer)
{
    EXPECT_EQ(limitOf({0, 0, 0, 0}, Verdict::kNetworkSilent), 5min) << "connecting";
    EXPECT_EQ(limitOf({0, 0, 0, 300}, Verdict::kNetworkSilent), 2min) << "a request without a body";
    EXPECT_EQ(limitOf({1000, 0, 0, 0}, Verdict::kNetworkSilent), 2min) << "nothing sent as yet";
    EXPECT_EQ(limitOf({1000, 500, 0, 20}, Verdict::kNetworkSilent), 2min) << "sending";
    EXPECT_EQ(limitOf({1000, 500, 0, -1}, Verdict::kNetworkSilent), 2min) << "who takes it isn't known";
    EXPECT_EQ(limitOf({1000, 1000, 0, 20}, Verdict::kNetworkSilent), 2min) << "the rest is under way";
    EXPECT_EQ(limitOf({1000, 1000, 0, 0}, Verdict::kNetworkSilent), 5min) << "waiting for the reply";
    EXPECT_EQ(limitOf({1000, 1000, 70, 0}, Verdict::kNetworkSilent), 5min) << "in the midst of it";
    EXPECT_EQ(limitOf({1000, 500, 0, 0}, Verdict::kFileEnded), 5s) << "all is taken, and no more comes";
}

TEST_F(Silence, EndsWithAnyByteInEitherDirection)
{
    Bytes bytes = {1000, 500, 0, 400};
    for (int i = 0; i < 5; i++)
    {
        EXPECT_EQ(pass(bytes, 119s), Verdict::kMoving);
        bytes.sent += 1;
        EXPECT_EQ(pass(bytes, 119s), Verdict::kMoving);
        bytes.untaken -= 1;
        EXPECT_EQ(pass(bytes, 119s), Verdict::kMoving);
        bytes.received += 1;
    }
    EXPECT_EQ(pass(bytes, 121s), Verdict::kNetworkSilent);
}

TEST_F(Silence, OfTheServiceBeginsWhenItHasTakenAll)
{
    EXPECT_EQ(pass({1000, 1000, 0, 1}, 119s), Verdict::kMoving);
    EXPECT_EQ(pass({1000, 1000, 0, 0}, 299s), Verdict::kMoving);
    EXPECT_EQ(pass({1000, 1000, 0, 0}, 2s), Verdict::kNetworkSilent);
}

TEST_F(Silence, CountsNoTimeInWhichNobodyLooked)
{
    EXPECT_EQ(pass({1000, 500, 0, 20}, 100s), Verdict::kMoving);
    now += 10h;
    EXPECT_EQ(pass({1000, 500, 0, 20}, 10s), Verdict::kMoving);
    EXPECT_EQ(pass({1000, 500, 0, 20}, 10s), Verdict::kNetworkSilent);

    EXPECT_EQ(pass({1000, 500, 0, 0}, 1s), Verdict::kMoving);
    now += 10h;
    EXPECT_EQ(pass({1000, 500, 0, 0}, 1s), Verdict::kMoving);
}

TEST_F(Silence, IsNotLookedForAtEveryCall)
{
    EXPECT_TRUE(watch.isDue(now));
    watch.look({1000, 500, 0, 20}, now);
    EXPECT_FALSE(watch.isDue(now + 100ms));
    EXPECT_TRUE(watch.isDue(now + 900ms)) << "a second may be cut a little short";
}
