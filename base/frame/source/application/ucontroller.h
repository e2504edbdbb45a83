#pragma once

#include "application/iplatform2.h"
#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmlinkedlist.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/platformthread.h"
#include "storage/path/istandardfolders.h"

#include <atomic>

class UApplication;
class UMenu;

/// Drives the application: the idle pulse, quitting, the folders of the program.
///
/// *Main thread*, but for `addIdle`, `removeIdle`, `deferDestruction`, `postQuitMessage`, `deferAlert` and
/// `deferPopupMessage`, which any thread may call.
class UController : public CmObject, public IPlatform2, public IStandardFolders
{
    DECLARE_TYPE(UController, CmObject)

    /// The thread that builds it is the main thread from then on.
    explicit UController(int applicationType);
    UController(const UController&) = delete;
    ~UController() override;

    // Run and end
    void run(UApplication* application);
    /// Whether the run is over, or could not begin.
    bool isDone() const { return done; }
    /// Quits at the next pulse.
    void postQuitMessage();
    /// Asks the application, closes the windows and ends the event loop, unless one of them refuses. The argument is
    /// handed on to the application. Gives what `isDone` gives afterwards.
    bool quit(bool force);
    /// The platform's question whether the process may end now.
    static bool canTerminate();

    /// Borrowed; active while the run lasts.
    void setMenuBar(UMenu* menus) { menuBar = menus; }

    // Idle pulse
    /// Whether the clients of the pulse are being told just now.
    bool isInIdleDispatch() const { return inIdleDispatch; }
    /// Does the deferred work of 16 ms. `throttled` callers are held back to one pulse in ten milliseconds. False
    /// only while suspended.
    bool onIdle(bool throttled);
    /// Delivers changes and messages that wait.
    void updateDependencies();
    /// The client gets the message "Idle" at each pulse. Borrowed; it takes itself out before it goes.
    void addIdle(CmObject* client);
    void removeIdle(CmObject* client);
    /// While true no pulse does anything. Gives the former value.
    bool suspendIdle(bool state);
    /// Whether windows are flushed after a pulse. Gives the former value.
    bool enableFlush(bool state);
    bool isFlushEnabled() const { return flushEnabled; }

    // Deferred
    /// Takes over the caller's reference and releases it at the next pulse.
    void deferDestruction(CmObject* object);
    /// Shows the text to the user at the next pulse.
    void deferAlert(const char16* text);
    /// `duration` in milliseconds.
    void deferPopupMessage(const char16* text, int duration);

    // Folders: full paths with a delimiter at the end, empty where there is none
    /// The folder "Contents" of the program's bundle.
    const char16* getAppPath() override { return appPath.text16(); }
    const char16* getTempPath() override { return tempPath.text16(); }
    const char16* getUserPath() override { return userPath.text16(); }
    /// There is no such folder here.
    const char16* getSystemPath() override { return u""; }
    const char16* getSharedPath() { return sharedPath.text16(); }
    /// The name of the bundle.
    const FString& getAppFileName() const { return appFileName; }

    /// Milliseconds of a clock that never goes back.
    static int64 getTicks();
    static void wait(int ms);
    static bool isInMainThread();

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(CmObject)
    /// "Notification", "PopupMessage" and "Quit".
    int notify(FMessage* message) override;

private:
    bool initPlatform(int applicationType);
    bool locateBundle();
    void locateFolders();
    void dispatchIdle(int64 now);
    void destroyDeferred();
    CmObject* takeDeferred();

protected:
    bool done = false;
    bool flushEnabled = true;
    bool mouseSuspended = false;
    bool inIdle = false;
    bool idleSuspended = false;
    bool updatesSuspended = false;
    bool inIdleDispatch = false;
    // The state of the input, for windows; milliseconds.
    int modifiers = 0;
    int doubleClickTime = 200;
    /// The earliest time of the next throttled pulse.
    int64 idealNextIdle = 0;

private:
    UMenu* menuBar = nullptr;
    FLock idleLock{"idle"};
    CmArray idleClients{0, 10};
    FLock destructionLock{"destruction"};
    CmLinkedList deferredDestruction;

    FString appFileName;
    FString appPath;
    FString tempPath;
    FString userPath;
    FString sharedPath;

    static std::atomic<FThreadID> mainThreadID;
};

/// Null before the application is built and after it has gone.
extern UController* gController;
