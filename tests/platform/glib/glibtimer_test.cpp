#include "foundation/object/iptr.h"
#include "platform/glib/glibtimer.h"

#include <gtest/gtest.h>

#include <functional>

namespace
{
struct Ticks : ITimerCallback
{
    void onTimer() override
    {
        count++;
        if (reaction)
            reaction();
    }
    int count = 0;
    std::function<void()> reaction;
};

void iterateUntil(const std::function<bool()>& isReached)
{
    while (!isReached())
        g_main_context_iteration(nullptr, TRUE);
}
} // namespace

TEST(GlibTimer, TicksUntilItIsStopped)
{
    Ticks ticks, others;
    const auto timer = adopt(IPlatformTimer::make(&ticks, 1));
    iterateUntil([&] { return ticks.count >= 3; });
    timer->stop();
    timer->stop();
    const int count = ticks.count;
    const auto other = adopt(IPlatformTimer::make(&others, 1));
    iterateUntil([&] { return others.count >= 3; });
    EXPECT_EQ(ticks.count, count);
}

TEST(GlibTimer, TicksInALoopThatIsRunInsideATick)
{
    Ticks ticks;
    const auto timer = adopt(IPlatformTimer::make(&ticks, 1));
    ticks.reaction = [&]
    {
        ticks.reaction = nullptr;
        const int outer = ticks.count;
        iterateUntil([&] { return ticks.count > outer; });
    };
    iterateUntil([&] { return ticks.count >= 2; });
}

TEST(GlibTimer, MayBeReleasedByItsOwnTick)
{
    Ticks ticks;
    auto timer = adopt(IPlatformTimer::make(&ticks, 1));
    ticks.reaction = [&] { timer = nullptr; };
    iterateUntil([&] { return ticks.count == 1; });
    EXPECT_FALSE(timer);
}

TEST(GlibTimer, StaysBelowPaintingAndCanBeSilenced)
{
    Ticks ticks, others;
    GlibTimer::timersEnabled = false;
    const auto timer = adopt(IPlatformTimer::make(&ticks, 1));
    bool isPainted = false;
    // Painting at its priority comes first whenever both are ready.
    g_timeout_add_full(
        G_PRIORITY_HIGH_IDLE + 20, 20,
        [](gpointer flag) -> gboolean
        {
            *static_cast<bool*>(flag) = true;
            return G_SOURCE_REMOVE;
        },
        &isPainted, nullptr);
    iterateUntil([&] { return isPainted; });
    EXPECT_EQ(ticks.count, 0);
    GlibTimer::timersEnabled = true;
    iterateUntil([&] { return ticks.count > 0; });
}
