#include "application/ucontroller.h"

#include "application/applicationsteps.h"
#include "application/iplatformeventhandler.h"
#include "application/onetimeprocedure.h"
#include "application/platformservices.h"
#include "application/uapplication.h"
#include "application/udesktop.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/message/updatehandler.h"
#include "foundation/thread/flockscope.h"
#include "foundation/thread/fthread.h"
#include "services/localisation/ulocale.h"
#include "storage/path/fnpath.h"
#include "views/dialog/ualert.h"

#include <chrono>
#include <string>
#include <utility>

DEFINE_INTERFACE_ID(IPlatform2, 0xE4A17C52, 0x60BD4F98, 0xA1357E0C, 0xD92B84F6)
DEFINE_INTERFACE_ID(IPlatformEventHandler, 0x1D83F5A6, 0xC27E4B09, 0xB8E4609D, 0x57A3F21C)

UController* gController = nullptr;
UDesktop* gDesktop = nullptr;
std::atomic<FThreadID> UController::mainThreadID{0};

namespace
{
constexpr char kMessageNotification[] = "Notification";
constexpr char kMessagePopup[] = "PopupMessage";
constexpr char kMessageQuit[] = "Quit";
constexpr char kText[] = "Text";
constexpr char kDuration[] = "Duration";

// Milliseconds.
constexpr int64 kIdealPulse = 10;
constexpr int64 kTooEarly = 6;
constexpr int64 kFarTooEarly = 11;

bool mayShowAlerts()
{
    return gController && !gController->isDone();
}

std::string parentOf(const std::string& path)
{
    const size_t slash = path.rfind('/');
    return slash == std::string::npos ? std::string() : path.substr(0, slash);
}

std::string nameOf(const std::string& path)
{
    return path.substr(path.rfind('/') + 1);
}

std::string bytesOf(const char16* text)
{
    FString bytes(text);
    bytes.toMultiByte(kEncodingUtf8);
    return bytes.text8();
}

/// The full path of a folder with a delimiter at the end; empty for the empty one.
FString folderText(const std::string& bytes)
{
    FString text;
    if (bytes.empty())
        return text;
    FNPath folder(FPath::kFolder);
    folder.fromPlatformPath(bytes.c_str());
    folder.getFullPath(text);
    if (!text.testChar16(text.length() - 1, PATH_DELIMITER))
        text.append(PATH_DELIMITER);
    return text;
}

void postToController(FMessage* message)
{
    const auto held = adopt(message);
    if (!gMessenger || !gController)
        return;
    message->addRef();
    gMessenger->postMessage(gController, message);
}
} // namespace

UController::UController(int applicationType)
{
    gController = this;
    mainThreadID = FThread::currentThreadID();
    deferredDestruction.takeElements();
    UAlert::setPermission(&mayShowAlerts);
    UAlert::serveLowerRooms();
    gDesktop = new UDesktop;
    if (initPlatform(applicationType))
        return;
    done = true;
    OneTimeProcedure::cancel();
}

UController::~UController()
{
    // The global pointer is cleared by now, but a "Quit" may still wait for this receiver.
    if (FMessenger* messenger = FMessenger::instance())
        messenger->killMessages(this, nullptr);
    destroyDeferred();
    IPlatformEventHandler::instance()->close(true);
    UAlert::setPermission(nullptr);
    if (IStandardFolders::instance() == this)
        IStandardFolders::setInstance(nullptr);
    if (gDesktop)
        gDesktop->release();
    gDesktop = nullptr;
    if (gController == this)
        gController = nullptr;
}

int32 UController::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IPlatform2::iid))
        return offerInterface<IPlatform2>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

// Start

bool UController::initPlatform(int applicationType)
{
    if (!locateBundle())
        return false;
    locateFolders();
    IStandardFolders::setInstance(this);

    ULocale& locale = __getLocale();
    if (appPath.isEmpty())
        locale.setUserLanguage(kLanguageEnglish);
    locale.getSystemLanguage();
    return IPlatformEventHandler::instance()->open(applicationType);
}

bool UController::locateBundle()
{
    // <bundle>/Contents/Linux/<executable>
    const std::string contents = parentOf(parentOf(PlatformServices::getExecutablePath()));
    if (contents.empty())
        return false;
    if (nameOf(contents) != "Contents")
        return true;

    appPath = folderText(contents);
    appFileName.fromUTF8(nameOf(parentOf(contents)).c_str());
    return true;
}

void UController::locateFolders()
{
    const std::string name = bytesOf(UApplication::getUserFolderName());
    tempPath = folderText(PlatformServices::getTemporaryFolder(name));

    const std::string config = PlatformServices::getConfigFolder();
    if (!config.empty())
    {
        const std::string folder = config + "/" + name;
        if (UApplication::createUserFolder)
            PlatformServices::makePrivateFolder(folder);
        userPath = folderText(folder);
    }

    const std::string data = PlatformServices::getDataFolder();
    if (!data.empty())
        sharedPath = folderText(data + "/" + bytesOf(UApplication::getCompanyName()));
}

// Run and end

void UController::run(UApplication* application)
{
    if (done)
        return;
    if (menuBar)
        ApplicationSteps::get().activateMenuBar(true);
    IPlatformEventHandler* events = IPlatformEventHandler::instance();
    events->startupFinished(application);
    if (!done)
    {
        events->runPlatformEventLoop();
        destroyDeferred();
    }
    if (menuBar)
        ApplicationSteps::get().activateMenuBar(false);
}

void UController::postQuitMessage()
{
    postToController(new FMessage(kMessageQuit));
}

bool UController::quit(bool force)
{
    if (done)
        return true;
    if (gApplication && !gApplication->canQuit(force))
        return false;
    if (gDesktop && !gDesktop->isClosingForbidden() && !gDesktop->closeAll())
        return false;

    done = true;
    IPlatformEventHandler::instance()->quitPlatformEventLoop();
    return done;
}

bool UController::canTerminate()
{
    if (!gController)
        return true;
    const bool agreed = gDesktop && (!gApplication || gApplication->canQuit(false));
    if (agreed && gDesktop->closePopups())
    {
        gController->postQuitMessage();
        return false;
    }
    return gController->quit(false);
}

int UController::notify(FMessage* message)
{
    if (!message)
        return 0;
    if (message->isType(kMessageNotification))
    {
        UAlert::run(message->getString16(kText), UAlert::kInformation, nullptr, nullptr, nullptr, nullptr);
        return 1;
    }
    if (message->isType(kMessagePopup))
    {
        ApplicationSteps::get().popupMessage(message->getString16(kText),
                                             static_cast<int>(message->getData(kDuration)));
        return 1;
    }
    if (message->isType(kMessageQuit))
    {
        quit(false);
        return 1;
    }
    return 0;
}

// Idle pulse

bool UController::onIdle(bool throttled)
{
    if (idleSuspended)
        return false;
    if (!inIdle)
    {
        inIdle = true;
        const int64 now = getTicks();
        const int64 early = throttled ? idealNextIdle - now : 0;
        if (early >= kTooEarly)
        {
            // Further off than any pulse sets it: not to be waited for a second time.
            if (early >= kFarTooEarly)
                idealNextIdle = 0;
            inIdle = false;
            return true;
        }
        idealNextIdle = now + kIdealPulse;
        if (gDesktop)
            gDesktop->onIdle();
        dispatchIdle(now);
        inIdle = false;
    }
    destroyDeferred();
    updateDependencies();
    ApplicationSteps::get().serveModalPlugDialog();
    return true;
}

void UController::dispatchIdle(int64 now)
{
    // The lock stays held while the clients are called: whoever takes himself out on another thread may go as soon
    // as he has the lock.
    FLockScope guard(idleLock);
    inIdleDispatch = true;
    if (!idleClients.isEmpty())
    {
        FMessage idle("Idle");
        idle.addData("CurrentTicks", now);
        for (int i = 0; i < idleClients.total(); i++)
            idleClients.at(i)->notify(&idle);
    }
    ApplicationSteps::get().idlePlugObjects();
    inIdleDispatch = false;
}

void UController::updateDependencies()
{
    if (idleSuspended)
        return;
    UpdateHandler* updates = UpdateHandler::instance();
    if (updates)
        updates->triggerDeferedUpdates(nullptr);
    if (gMessenger)
        gMessenger->deliverMessages();
    if (updates)
        updates->triggerDeferedUpdates(nullptr);
}

void UController::addIdle(CmObject* client)
{
    FLockScope guard(idleLock);
    if (!idleClients.containsAbs(client))
        idleClients.add(client);
}

void UController::removeIdle(CmObject* client)
{
    FLockScope guard(idleLock);
    idleClients.remove(client);
}

bool UController::suspendIdle(bool state)
{
    return std::exchange(idleSuspended, state);
}

bool UController::enableFlush(bool state)
{
    return std::exchange(flushEnabled, state);
}

// Deferred

void UController::deferDestruction(CmObject* object)
{
    FLockScope guard(destructionLock);
    deferredDestruction.add(object);
}

CmObject* UController::takeDeferred()
{
    FLockScope guard(destructionLock);
    return deferredDestruction.removeFirst();
}

void UController::destroyDeferred()
{
    // A destructor may defer further objects.
    while (CmObject* object = takeDeferred())
        object->release();
}

void UController::deferAlert(const char16* text)
{
    auto* message = new FMessage(kMessageNotification);
    message->addString16(kText, text);
    postToController(message);
}

void UController::deferPopupMessage(const char16* text, int duration)
{
    auto* message = new FMessage(kMessagePopup);
    message->addString16(kText, text);
    message->addData(kDuration, duration);
    postToController(message);
}

// Time and threads

int64 UController::getTicks()
{
    using namespace std::chrono;
    return duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count();
}

void UController::wait(int ms)
{
    FThreadSleep(ms);
}

bool UController::isInMainThread()
{
    return FThread::currentThreadID() == mainThreadID;
}
