#include "application/uapplication.h"

#include "application/applicationsteps.h"
#include "application/onetimeprocedure.h"
#include "application/ucontroller.h"
#include "application/udesktop.h"
#include "containers/typed/tarray.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/message/updatehandler.h"
#include "foundation/text/cmstring.h"
#include "foundation/text/utranslatedstring.h"
#include "foundation/thread/fthread.h"
#include "services/components/fcomponentregistry.h"
#include "services/localisation/utranslator.h"
#include "storage/filesystem/fnfilesystem.h"
#include "views/dialog/dialogstrings.h"
#include "views/dialog/ualert.h"

#include <cstring>

UApplication* gApplication = nullptr;
int Argc = 0;
char** Argv = nullptr;

FString UApplication::appName;
FString UApplication::appVersion;
FString UApplication::appBuild;
FString UApplication::userFolderName;
bool UApplication::translationEnabled = true;
bool UApplication::createUserFolder = true;
int UApplication::splashScreenDelay = 0;
int UApplication::documentFileVersion = 0;

namespace
{
const UTranslatedString stringApplication("Application");

// The last row has no name.
TArray<AppFeatureTableEntry> gApplicationFeatures;

constexpr int kMenuQuit = 7;
constexpr int kMenuAbout = 16;
constexpr unsigned kLevelOfBase = 0;
constexpr unsigned kLevelOfProgram = 99;
constexpr unsigned kLevelAfterStart = 100;

// What `backgroundState` says of work in the background.
constexpr int kBackgroundBusy = 1;
constexpr int kBackgroundNone = -2;

template <class Object>
void releaseGlobal(Object*& pointer)
{
    if (pointer)
        pointer->release();
    pointer = nullptr;
}

/// The services that everything else stands on, unless they are there already.
void makeServices()
{
    UpdateHandler::instance();
    gMessenger = FMessenger::instance();
    if (!gFileSystem)
        gFileSystem = new FNFileSystem;
    if (!gTranslator)
        new UTranslator;
    FComponentRegistry::bringUp();
}
} // namespace

void configureApplication() {}

UApplication::UApplication(UAppType type, const char* name) : appType(type), skinPath(FPath::kFolder)
{
    warnings.takeElements();
    makeServices();
    if (gApplicationFeatures.isEmpty())
        gApplicationFeatures.add(AppFeatureTableEntry());
    mainThread.reset(FThread::newForCallingThread("GUI"));
    if (name)
        appName = name;
    else
        appName = stringApplication.text();
    appName.toWideString();

    gApplication = this;
    gController = new UController(type);
    exitRequested = gController->isDone();
    ApplicationSteps::get().prepareToolTips();
}

UApplication::~UApplication()
{
    destroyGlobals();
    mainThread.reset();
}

// Start and end

void UApplication::run()
{
    if (gController->isDone())
    {
        exitRequested = true;
        return;
    }
    ApplicationSteps::get().registerFonts();
    ApplicationSteps::get().setupScheme();
    initTranslator();
    const int64 startTicks = UController::getTicks();
    preSplashInit();
    if (!exitRequested)
    {
        showAbout(true);
        preInit();
    }
    if (!exitRequested)
        runPrepared(startTicks);
    if (exitRequested)
        stopStart();
}

void UApplication::runPrepared(int64 startTicks)
{
    if (!OneTimeProcedure::initialize(kLevelOfProgram))
    {
        exitRequested = true;
        return;
    }
    if (UMenu* menus = makeMenus())
        gController->setMenuBar(menus);
    waitForSplash(startTicks);
    if (gController->isDone())
        return;
    postInit();
    gController->run(this);
}

void UApplication::stopStart()
{
    hideAbout();
    OneTimeProcedure::cancel();
}

void UApplication::initTranslator()
{
    // A file of this name shows the program as its authors wrote it.
    FString builtIn(gController->getAppPath());
    const bool isBundle = !builtIn.isEmpty();
    FNPath file(builtIn.append(u"BABELFISH").text16(), FPath::kFile);
    if (isBundle && gFileSystem->fileExists(&file))
        gTranslator->initialize("us");
    else
        gTranslator->initialize(!translationEnabled);
}

void UApplication::waitForSplash(int64 startTicks)
{
    while (splashView && !ApplicationSteps::get().isUserImpatient() &&
           UController::getTicks() - startTicks <= splashScreenDelay)
        UController::wait(20);
}

void UApplication::preInit()
{
    if (!OneTimeProcedure::initialize(kLevelOfBase))
        exitRequested = true;
}

void UApplication::postInit()
{
    OneTimeProcedure::initialize(kLevelAfterStart);
    while (backgroundState == kBackgroundBusy)
        UController::wait(20);
    if (backgroundState > kBackgroundNone)
        gController->postQuitMessage();
}

void UApplication::destroyGlobals()
{
    ApplicationSteps& steps = ApplicationSteps::get();
    steps.clearClipboard();
    steps.stopNetMessenger();
    OneTimeProcedure::terminate();
    releaseGlobal(gComponentRegistry);
    // The object itself stays to the end of the process: a thread that looked just before may still post.
    gMessenger = nullptr;
    steps.deleteWindowManager();
    steps.deleteSkinManager();
    steps.deleteUIWizard();
    steps.deleteUIScripts();
    steps.deleteScriptManager();
    releaseGlobal(gController);
    OneTimeProcedure::cancel();
    steps.clearDrawDeviceFactory();
    releaseGlobal(gTranslator);
    releaseGlobal(gFileSystem);
    if (gApplication == this)
        gApplication = nullptr;
}

bool UApplication::canQuit(bool)
{
    return true;
}

bool UApplication::isModal()
{
    return gDesktop && gDesktop->isInModalLoop();
}

// Names and versions

void UApplication::setName(const char16* name)
{
    appName = name;
}

void UApplication::setVersion(const char16* version, const char16* build)
{
    appVersion = version;
    appBuild = build;
}

int UApplication::getMajorVersionInt()
{
    int32 major = 0;
    appVersion.scanInt32(major, 0, false);
    return major;
}

const char16* UApplication::getUserFolderName()
{
    return userFolderName.isEmpty() ? appName.text16() : userFolderName.text16();
}

// Screens: nothing until there are any

void UApplication::activate(bool) {}

void UApplication::menuDestroyed(UMenu* menu)
{
    if (menu == fileMenu)
        fileMenu = nullptr;
    if (menu == editMenu)
        editMenu = nullptr;
}

CmObject* UApplication::getStandardMenuItem(int)
{
    return nullptr;
}

UView* UApplication::createControl(FControlNode*, IController*)
{
    return nullptr;
}

void UApplication::showAbout(bool) {}

void UApplication::updateSplashText(const char16*) {}

bool UApplication::isKeyShortcut(const UKeyCode&)
{
    return false;
}

// Files

bool UApplication::openFile(FPath*, FPath*)
{
    return false;
}

bool UApplication::openFiles(CmLinkedList* paths)
{
    bool isAnyOpen = false;
    if (!paths)
        return false;
    for (CmLinkedListIterator it(*paths); !it.done(); it.next())
        if (openFile(FCast(FPath, it.current()), nullptr))
            isAnyOpen = true;
    return isAnyOpen;
}

bool UApplication::canOpenFile(FPath*)
{
    return false;
}

// Features and components

void UApplication::notifyNewComponent(FComponentDescription*) {}

void UApplication::registerFeatures(const AppFeatureTableEntry* rows, int count)
{
    for (int i = 0; i < count && rows[i].name; i++)
        gApplicationFeatures.doInsertAt(gApplicationFeatures.total() - 1, rows[i]);
}

const AppFeatureTableEntry* UApplication::findFeature(const char* feature) const
{
    for (const AppFeatureTableEntry& row : gApplicationFeatures)
        if (row.name && feature && strcmp(row.name, feature) == 0)
            return &row;
    return nullptr;
}

bool UApplication::hasFeature(const char* feature)
{
    return findFeature(feature) != nullptr;
}

bool UApplication::getFeatureValue(const char* feature, FVariant& value)
{
    const AppFeatureTableEntry* row = findFeature(feature);
    if (row)
        value = row->value;
    return row != nullptr;
}

// Warnings

void UApplication::addWarning(const char16* text)
{
    if (warningsEnabled && text && *text)
        warnings.add(new CmString(text));
}

void UApplication::clearWarnings()
{
    warnings.removeAll();
}

bool UApplication::popupWarningList(FPath*)
{
    if (warnings.isEmpty())
        return false;

    FString list;
    for (CmLinkedListIterator it(warnings); !it.done(); it.next())
    {
        if (!list.isEmpty())
            list.append(u"\n");
        list.append(*FCast(CmString, it.current()));
    }
    // The second button exports the list, by a save dialog; without windows nobody presses it.
    UAlert::run(list.text16(), UAlert::kInformation, strOK.text(), stringExportWarnings.text(), nullptr,
                nullptr);
    clearWarnings();
    return true;
}

// Messages

int UApplication::notify(FMessage* message)
{
    if (!message)
        return 0;
    const int64 tag = message->getData("Tag");
    if (message->isType("MenuCanSelect"))
        return tag == kMenuQuit || tag == kMenuAbout ? 1 : 0;
    if (!message->isType("MenuSelect"))
        return 0;
    if (tag == kMenuQuit)
        gController->quit(false);
    else if (tag == kMenuAbout)
        showAbout(false);
    else
        return 0;
    return 1;
}
