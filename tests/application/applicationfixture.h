#pragma once

#include "application/applicationsteps.h"
#include "application/onetimeprocedure.h"
#include "application/uapplication.h"
#include "application/ucontroller.h"
#include "application/udesktop.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

using Lines = std::vector<std::string>;

/// What happened, in order.
inline Lines gEvents;

inline void note(const std::string& event)
{
    gEvents.push_back(event);
}

/// Notes the steps that belong to screens and network.
class NotedSteps : public ApplicationSteps
{
public:
    void prepareToolTips() override { note("tool tips"); }
    void registerFonts() override { note("fonts"); }
    void setupScheme() override { note("scheme"); }
    bool isUserImpatient() override
    {
        note("splash");
        return isImpatient;
    }
    void activateMenuBar(bool state) override { note(state ? "menu bar on" : "menu bar off"); }
    void popupMessage(const char16* text, int duration) override
    {
        note("popup " + std::string(FString(text).text8()) + " " + std::to_string(duration));
    }
    void clearClipboard() override { note("clipboard"); }
    void stopNetMessenger() override { note(gMessenger ? "net messenger" : "net messenger too late"); }
    void deleteWindowManager() override { note(gMessenger ? "window manager too early" : "window manager"); }
    void deleteSkinManager() override { note("skin manager"); }
    void deleteUIWizard() override { note("wizard"); }
    void deleteUIScripts() override { note("scripts"); }
    void deleteScriptManager() override { note(gController ? "script manager" : "script manager too late"); }
    void clearDrawDeviceFactory() override { note(gController ? "draw devices too early" : "draw devices"); }

    bool isImpatient = true;
};

/// Notes what it is asked, and quits at once unless told otherwise.
class NotedApplication : public UApplication
{
public:
    explicit NotedApplication(const char* name = "Noted Application") : UApplication(kAppTypeStandalone, name)
    {
    }
    ~NotedApplication() override { note("application gone"); }

    void preSplashInit() override
    {
        note("pre splash");
        if (onPreSplash)
            onPreSplash();
    }
    void preInit() override
    {
        note("pre init");
        UApplication::preInit();
    }
    void postInit() override
    {
        note("post init");
        if (onPostInit)
            onPostInit();
        else
            gController->postQuitMessage();
    }
    UMenu* makeMenus() override
    {
        note("menus");
        return menus;
    }
    void showAbout(bool isSplash) override { note(isSplash ? "about as splash" : "about"); }
    void hideAbout() override { note("about hidden"); }
    void performStartupActions() override { note("startup actions"); }
    bool canQuit(bool) override
    {
        note("can quit");
        return mayQuit;
    }
    bool openFile(FPath* path, FPath*) override
    {
        FString text;
        if (!path || !path->getFullPath(text))
            return false;
        note("open " + std::string(text.text8()));
        return !text.isEmpty() && text.findNext(0, "good") >= 0;
    }
    using UApplication::backgroundState;
    using UApplication::splashView;

    std::function<void()> onPreSplash;
    std::function<void()> onPostInit;
    UMenu* menus = nullptr;
    bool mayQuit = true;
};

/// A home of its own for each test, and no events yet.
class ApplicationTest : public testing::Test
{
protected:
    // TMPDIR is changed by the tests.
    static inline const std::string temporary = testing::TempDir();

    ApplicationTest() : home(temporary + "application_test." + std::to_string(rand()))
    {
        std::filesystem::create_directories(home);
        setenv("HOME", home.c_str(), 1);
        setenv("TMPDIR", home.c_str(), 1);
        unsetenv("XDG_CONFIG_HOME");
        unsetenv("XDG_DATA_HOME");
        ApplicationSteps::set(&steps);
        gEvents.clear();
    }
    ~ApplicationTest() override
    {
        ApplicationSteps::set(nullptr);
        std::filesystem::remove_all(home);
    }

    std::string home;
    NotedSteps steps;
};
