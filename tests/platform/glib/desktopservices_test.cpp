#include "storage/filesystem/fsystemshell.h"
#include "tests/storage/filefixture.h"

#include <thread>

namespace
{
/// Runs in processes of their own, since the desktop's library keeps the environment that it saw first.
class DesktopTest : public FileTest
{
protected:
    void SetUp() override
    {
        testing::GTEST_FLAG(death_test_style) = "threadsafe";
        FileTest::SetUp();
    }

    void enterPrivateHome() const
    {
        setenv("HOME", root.c_str(), 1);
        setenv("XDG_DATA_HOME", (root + "/data").c_str(), 1);
        setenv("XDG_CONFIG_HOME", (root + "/config").c_str(), 1);
        setenv("XDG_DATA_DIRS", "", 1);
        unsetenv("DBUS_SESSION_BUS_ADDRESS");
    }

    /// A program that writes its arguments to a file, one a line.
    void putProgram(const std::string& name) const
    {
        put(name, "#!/bin/sh\nprintf '%s\\n' \"$@\" > '" + root + "/part' && mv '" + root + "/part' '" +
                      root + "/told'\n");
        std::filesystem::permissions(root + "/" + name, std::filesystem::perms(0755));
    }

    void putHandler() const
    {
        putProgram("handler");
        std::filesystem::create_directories(root + "/data/applications");
        std::filesystem::create_directories(root + "/config");
        put("data/applications/handler.desktop",
            "[Desktop Entry]\nType=Application\nName=Handler\nExec=" + root + "/handler %u\n");
        put("config/mimeapps.list", "[Default Applications]\nx-scheme-handler/testurl=handler.desktop\n"
                                    "inode/directory=handler.desktop\n");
    }

    std::string waitForWhatWasTold() const
    {
        while (!exists("told"))
            std::this_thread::yield();
        return contentOf("told");
    }

    std::u16string textAt(const std::string& name) const
    {
        FString text;
        at(name)->getFullPath(text);
        return text.text16();
    }
};

[[noreturn]] void endWith(bool isWell)
{
    std::_Exit(isWell ? 0 : 1);
}

TEST_F(DesktopTest, TrashKeepsWhatItIsGiven)
{
    EXPECT_EXIT(
        {
            enterPrivateHome();
            put("a.txt", "first");
            bool isWell = files->trashFile(at("a.txt")) && !exists("a.txt");
            put("a.txt", "second");
            isWell = isWell && files->trashFile(at("a.txt")) && !files->trashFile(at("a.txt"));
            std::size_t kept = 0;
            for (const auto& entry : std::filesystem::directory_iterator(root + "/data/Trash/files"))
                kept += entry.file_size();
            endWith(isWell && kept == std::string("firstsecond").size());
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(DesktopTest, UrlsGoToTheirHandlerAsTheyAre)
{
    EXPECT_EXIT(
        {
            enterPrivateHome();
            putHandler();
            const char16* url = u"testurl://h:1/../a%20b?c=d#e";
            endWith(FSystemShell::executeURL(url) && waitForWhatWasTold() == utf8(url) + "\n" &&
                    !FSystemShell::executeURL(u"unknown://x") && !FSystemShell::executeURL(u"no url"));
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(DesktopTest, ProgramsRunAndDocumentsOpen)
{
    EXPECT_EXIT(
        {
            enterPrivateHome();
            putProgram("program");
            const IPtr<FNPath> argument = at("a \xE4");
            const bool isRun = FSystemShell::execute(textAt("program").c_str(), argument) &&
                               waitForWhatWasTold() == argument->platformPath() + "\n";
            endWith(isRun && !FSystemShell::execute(textAt("missing").c_str(), nullptr));
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(DesktopTest, FilesAreShownInTheirFolder)
{
    EXPECT_EXIT(
        {
            enterPrivateHome();
            putHandler();
            put("a b", "x");
            endWith(FSystemShell::showInBrowser(at("a b")) && waitForWhatWasTold() == root + "\n" &&
                    !FSystemShell::showInBrowser(at("missing")));
        },
        testing::ExitedWithCode(0), "");
}
} // namespace
