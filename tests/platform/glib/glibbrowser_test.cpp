#include "application/ghtmlbrowser.h"

#include <gtest/gtest.h>

#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

// The desktop's settings are read once a process, so that each URL is opened by a process of its own: this very
// program in the role of one that opens a page.

namespace
{
class DefaultBrowser : public testing::Test
{
protected:
    DefaultBrowser() : folder(testing::TempDir() + "browser_test." + std::to_string(getpid()))
    {
        std::filesystem::create_directories(folder + "/data/applications");
        std::filesystem::create_directories(folder + "/config");
        write("/browser", "#!/bin/sh\nprintf %s \"$1\" > " + folder + "/part && mv " + folder + "/part " +
                              folder + "/opened\n");
        std::filesystem::permissions(folder + "/browser", std::filesystem::perms::owner_all);
        write("/data/applications/browser.desktop",
              "[Desktop Entry]\nType=Application\nName=Browser\nExec=" + folder +
                  "/browser %u\n"
                  "MimeType=x-scheme-handler/https;x-scheme-handler/vlmr;\n");
        write("/config/mimeapps.list", "[Default Applications]\nx-scheme-handler/https=browser.desktop\n"
                                       "x-scheme-handler/vlmr=browser.desktop\n");
    }
    ~DefaultBrowser() override { std::filesystem::remove_all(folder); }

    void write(const std::string& name, const std::string& text) const
    {
        std::ofstream(folder + name) << text;
    }

    /// Opens a URL and gives what reached the browser, waiting for it if it is to come.
    std::string open(const char* url, bool comes) const
    {
        std::filesystem::remove(folder + "/opened");
        const pid_t child = fork();
        if (child == 0)
        {
            setenv("XDG_DATA_HOME", (folder + "/data").c_str(), 1);
            setenv("XDG_CONFIG_HOME", (folder + "/config").c_str(), 1);
            setenv("XDG_DATA_DIRS", "", 1);
            setenv("BROWSER_TEST_URL", url, 1);
            execl("/proc/self/exe", "browser", "--gtest_filter=BrowserRole.DISABLED_OpensAPage",
                  "--gtest_also_run_disabled_tests", "--gtest_brief=1", nullptr);
            _exit(99);
        }
        int status = 0;
        waitpid(child, &status, 0);
        EXPECT_EQ(status, 0);
        while (comes && !std::filesystem::exists(folder + "/opened"))
            usleep(1000);
        std::ifstream file(folder + "/opened");
        return std::string(std::istreambuf_iterator<char>(file), {});
    }

    std::string folder;
};
} // namespace

// Not a test: the role of a process that opens a page.
TEST(BrowserRole, DISABLED_OpensAPage)
{
    std::u16string url;
    for (const char* c = getenv("BROWSER_TEST_URL"); *c; c++)
        url += static_cast<char16_t>(*c);
    EXPECT_TRUE(GHTMLBrowser(1).openURL(url.c_str()));
}

TEST_F(DefaultBrowser, GetsTheURLAsItIs)
{
    for (const char* url : {"https://localhost:8443/connect?type=a_and_b&redirect_uri=vlmr://x/done",
                            "vlmr:x", "https://h/a//b/../c?q=%20%C3%A9&'$HOME'#f"})
        EXPECT_EQ(open(url, true), url);
}

TEST_F(DefaultBrowser, IsLeftAloneWithWhatIsNoURL)
{
    EXPECT_EQ(open("no scheme", false), "");
    EXPECT_EQ(open("https://[broken", false), "");
    EXPECT_EQ(open("unknown:scheme", false), "");
}
