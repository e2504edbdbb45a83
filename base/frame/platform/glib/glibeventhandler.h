#pragma once

#include "application/iplatformeventhandler.h"
#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"
#include "foundation/thread/iplatformtimer.h"
#include "platform/glib/glibhandover.h"

#include <glib.h>

#include <vector>

class UApplication;

/// The event loop on GLib's main loop, and the way in for files and URLs.
///
/// What the process was started with waits for the loop; what later processes hand over arrives while it runs.
/// There are no windows yet, so the input helpers know of no input. *Main thread*.
class GlibEventHandler : public FObject,
                         public IPlatformEventHandler,
                         private ITimerCallback,
                         private IArgumentReceiver
{
    DECLARE_TYPE(GlibEventHandler, FObject)

    GlibEventHandler();
    GlibEventHandler(const GlibEventHandler&) = delete;
    ~GlibEventHandler() override;

    bool open(int appType) override;
    void close(bool isFinal) override;
    void startupFinished(UApplication*) override {}
    void runPlatformEventLoop() override;
    void quitPlatformEventLoop() override;
    void doUpdates() override;
    void doNextEvent() override;
    bool eventPending() override;

    bool waitKeyReleased(const UKeyCode&) override { return false; }
    bool waitMouseDoubleClick() override { return false; }
    char16 mapScanCodeToCharacter(unsigned) override { return 0; }
    bool getMouseLocation(UPoint&) override { return false; }
    bool setMouseLocation(const UPoint&) override { return false; }
    int getCurrentMouseButtons() override { return 0; }
    int getCurrentModifiers() override { return 0; }
    bool checkEventQueueForUserCancel() override { return false; }
    void enableScreenSaver(bool) override {}
    void cancelMenuLoop() override {}
    void onLocalEventLoop(bool) override {}

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(FObject)

private:
    struct Start
    {
        std::string argument;
        std::string folder;
    };

    void onTimer() override;
    void pulse();
    bool takesArguments() override;
    void receiveArgument(const std::string& argument, const std::string& folder) override;
    void collectArguments(const std::vector<std::string>& arguments);
    void deliverStartList();
    static gboolean onLaunched(gpointer self);
    static gboolean onTermination(gpointer self);
    void watchTermination();
    void releaseApplication();

    GMainLoop* loop;
    GlibHandOver handOver{*this};
    IPtr<IPlatformTimer> timer;
    std::vector<Start> startList;
    std::vector<guint> terminationSources;
    // Held while the loop runs: whoever ends it is one of the application's own operations.
    IPtr<UApplication> runningApplication;
    bool isRunning = false;
    bool inPulse = false;
};
