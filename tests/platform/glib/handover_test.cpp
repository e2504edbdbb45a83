#include "application/uapplication.h"
#include "application/ucontroller.h"
#include "application/urlscheme.h"
#include "foundation/object/iptr.h"
#include "foundation/thread/fthread.h"

#include <gtest/gtest.h>

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

// The processes are this very program: it starts itself with the role of a process of an application, which notes
// what it gets in a file.

namespace
{
using Lines = std::vector<std::string>;

constexpr char kRole[] = "HandOverRole.DISABLED_Application";
constexpr char kArguments[] = "HANDOVER_TEST_ARGUMENTS";
constexpr char kLog[] = "HANDOVER_TEST_LOG";

Lines linesOf(const std::string& text)
{
    Lines lines;
    size_t start = 0;
    for (size_t end = text.find('\n'); end != std::string::npos; end = text.find('\n', start))
    {
        lines.push_back(text.substr(start, end - start));
        start = end + 1;
    }
    return lines;
}

void logLine(const std::string& line)
{
    std::ofstream(getenv(kLog), std::ios::app) << line << '\n';
}

/// Notes files and URLs, and obeys some URLs.
class LoggingApplication : public UApplication, private IURLSchemeHandler
{
public:
    LoggingApplication() : UApplication(kAppTypeStandalone, "Hand-over Test")
    {
        URLScheme::setHandler("vlmr", this);
    }
    ~LoggingApplication() override
    {
        URLScheme::setHandler("vlmr", nullptr);
        if (endsSlowly)
            FThreadSleep(300);
        logLine("gone");
    }
    void postInit() override {}
    void performStartupActions() override { logLine("started"); }
    bool openFile(FPath* path, FPath*) override
    {
        logLine("file " + static_cast<FNPath*>(path)->platformPath());
        return true;
    }
    bool isModal() override { return modal; }

private:
    void openURL(const char* url) override
    {
        logLine(std::string("url ") + url);
        const std::string command = url;
        if (command == "vlmr:modal")
            modal = true;
        if (command == "vlmr:slowly")
            endsSlowly = true;
        if (command == "vlmr:never")
            FThreadSleep(-1);
        if (command == "vlmr:slowly" || command == "vlmr:end")
            gController->quit(false);
    }

    bool modal = false;
    bool endsSlowly = false;
};

class HandOver : public testing::Test
{
protected:
    // TMPDIR is changed for the processes.
    static inline const std::string temporary = testing::TempDir();

    HandOver() : folder(temporary + "handover_test." + std::to_string(getpid())), log(folder + "/log")
    {
        std::filesystem::create_directories(folder + "/here");
        std::filesystem::create_directories(folder + "/there");
        setenv("HOME", folder.c_str(), 1);
        setenv("TMPDIR", folder.c_str(), 1);
        setenv(kLog, log.c_str(), 1);
        startBus();
    }
    ~HandOver() override
    {
        kill(bus, SIGTERM);
        waitForExit(bus);
        std::filesystem::remove_all(folder);
    }

    void startBus()
    {
        int ends[2];
        ASSERT_EQ(pipe(ends), 0);
        bus = forkBound();
        if (bus == 0)
        {
            dup2(ends[1], STDOUT_FILENO);
            execlp("dbus-daemon", "dbus-daemon", "--session", "--nofork", "--print-address=1", nullptr);
            _exit(99);
        }
        close(ends[1]);
        char address[512] = {};
        ASSERT_GT(read(ends[0], address, sizeof address - 1), 0) << "dbus-daemon is needed";
        close(ends[0]);
        setenv("DBUS_SESSION_BUS_ADDRESS", linesOf(address).at(0).c_str(), 1);
    }

    /// A child that doesn't outlive a test which is broken off.
    static pid_t forkBound()
    {
        const pid_t child = fork();
        if (child == 0)
            prctl(PR_SET_PDEATHSIG, SIGKILL);
        return child;
    }

    /// Starts a process of the application in a folder below that of the test.
    pid_t start(const char* where, const Lines& arguments)
    {
        std::string joined;
        for (const std::string& argument : arguments)
            joined += argument + '\n';
        const pid_t child = forkBound();
        if (child != 0)
            return child;
        setenv(kArguments, joined.c_str(), 1);
        if (chdir((folder + "/" + where).c_str()) == 0)
            execl("/proc/self/exe", "handover", ("--gtest_filter=" + std::string(kRole)).c_str(),
                  "--gtest_also_run_disabled_tests", "--gtest_brief=1", nullptr);
        _exit(99);
    }

    static int waitForExit(pid_t child)
    {
        int status = 0;
        waitpid(child, &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    Lines logged() const
    {
        std::ifstream file(log);
        return linesOf(std::string(std::istreambuf_iterator<char>(file), {}));
    }

    /// Waits for a line to have come this many times.
    void awaitLine(const std::string& line, int count = 1) const
    {
        for (;;)
        {
            const Lines lines = logged();
            if (std::count(lines.begin(), lines.end(), line) >= count)
                return;
            FThreadSleep(5);
        }
    }

    std::string folder;
    std::string log;
    pid_t bus = 0;
};
} // namespace

// Not a test: the role of an application's process.
TEST(HandOverRole, DISABLED_Application)
{
    Lines arguments = linesOf(getenv(kArguments));
    arguments.insert(arguments.begin(), "handover");
    std::vector<char*> pointers;
    for (std::string& argument : arguments)
        pointers.push_back(argument.data());
    pointers.push_back(nullptr);
    Argc = static_cast<int>(arguments.size());
    Argv = pointers.data();

    auto application = adopt(new LoggingApplication);
    if (gController->isDone())
        application->requestExit();
    application->run();
}

TEST_F(HandOver, TheSecondStartGivesItsArgumentsToTheFirstByteForByte)
{
    const pid_t first = start("here", {"./own.xml", "vlmr:own"});
    awaitLine("started");
    const Lines arguments{"vlmr://plenar/x?a=%20b&c=\xff+..//../#f=\xc3\xa9",
                          "rel/\xc3\xb6.xml",
                          "/abs/\xff\xfe.xml",
                          "file:///with%20blank/x.xml",
                          "",
                          "-v",
                          "other:x"};
    EXPECT_EQ(waitForExit(start("there", arguments)), 0);
    EXPECT_EQ(waitForExit(start("there", {})), 0);
    EXPECT_EQ(waitForExit(start("there", {"vlmr:end"})), 0);
    EXPECT_EQ(waitForExit(first), 0);

    const std::string there = folder + "/there/";
    // Every process notes its end, the later ones theirs at any time.
    Lines lines = logged();
    EXPECT_EQ(std::count(lines.begin(), lines.end(), "gone"), 4);
    std::erase(lines, "gone");
    EXPECT_EQ(lines,
              (Lines{"file " + folder + "/here/own.xml", "url vlmr:own", "started", "url " + arguments[0],
                     "file " + there + arguments[1], "file " + arguments[2], "file /with blank/x.xml",
                     "file " + there + "-v", "file " + there + "other:x", "url vlmr:end"}));
}

TEST_F(HandOver, AFileIsRefusedDuringAModalRun)
{
    const pid_t first = start("here", {"vlmr:modal", "/refused.xml"});
    awaitLine("started");
    EXPECT_EQ(waitForExit(start("there", {"/refused too.xml"})), 0);
    EXPECT_EQ(waitForExit(start("there", {"vlmr:end"})), 0);
    EXPECT_EQ(waitForExit(first), 0);
    for (const std::string& line : logged())
        EXPECT_NE(line.substr(0, 4), "file") << line;
}

TEST_F(HandOver, AStartThatMeetsAnEndingProcessTakesItsPlace)
{
    const pid_t first = start("here", {});
    awaitLine("started");
    EXPECT_EQ(waitForExit(start("there", {"vlmr:slowly"})), 0);
    const pid_t second = start("there", {"/not lost.xml"});
    awaitLine("file /not lost.xml");
    EXPECT_EQ(waitForExit(first), 0);
    EXPECT_EQ(waitForExit(start("there", {"vlmr:end"})), 0);
    EXPECT_EQ(waitForExit(second), 0);
}

TEST_F(HandOver, WithoutABusEachStartIsAProcessOfItsOwn)
{
    setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent", 1);
    const pid_t first = start("here", {});
    awaitLine("started");
    EXPECT_EQ(waitForExit(start("there", {"/own.xml", "vlmr:end"})), 0);
    awaitLine("file /own.xml");
    awaitLine("started", 2);
    kill(first, SIGTERM);
    EXPECT_EQ(waitForExit(first), 0) << "a termination ends the run in order";
    awaitLine("gone", 2);
}

TEST_F(HandOver, AProcessThatCannotAnswerIsEndedByTheSecondSignal)
{
    const pid_t first = start("here", {"vlmr:never"});
    awaitLine("url vlmr:never");
    kill(first, SIGTERM);
    FThreadSleep(50);
    EXPECT_EQ(waitpid(first, nullptr, WNOHANG), 0) << "it still has the first one to answer";
    kill(first, SIGTERM);
    int status = 0;
    waitpid(first, &status, 0);
    EXPECT_TRUE(WIFSIGNALED(status));
}
