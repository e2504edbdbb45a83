#include "tests/faults/faultrunner.h"
#include "tests/job/job.h"

#include <cerrno>
#include <set>

namespace fs = std::filesystem;

namespace
{
constexpr int kOutOfMemory = 1;
constexpr int kTrap = 128 + 5;
constexpr int kAbort = 128 + 6;
constexpr int kKilled = 128 + 9;

constexpr const char* kCache = "Vellamoor Upload Manager Cache";

struct Calls
{
    FaultKind kind;
    int error;
};

constexpr Calls kCalls[] = {{kOpenCalls, EACCES},       {kReadCalls, EIO},      {kWriteCalls, ENOSPC},
                            {kSyncCalls, EIO},          {kRenameCalls, EACCES}, {kSendCalls, ECONNRESET},
                            {kReceiveCalls, ECONNRESET}};

/// The finished program with one fault in each of its runs, which all begin alike.
class Calling : public Job
{
protected:
    void SetUp() override
    {
        if (const std::string reason = whyUnsupervised(); !reason.empty())
            GTEST_SKIP() << reason;
        // A browser would go through with a login while the next run begins.
        fs::remove(configHome / "mimeapps.list");
        fs::remove_all(root / "data" / "applications");
    }

    struct Outcome
    {
        std::optional<int> code;
        std::string printed;
        FaultReport report;
        /// Whether the service holds the track whole.
        bool isHeld = false;
        /// Whether the description waits for a login, to which the browser was sent.
        bool isWaiting = false;
    };

    /// Makes the state before a run and gives what the program is started with.
    virtual Arguments prepare() = 0;
    /// What scat.xml may hold after a run.
    virtual std::set<std::string> tokenFiles() const = 0;

    std::string freshDescription()
    {
        SampleDescription description = minimal();
        description.configuration({{"GuiMode", "true"}});
        return writeDescription(description);
    }

    Outcome runWith(const Fault& fault)
    {
        fs::remove_all(userFolder);
        writeUserFile("Defaults", settings());
        const Arguments arguments = prepare();
        const std::size_t before = received("/tracks").size();
        launcher = launcherFor(fault, root / "report");
        Run run = start(arguments);
        launcher.clear();
        Outcome result;
        result.code = run.process->wait(kHangs);
        result.printed = run.process->output();
        result.report = readReport(root / "report");
        const std::vector<ReceivedRequest> tracks = received("/tracks");
        for (std::size_t i = before; i < tracks.size(); i++)
            result.isHeld = result.isHeld || (tracks[i].complete && tracks[i].status / 100 == 2);
        result.isWaiting = exists(exports / "description.xml") && exists(userFile(kCache));
        return result;
    }

    /// Every file of the user folder is a whole version, and the tokens are those before or after.
    void expectWholeFolder(const std::string& where) const
    {
        EXPECT_EQ(tokenFiles().count(contentsOf(userFile("scat"))), 1u)
            << where << ": " << contentsOf(userFile("scat"));
        EXPECT_EQ(contentsOf(userFile("Defaults")), settings()) << where;
        for (const fs::directory_entry& file : fs::directory_iterator(userFolder))
        {
            // A version that never was completed has a name that nothing reads.
            const std::string bytes = contentsOf(file.path());
            const bool isWhole = bytes.starts_with("<?xml") && bytes.ends_with(">\r");
            EXPECT_TRUE(isWhole || file.path().extension() == ".new") << where << ": " << file.path();
        }
    }

    /// The library on which the main loop stands ends the program by itself where it finds no memory.
    static bool isEndWithoutMemory(const Outcome& outcome)
    {
        if (outcome.code == kOutOfMemory)
            return holds(outcome.printed, "Out of memory.");
        return (outcome.code == kTrap || outcome.code == kAbort) &&
               (holds(outcome.printed, "failed to allocate") || holds(outcome.printed, "emory"));
    }

    std::string judge(const Outcome& outcome, const std::string& where, bool isAllocation)
    {
        expectWholeFolder(where);
        if (!outcome.code)
        {
            ADD_FAILURE() << where << " hangs:\n" << outcome.printed;
            return "hangs";
        }
        if (isAllocation && isEndWithoutMemory(outcome))
            return "ended without memory";
        EXPECT_EQ(*outcome.code, 0) << where << ":\n" << outcome.printed;
        const bool isTold = !outcome.printed.empty() && isComplaint(outcome.printed);
        EXPECT_TRUE(outcome.isHeld || isTold || outcome.isWaiting)
            << where << " lost the track without a word:\n"
            << outcome.printed;
        if (*outcome.code != 0)
            return "crashed";
        return isTold ? "told" : outcome.isHeld ? "done" : "login asked for";
    }

    /// More than the progress of an upload.
    static bool isComplaint(const std::string& printed)
    {
        for (const char* text :
             {"Error Code:", "could not be", "Do you want to retry", "Out of memory", "rror"})
            if (holds(printed, text))
                return true;
        return false;
    }

    void sweepCalls(const std::string& subject, long most)
    {
        Fault counting;
        const Outcome clean = runWith(counting);
        ASSERT_EQ(clean.code, 0) << clean.printed;
        ASSERT_TRUE(clean.isHeld) << clean.printed;
        for (const auto& [kind, error] : kCalls)
        {
            const std::string name(kFaultKindNames[kind]);
            Tally tally(subject + ", failing " + name);
            const long count = clean.report.countOf(kind);
            const std::vector<long> points = pointsOf(count, most);
            for (const long number : points)
            {
                Fault fault;
                fault.kind = kind;
                fault.number = number;
                fault.error = error;
                tally.note(
                    judge(runWith(fault), subject + ", " + name + " " + std::to_string(number), false));
            }
            tally.add(static_cast<long>(points.size()), count);
        }
    }

    void sweepAllocations(const std::string& subject, long most)
    {
        Tally tally(subject + ", failing malloc");
        Fault fault;
        fault.allocation = 0;
        const long count = runWith(fault).report.countOf("malloc");
        ASSERT_GT(count, 0);
        const std::vector<long> points = pointsOf(count, most);
        for (const long number : points)
        {
            fault.allocation = number;
            tally.note(judge(runWith(fault), subject + ", malloc " + std::to_string(number), true));
        }
        tally.add(static_cast<long>(points.size()), count);
    }

    /// Kills the program before each change that it makes in the user folder; the next start finds its files.
    void sweepKills(const std::string& subject, long most)
    {
        Tally tally(subject + ", killed");
        Fault fault;
        fault.folder = userFolder;
        const long count = runWith(fault).report.countOf(kChangeCalls);
        ASSERT_GT(count, 0);
        const std::vector<long> points = pointsOf(count, most);
        for (const long number : points)
        {
            const std::string where = subject + ", killed before change " + std::to_string(number);
            fault.number = number;
            const Outcome outcome = runWith(fault);
            tally.note(outcome.code == kKilled ? "killed" : "ended before");
            dropUnsynced(userFolder, outcome.report);
            expectWholeFolder(where);
            expectNextStart(where);
        }
        tally.add(static_cast<long>(points.size()), count);
    }

    /// A start with what the tokens are now uploads, or asks for a login.
    void expectNextStart(const std::string& where)
    {
        const std::size_t before = received("/tracks").size();
        const bool hasToken = contentsOf(userFile("scat")).find("Loomrit") != std::string::npos;
        const std::string printed = run({freshDescription()});
        EXPECT_LACKS(printed, "Error Code:") << where;
        EXPECT_EQ(received("/tracks").size() - before, hasToken ? 1u : 0u) << where << ":\n" << printed;
    }

    /// As the program writes them; it changes none by itself.
    static std::string settings()
    {
        return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<Defaults>\r   <rootObjects>\r"
               "      <root name=\"Defaults\">\r         <list name=\"Entries\" type=\"list\">\r            "
               "<item>\r"
               "               <string name=\"Group\" value=\"g\"/>\r               <member "
               "name=\"Values\">\r"
               "                  <int name=\"k\" value=\"7\"/>\r               </member>\r"
               "               <int name=\"Version\" value=\"0\"/>\r            </item>\r"
               "         </list>\r      </root>\r   </rootObjects>\r</Defaults>\r";
    }

    std::string knownTokens() const { return attributeFile("scat", {{"Loomrit", base64(token())}}); }
};

/// A description with a token that holds.
class Uploading : public Calling
{
protected:
    Arguments prepare() override
    {
        logIn();
        return {freshDescription()};
    }
    std::set<std::string> tokenFiles() const override { return {knownTokens()}; }
};

/// The redirect of a login, for which a description waits.
class LoggingIn : public Calling
{
protected:
    Arguments prepare() override
    {
        writeUserFile("scat", otherTokens());
        writeUserFile(kCache, attributeFile("VellamoorUploadManagerCache",
                                            {{"latest request file", freshDescription()}}, true));
        return {"vlmr://loomrit/successfullLogin?code=1#access_token=" + token()};
    }
    std::set<std::string> tokenFiles() const override
    {
        return {otherTokens(),
                attributeFile("scat", {{"Loomrit", base64(token())}, {"Plenar", base64("other")}})};
    }

private:
    /// Which no login of another product may lose.
    static std::string otherTokens() { return attributeFile("scat", {{"Plenar", base64("other")}}); }
};
} // namespace

TEST_F(Uploading, EndsAndTellsWhicheverCallFails)
{
    sweepCalls("upload", 14);
}

TEST_F(Uploading, EndsWhicheverAllocationFails)
{
    sweepAllocations("upload", 25);
}

TEST_F(LoggingIn, EndsAndTellsWhicheverCallFails)
{
    sweepCalls("login", 4);
}

TEST_F(LoggingIn, EndsWhicheverAllocationFails)
{
    sweepAllocations("login", 15);
}

TEST_F(LoggingIn, IsFoundAgainAfterAPowerLoss)
{
    sweepKills("login", 12);
}
