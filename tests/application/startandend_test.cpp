#include "applicationfixture.h"

#include "services/components/fcomponentregistry.h"
#include "services/localisation/utranslator.h"
#include "storage/filesystem/fnfilesystem.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <thread>
#include <utility>

#include <unistd.h>

namespace
{
bool succeed()
{
    note("procedure");
    return true;
}
bool succeedLate()
{
    note("late procedure");
    return true;
}
bool fail()
{
    note("failing procedure");
    return false;
}
bool terminate()
{
    note(gMessenger && gComponentRegistry ? "terminator" : "terminator too late");
    return true;
}
} // namespace

class StartAndEnd : public ApplicationTest
{
};

TEST_F(StartAndEnd, EveryStepIsAtItsPlace)
{
    OneTimeProcedure first("first", 0, &succeed);
    OneTimeProcedure late("late", 100, &succeedLate);
    OneTimeProcedure last("last", 5, &terminate, OneTimeProcedure::kTerminator);
    int menuBar = 0;
    auto* application = new NotedApplication;
    application->menus = reinterpret_cast<UMenu*>(&menuBar);
    application->run();
    note("run is over");
    EXPECT_TRUE(gController->isDone());
    EXPECT_EQ(application->getRefCount(), 1u) << "the loop gave its reference back";
    application->release();

    EXPECT_EQ(gEvents,
              (Lines{"tool tips",        "fonts",     "scheme",        "pre splash",     "about as splash",
                     "pre init",         "procedure", "menus",         "post init",      "menu bar on",
                     "startup actions",  "can quit",  "clipboard",     "menu bar off",   "run is over",
                     "application gone", "clipboard", "net messenger", "terminator",     "window manager",
                     "skin manager",     "wizard",    "scripts",       "script manager", "draw devices"}))
        << "a procedure of level 100 is not for a program that replaces postInit";
    EXPECT_EQ(gApplication, nullptr);
    EXPECT_EQ(gController, nullptr);
    EXPECT_EQ(gDesktop, nullptr);
    EXPECT_FALSE(gMessenger);
    EXPECT_EQ(gFileSystem, nullptr);
    EXPECT_EQ(gTranslator, nullptr);
    EXPECT_EQ(gComponentRegistry, nullptr);
    EXPECT_EQ(IStandardFolders::instance(), nullptr);
    EXPECT_TRUE(UController::canTerminate()) << "nothing is left to ask";
}

TEST_F(StartAndEnd, TheSplashScreenStaysForItsTimeOrUntilTheUserIsImpatient)
{
    int view = 0;
    for (const bool isImpatient : {true, false})
    {
        gEvents.clear();
        steps.isImpatient = isImpatient;
        UApplication::splashScreenDelay = isImpatient ? 1000000 : 30;
        auto application = adopt(new NotedApplication);
        application->splashView = reinterpret_cast<UView*>(&view);
        application->run();
        const auto menus = std::find(gEvents.begin(), gEvents.end(), "menus");
        const auto end = std::find(gEvents.begin(), gEvents.end(), "post init");
        ASSERT_LT(menus, end);
        EXPECT_EQ(std::count(gEvents.begin(), gEvents.end(), "splash"), end - menus - 1);
        EXPECT_EQ(end - menus == 2, isImpatient) << "asked once, or again and again";
    }
    UApplication::splashScreenDelay = 0;
}

TEST_F(StartAndEnd, AnExitAskedForEarlyStopsTheStart)
{
    OneTimeProcedure never("never", 0, &succeed);
    auto application = adopt(new NotedApplication);
    application->onPreSplash = [&] { application->requestExit(); };
    application->run();
    EXPECT_EQ(gEvents, (Lines{"tool tips", "fonts", "scheme", "pre splash", "about hidden"}));
    EXPECT_FALSE(gController->isDone());
}

TEST_F(StartAndEnd, AFailingProcedureStopsTheStart)
{
    for (unsigned level : {0u, 99u})
    {
        gEvents.clear();
        OneTimeProcedure failing("failing", level, &fail);
        OneTimeProcedure never("never", 99, &succeed);
        auto application = adopt(new NotedApplication);
        application->run();
        EXPECT_TRUE(application->isExitRequested());
        EXPECT_EQ(gEvents, (Lines{"tool tips", "fonts", "scheme", "pre splash", "about as splash", "pre init",
                                  "failing procedure", "about hidden"}))
            << "level " << level;
    }
}

TEST_F(StartAndEnd, ADoneControllerDoesNotRun)
{
    auto application = adopt(new NotedApplication);
    gController->quit(false);
    gEvents.clear();
    application->run();
    EXPECT_TRUE(application->isExitRequested());
    EXPECT_TRUE(gEvents.empty());
}

TEST_F(StartAndEnd, TheBasePostInitRaisesTheLevelAndWaitsForTheBackground)
{
    OneTimeProcedure late("late", 100, &succeedLate);
    auto application = adopt(new NotedApplication);
    application->backgroundState = 1;
    std::thread background(
        [&]
        {
            UController::wait(5);
            application->backgroundState = 0;
        });
    application->onPostInit = [&] { application->UApplication::postInit(); };
    application->run();
    background.join();
    EXPECT_EQ(std::count(gEvents.begin(), gEvents.end(), "late procedure"), 1);
    EXPECT_TRUE(gController->isDone()) << "a background that ends in a state above -2 quits the program";
}

TEST_F(StartAndEnd, TheWayOutOfTheProgram)
{
    auto application = adopt(new NotedApplication);
    application->mayQuit = false;
    EXPECT_FALSE(gController->quit(false));
    EXPECT_FALSE(UController::canTerminate());

    struct Stubborn : UDesktop
    {
        bool closeAll() override
        {
            note("close all");
            return false;
        }
        bool closePopups() override { return std::exchange(hasPopups, false); }
        bool hasPopups = true;
    } desktop;
    UDesktop* former = std::exchange(gDesktop, &desktop);
    application->mayQuit = true;
    EXPECT_FALSE(gController->quit(false)) << "a window refuses";
    EXPECT_FALSE(UController::canTerminate()) << "popups are closed first";
    EXPECT_TRUE(gMessenger->areMessagesPosted(static_cast<CmObject*>(gController), "Quit"));
    gEvents.clear();
    desktop.forbidClosing(true);
    gController->onIdle(false);
    EXPECT_EQ(gEvents, (Lines{"can quit"})) << "windows stay open where closing is forbidden";
    EXPECT_TRUE(gController->isDone());
    EXPECT_TRUE(UController::canTerminate());
    gDesktop = former;
}

TEST_F(StartAndEnd, FoldersFollowTheEnvironment)
{
    {
        auto application = adopt(new NotedApplication);
        EXPECT_EQ(std::string(FString(gController->getUserPath()).text8()),
                  home + "/.config/Noted Application/");
        EXPECT_EQ(std::string(FString(gController->getSharedPath()).text8()),
                  home + "/.local/share/Vellamoor/");
        const std::filesystem::path user = home + "/.config/Noted Application";
        EXPECT_EQ(std::filesystem::status(user).permissions(), std::filesystem::perms::owner_all);
        const std::filesystem::path temp = FString(gController->getTempPath()).text8();
        EXPECT_EQ(temp.parent_path().parent_path(), home);
        EXPECT_EQ(std::filesystem::status(temp).permissions(), std::filesystem::perms::owner_all);
        EXPECT_EQ(FString(gController->getAppPath()).length(), 0u) << "the tests run from no bundle";
        EXPECT_EQ(IStandardFolders::instance(), gController);
    }
    setenv("XDG_CONFIG_HOME", "relative", 1);
    setenv("XDG_DATA_HOME", (home + "/data/").c_str(), 1);
    auto application = adopt(new NotedApplication("Other"));
    EXPECT_EQ(std::string(FString(gController->getUserPath()).text8()), home + "/.config/Other/");
    EXPECT_EQ(std::string(FString(gController->getSharedPath()).text8()), home + "/data/Vellamoor/");
}

// Not a test: the role of a program that was started from a bundle.
TEST(BundleRole, DISABLED_Program)
{
    const std::string bundle = getenv("BUNDLE_TEST_FOLDER");
    UApplication::setTranslationEnabled(true);
    auto application = adopt(new NotedApplication);
    EXPECT_EQ(std::string(FString(gController->getAppPath()).text8()), bundle + "/Contents/");
    EXPECT_EQ(std::string(FString(gController->getAppFileName()).text8()), "Some Program");
    application->run();
    EXPECT_STREQ(gTranslator->getUserLanguageCode(), getenv("BUNDLE_TEST_LANGUAGE"));
}

TEST_F(StartAndEnd, AProgramKnowsItsBundleAndSpeaksItsLanguages)
{
    const std::string bundle = home + "/Some Program";
    const std::string program = bundle + "/Contents/Linux/program";
    std::filesystem::create_directories(bundle + "/Contents/Linux");
    std::filesystem::copy_file("/proc/self/exe", program);
    std::ofstream(bundle + "/Contents/translation.xml")
        << "<?xml version=\"1.0\" encoding=\"utf-8\"?><Translations><LanguageTable>"
           "<language key=\"us\">American English</language><language "
           "key=\"de\">Deutsch</language></LanguageTable>"
           "<StringTable><String Key=\"Yes\"><de>Ja</de></String></StringTable></Translations>";
    setenv("BUNDLE_TEST_FOLDER", std::filesystem::canonical(bundle).c_str(), 1);
    setenv("LC_ALL", "de_DE.UTF-8", 1);
    const auto speaks = [&](const char* language)
    {
        setenv("BUNDLE_TEST_LANGUAGE", language, 1);
        const std::string command =
            "'" + program +
            "' --gtest_filter=BundleRole.DISABLED_Program --gtest_also_run_disabled_tests --gtest_brief=1";
        return system(command.c_str()) == 0;
    };
    EXPECT_TRUE(speaks("de"));
    std::ofstream(bundle + "/Contents/BABELFISH").close();
    EXPECT_TRUE(speaks("us")) << "as its authors wrote it";
    unsetenv("LC_ALL");
}

TEST_F(StartAndEnd, ATemporaryFolderOfSomebodyElseIsNotUsed)
{
    std::filesystem::create_directory(home + "/elsewhere");
    const std::string folder = home + "/Noted Application " + std::to_string(geteuid());
    std::filesystem::create_directory_symlink(home + "/elsewhere", folder);
    auto application = adopt(new NotedApplication);
    EXPECT_EQ(FString(gController->getTempPath()).length(), 0u);
}

TEST_F(StartAndEnd, OnlyTheMainThreadIsTheMainThread)
{
    auto application = adopt(new NotedApplication);
    EXPECT_TRUE(UController::isInMainThread());
    std::thread([] { EXPECT_FALSE(UController::isInMainThread()); }).join();
}
