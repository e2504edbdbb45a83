#include "tests/faults/faultproxy.h"
#include "tests/faults/faultrunner.h"
#include "tests/job/job.h"

#include <cstdlib>

namespace
{
using Kind = NetworkFault::Kind;

/// The connections of a run: the check of the token, then the upload.
enum Connection
{
    kTokenCheck,
    kUpload
};

/// How long a program may take that ends a silent transfer by itself.
constexpr std::chrono::minutes kEndsByItself{20};

/// The finished program, the service, and between them a proxy that spoils one connection of each run.
class Network : public Job
{
protected:
    Network() : proxy(servicePort())
    {
        logIn();
        useHost(proxy.host());
        description.configuration({{"GuiMode", "true"}});
        description.track({{"Path", tone()}});
    }

    struct Outcome
    {
        std::string printed;
        bool isHeld = false;
    };

    void plan(int connection, const NetworkFault& fault)
    {
        std::vector<NetworkFault> faults(static_cast<std::size_t>(connection) + 1);
        faults.back() = fault;
        proxy.plan(std::move(faults));
    }

    /// Whether the service has the track as it is on disk, among the requests behind the first `before`.
    bool isHeld(std::size_t before) const
    {
        const std::vector<ReceivedRequest> tracks = received("/tracks");
        for (std::size_t i = before; i < tracks.size(); i++)
            if (tracks[i].complete && tracks[i].fields.at(0).sha256 == sha256Of(exports / "tone.wav"))
                return true;
        return false;
    }

    Outcome runWith(int connection, const NetworkFault& fault)
    {
        plan(connection, fault);
        const std::size_t before = received("/tracks").size();
        Run run = start({writeDescription(description)});
        if (fault.kind == Kind::stall && proxy.waitForStalled())
        {
            EXPECT_TRUE(run.process->isRunning()) << "what stands still is no end";
            proxy.release();
        }
        Outcome result;
        result.printed = run.finish();
        result.isHeld = isHeld(before);
        return result;
    }

    /// What passes when nothing is wrong.
    std::vector<FaultProxy::Passed> measure()
    {
        const Outcome clean = runWith(kTokenCheck, NetworkFault());
        EXPECT_TRUE(clean.isHeld) << clean.printed;
        return proxy.passed();
    }

    std::string judge(const Outcome& outcome, int connection, const NetworkFault& fault)
    {
        const std::string where = std::string(nameOf(fault.kind)) + (fault.isReply ? " of the reply" : "") +
                                  " at byte " + std::to_string(fault.byte) + " of connection " +
                                  std::to_string(connection) + ":\n" + outcome.printed;
        const bool isTold = holds(outcome.printed, "Error Code:") || holds(outcome.printed, "could not be");
        EXPECT_TRUE(isTold || outcome.isHeld) << "not told, " << where;
        if (!isTold)
            return "uploaded";
        return outcome.isHeld ? "told, though the service has it" : "told";
    }

    void sweep(Kind kind, int connection, const FaultProxy::Passed& passed, long most)
    {
        Tally tally(std::string("network, ") + nameOf(kind) +
                    (connection == kUpload ? " in the upload" : " in the token check"));
        for (const bool isReply : {false, true})
        {
            const long count = isReply ? passed.replied : passed.sent;
            const std::vector<long> points = pointsOf(count, most);
            for (const long byte : points)
            {
                const NetworkFault fault = {kind, isReply, byte - 1};
                tally.note(judge(runWith(connection, fault), connection, fault));
            }
            tally.add(static_cast<long>(points.size()), count);
        }
    }

    FaultProxy proxy;
    SampleDescription description;
};
} // namespace

TEST_F(Network, ThatBreaksIsTold)
{
    const std::vector<FaultProxy::Passed> passed = measure();
    ASSERT_EQ(passed.size(), 2u);
    for (const Kind kind : {Kind::cut, Kind::reset, Kind::half})
    {
        sweep(kind, kTokenCheck, passed[kTokenCheck], 2);
        sweep(kind, kUpload, passed[kUpload], 4);
    }
}

TEST_F(Network, ThatIsSlowOrStallsOnlyWaits)
{
    const std::vector<FaultProxy::Passed> passed = measure();
    ASSERT_EQ(passed.size(), 2u);
    sweep(Kind::stall, kUpload, passed[kUpload], 3);
    for (const Kind kind : {Kind::delay, Kind::single})
    {
        for (const bool isReply : {false, true})
        {
            const NetworkFault fault = {kind, isReply, 0};
            EXPECT_EQ(judge(runWith(kUpload, fault), kUpload, fault), "uploaded");
        }
    }
}

TEST_F(Network, ThatStallsForEverEndsWithTheSession)
{
    plan(kUpload, {Kind::stall, false, 2000});
    const std::string file = writeDescription(description);
    Run run = start({file});
    ASSERT_TRUE(proxy.waitForStalled());
    ASSERT_TRUE(run.process->waitForOutput("(1 of 1)"));
    run.process->terminate();
    run.finish();
    EXPECT_TRUE(exists(file)) << "it was not uploaded";
}

// The limits are minutes: three programs wait at once, each with a process of its own, since there is no session bus.
TEST_F(Network, ThatStallsForGoodEndsEveryTransfer)
{
    if (!std::getenv("FAULTS_FULL"))
        GTEST_SKIP() << "takes minutes: part of scripts/faults";
    const FaultProxy::Passed upload = measure().at(kUpload);
    setVariable("DBUS_SESSION_BUS_ADDRESS", "");
    setVariable("XDG_RUNTIME_DIR", root / "none");
    // The connections in their order: of the first two programs one each for the check of the token.
    const NetworkFault none, sending = {Kind::stall, false, 1 << 20},
                             reply = {Kind::stall, true, upload.replied - 40}, check = {Kind::stall, true, 0};
    proxy.plan({none, sending, none, reply, check});
    SampleDescription large;
    large.track({{"Path", writeFile("large.wav", std::string(64 << 20, 'a'))}});

    Tally tally("network, stall for good");
    std::vector<Run> runs;
    runs.push_back(start({writeDescription(large, "large.xml")}));
    ASSERT_TRUE(proxy.waitForStalled(1));
    for (const int stalled : {2, 3})
    {
        runs.push_back(start({writeDescription(description, std::to_string(stalled) + ".xml")}));
        ASSERT_TRUE(proxy.waitForStalled(stalled));
    }
    for (Run& run : runs)
    {
        EXPECT_EQ(run.process->wait(kEndsByItself), 0);
        EXPECT_HOLDS(run.process->output(), "Internal program error.\nError Code: 1028");
        tally.note("told");
    }
    tally.add(static_cast<long>(runs.size()), static_cast<long>(runs.size()));
}
