#include "applicationfixture.h"

#include "foundation/message/updatehandler.h"

#include <atomic>
#include <thread>
#include <utility>

namespace
{
class Client : public CmObject
{
public:
    explicit Client(std::string label) : name(std::move(label)) {}
    int notify(FMessage* message) override
    {
        note(name + " " + message->getMessageID());
        ticks = message->getData("CurrentTicks");
        if (reaction)
            reaction();
        return 0;
    }

    std::function<void()> reaction;
    int64 ticks = 0;

private:
    std::string name;
};

class Mortal : public CmObject
{
public:
    explicit Mortal(std::function<void()> lastWords = nullptr) : atEnd(std::move(lastWords)) {}
    ~Mortal() override
    {
        note("destroyed");
        if (atEnd)
            atEnd();
    }

private:
    std::function<void()> atEnd;
};

class IdlePulse : public ApplicationTest
{
protected:
    /// The way to the clock of a controller.
    struct Clock : UController
    {
        static int64& idealNextIdleOf(UController& controller) { return controller.*(&Clock::idealNextIdle); }
    };

    IdlePulse() : application(adopt(new NotedApplication)) { gEvents.clear(); }
    ~IdlePulse() override
    {
        gController->removeIdle(&a);
        gController->removeIdle(&b);
    }

    static void post(Client& client, const char* type)
    {
        gMessenger->postMessage(&client, new FMessage(type));
    }

    IPtr<NotedApplication> application;
    Client a{"a"}, b{"b"};
};
} // namespace

TEST_F(IdlePulse, TellsItsClientsAndDeliversMessages)
{
    gController->addIdle(&a);
    gController->addIdle(&b);
    gController->addIdle(&a);
    post(a, "posted");
    const int64 before = UController::getTicks();
    EXPECT_TRUE(gController->onIdle(false));
    EXPECT_EQ(gEvents, (Lines{"a Idle", "b Idle", "a posted"}));
    EXPECT_GE(b.ticks, before);
    EXPECT_LE(b.ticks, UController::getTicks());
    gController->removeIdle(&a);
    gController->onIdle(false);
    EXPECT_EQ(gEvents.back(), "b Idle");
    EXPECT_EQ(gEvents.size(), 4u);
}

TEST_F(IdlePulse, EveryShareComesInItsTurn)
{
    struct Desktop : UDesktop
    {
        void onIdle() override { note("desktop"); }
    } desktop;
    struct Steps : NotedSteps
    {
        void idlePlugObjects() override { note(gController->isInIdleDispatch() ? "plug-ins" : "too late"); }
        void serveModalPlugDialog() override { note("modal dialog"); }
    } shares;
    UDesktop* former = std::exchange(gDesktop, &desktop);
    ApplicationSteps::set(&shares);
    gController->addIdle(&a);
    gController->deferDestruction(new Mortal);
    post(b, "posted");
    gController->onIdle(false);
    ApplicationSteps::set(&steps);
    gDesktop = former;
    EXPECT_EQ(gEvents, (Lines{"desktop", "a Idle", "plug-ins", "destroyed", "b posted", "modal dialog"}));
    EXPECT_FALSE(gController->isInIdleDispatch());
}

TEST_F(IdlePulse, AClientIsNotTakenOutByAnotherThreadWhileItIsTold)
{
    gController->addIdle(&a);
    std::atomic<bool> isOut{false};
    std::thread other;
    a.reaction = [&]
    {
        other = std::thread(
            [&]
            {
                gController->removeIdle(&a);
                isOut = true;
            });
        UController::wait(20);
        EXPECT_FALSE(isOut);
    };
    gController->onIdle(false);
    other.join();
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"a Idle"}));
}

TEST_F(IdlePulse, ClientsComeAndGoDuringTheDispatch)
{
    gController->addIdle(&a);
    a.reaction = [this]
    {
        EXPECT_TRUE(gController->isInIdleDispatch());
        gController->addIdle(&b);
    };
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"a Idle", "b Idle"})) << "the count is read anew each round";
    gEvents.clear();
    a.reaction = [this] { gController->removeIdle(&b); };
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"a Idle"}));
}

TEST_F(IdlePulse, APulseWithinAPulseOnlyDelivers)
{
    gController->addIdle(&a);
    a.reaction = [this]
    {
        a.reaction = nullptr;
        post(b, "inner");
        EXPECT_TRUE(gController->onIdle(false));
        note("inner pulse over");
    };
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"a Idle", "b inner", "inner pulse over"}));
    gController->onIdle(false);
    EXPECT_EQ(gEvents.back(), "a Idle");
}

TEST_F(IdlePulse, DeliversBetweenTwoRoundsOfChanges)
{
    struct Dependent : CmObject
    {
        using CmObject::update;
        void update(FUnknown*, int message) override { note("change " + std::to_string(message)); }
    } dependent;
    CmObject source;
    source.addDependent(&dependent);
    source.deferUpdate(1);
    a.reaction = [&] { source.deferUpdate(3); };
    post(a, "posted");
    gController->updateDependencies();
    EXPECT_EQ(gEvents, (Lines{"change 1", "a posted", "change 3"}));
    source.removeDependent(&dependent);
}

TEST_F(IdlePulse, ASuspendedPulseDoesNothing)
{
    gController->addIdle(&a);
    post(a, "posted");
    EXPECT_FALSE(gController->suspendIdle(true));
    EXPECT_FALSE(gController->onIdle(false));
    gController->updateDependencies();
    EXPECT_TRUE(gEvents.empty());
    EXPECT_TRUE(gController->suspendIdle(false));
    gController->onIdle(false);
    EXPECT_EQ(gEvents.size(), 2u);
}

TEST_F(IdlePulse, ThrottledPulsesKeepTheirDistance)
{
    int64& idealNextIdle = Clock::idealNextIdleOf(*gController);
    gController->addIdle(&a);
    const auto isSkipped = [&](int64 ahead)
    {
        gEvents.clear();
        idealNextIdle = UController::getTicks() + ahead;
        EXPECT_TRUE(gController->onIdle(true));
        return gEvents.empty();
    };
    EXPECT_TRUE(isSkipped(100000));
    EXPECT_EQ(idealNextIdle, 0) << "a time far ahead is not waited for twice";
    EXPECT_TRUE(gController->onIdle(true));
    EXPECT_EQ(gEvents.size(), 1u);
    EXPECT_FALSE(isSkipped(0));
    EXPECT_FALSE(isSkipped(5)) << "five milliseconds early is near enough";

    // On a busy machine the clock may run out from under a try.
    while (!isSkipped(10))
        ;
    EXPECT_GT(idealNextIdle, 0) << "a near time stays";
    idealNextIdle = 0;
    gController->onIdle(false);
    EXPECT_GT(idealNextIdle, 0) << "an unthrottled pulse counts too";
    EXPECT_LE(idealNextIdle, UController::getTicks() + 10);
}

TEST_F(IdlePulse, ObjectsAreDestroyedLaterAndUntilNoneIsLeft)
{
    gController->deferDestruction(new Mortal([] { gController->deferDestruction(new Mortal); }));
    std::thread([] { gController->deferDestruction(new Mortal); }).join();
    EXPECT_TRUE(gEvents.empty());
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"destroyed", "destroyed", "destroyed"}));
}

TEST_F(IdlePulse, AlertsAndPopupsFromOtherThreadsComeAtThePulse)
{
    std::thread(
        []
        {
            gController->deferAlert(u"From afar");
            gController->deferPopupMessage(u"Briefly", 500);
        })
        .join();
    testing::internal::CaptureStderr();
    gController->onIdle(false);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "From afar\n");
    EXPECT_EQ(gEvents, (Lines{"popup Briefly 500"}));
    FMessage unknown("something else");
    EXPECT_EQ(gController->notify(&unknown), 0);
}
