#include "application/platformservices.h"

#include <gtest/gtest.h>

#include <sys/resource.h>

#include <cstdlib>

namespace
{
[[noreturn]] void raiseAndCompare()
{
    rlimit files{}, stack{}, raisedFiles{}, raisedStack{};
    getrlimit(RLIMIT_NOFILE, &files);
    getrlimit(RLIMIT_STACK, &stack);
    files.rlim_cur = 256;
    setrlimit(RLIMIT_NOFILE, &files);
    PlatformServices::raiseLimits();
    getrlimit(RLIMIT_NOFILE, &raisedFiles);
    getrlimit(RLIMIT_STACK, &raisedStack);

    const rlim_t expected = files.rlim_max >= 10240 ? 10240 : 256;
    const bool isRight = raisedFiles.rlim_cur == expected && raisedFiles.rlim_max == files.rlim_max &&
                         raisedStack.rlim_cur == stack.rlim_max && raisedStack.rlim_max == stack.rlim_max;
    exit(isRight ? 0 : 1);
}
} // namespace

TEST(PlatformServicesDeathTest, RaisesTheSoftLimitsAlone)
{
    EXPECT_EXIT(raiseAndCompare(), testing::ExitedWithCode(0), "");
}
