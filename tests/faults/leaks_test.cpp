#include "tests/faults/faultrunner.h"
#include "tests/job/process.h"

#include <cerrno>
#include <cstdlib>

#include <gtest/gtest.h>

namespace fs = std::filesystem;

// The other tests find a leak by the exit code of the program: here it is seen that it comes to that.
TEST(Leak, BehindAFailedCallEndsTheProgramOtherwise)
{
    if (const std::string reason = whyUnsupervised(); !reason.empty())
        GTEST_SKIP() << reason;
    std::string pattern = fs::temp_directory_path() / "faults-XXXXXX";
    const fs::path folder = mkdtemp(pattern.data());
    for (const bool isFailing : {false, true})
    {
        Fault fault;
        fault.kind = kOpenCalls;
        fault.number = isFailing ? 1 : 0;
        fault.error = EACCES;
        Process::Setup setup;
        setup.arguments = launcherFor(fault, folder / "report");
        setup.arguments.push_back(FAULTS_LEAKING);
        setup.output = folder / "output";
        Process process(setup);
        const std::optional<int> code = process.wait(kHangs);
        EXPECT_EQ(code != 0, isFailing) << process.output();
        EXPECT_EQ(process.output().find("LeakSanitizer") != std::string::npos, isFailing);
        const FaultReport report = readReport(folder / "report");
        EXPECT_EQ(report.countOf(kOpenCalls), 1) << "what the checker does at the end isn't counted";
    }
    fs::remove_all(folder);
}
