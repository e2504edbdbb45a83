#pragma once

#include "application/uapptype.h"
#include "containers/sequence/cmlinkedlist.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/fvariant.h"
#include "foundation/text/fstring.h"
#include "storage/path/fnpath.h"

#include <atomic>
#include <memory>

class FComponentDescription;
class FControlNode;
class FThread;
class IController;
class UIDescription;
class UKeyCode;
class UMenu;
class UScheme;
class UView;

/// A feature of the program, by name. A null name ends a table.
struct AppFeatureTableEntry
{
    const char* name = nullptr;
    FVariant value;

    bool operator==(const AppFeatureTableEntry& other) const { return name == other.name; }
};

/// The one object that is the program: it brings the process-wide services up and down in their order.
///
/// Built once, run, released. A derived class replaces the virtual operations that make it a program of its own.
/// *Main thread*.
class UApplication : public CmObject
{
    DECLARE_TYPE(UApplication, CmObject)

    /// A null name stands for the translated "Application".
    UApplication(UAppType type, const char* name);
    UApplication(const UApplication&) = delete;
    ~UApplication() override;

    /// Once the files that the process was started with are opened.
    virtual void performStartupActions() {}
    /// Starts up, runs the event loop, and comes back when the run is over.
    virtual void run();
    virtual void preSplashInit() {}
    /// The base runs the procedures of level 100, and waits for what works in the background.
    virtual void postInit();
    /// The base runs the procedures of level 0.
    virtual void preInit();
    virtual void activate(bool state);
    /// The menu bar, owned by the application; null where there is none.
    virtual UMenu* makeMenus() { return nullptr; }
    virtual CmObject* getStandardMenuItem(int tag);
    virtual UMenu* getFileMenu() { return fileMenu; }
    virtual UMenu* getEditMenu() { return editMenu; }
    virtual void menuDestroyed(UMenu* menu);
    virtual UScheme* createScheme() { return nullptr; }
    virtual UIDescription* createSkin() { return nullptr; }
    virtual UView* createControl(FControlNode* node, IController* controller);
    /// Whether the program may quit now.
    virtual bool canQuit(bool force);
    virtual bool checkQuit() { return true; }
    virtual const char16* getName() { return appName.text16(); }
    virtual void setName(const char16* name);
    virtual const char16* getDisplayName() { return getName(); }
    virtual const char16* getVersion() { return appVersion.text16(); }
    virtual const char16* getBuild() { return appBuild.text16(); }
    virtual void setVersion(const char16* version, const char16* build);
    /// The number that the version begins with.
    virtual int getMajorVersionInt();
    virtual void setDocumentFileVersion(int version) { documentFileVersion = version; }
    virtual int getDocumentFileVersion() { return documentFileVersion; }
    /// The creator code of the program's documents; 0 is none.
    virtual int32 getSignature() { return 0; }
    /// Shows the about box, or the splash screen, which is the same during start-up.
    virtual void showAbout(bool isSplash);
    virtual void hideAbout() {}
    virtual void updateSplashText(const char16* text);
    /// Opens a file that the user or the desktop hands to the program; whether it was handled.
    virtual bool openFile(FPath* path, FPath* relatedPath);
    /// Opens each; true if one could be opened.
    virtual bool openFiles(CmLinkedList* paths);
    virtual bool canOpenFile(FPath* path);
    virtual bool isKeyShortcut(const UKeyCode& key);
    /// Borrowed; null where there is none.
    virtual FPath* getIncomingProjectsFolder() { return nullptr; }
    virtual void notifyNewComponent(FComponentDescription* description);
    virtual bool hasFeature(const char* feature);
    /// False where there is no such feature.
    virtual bool getFeatureValue(const char* feature, FVariant& value);
    /// Adds `count` rows. Their names are not copied.
    virtual void registerFeatures(const AppFeatureTableEntry* rows, int count);
    /// Whether a modal run keeps the program from taking files: the platform then refuses them.
    virtual bool isModal();

    // Warnings
    /// Nothing is kept until warnings are enabled.
    void enableWarnings(bool state) { warningsEnabled = state; }
    /// Keeps a copy for the list.
    void addWarning(const char16* text);
    void clearWarnings();
    /// Shows the warnings in one list and forgets them. `document` is the file that they are about, if any. False
    /// where there are none.
    bool popupWarningList(FPath* document);

    bool isExitRequested() const { return exitRequested; }
    void requestExit() { exitRequested = true; }
    UAppType getAppType() const { return appType; }
    /// The name of the program's folder among the user's settings: its own name unless another was set.
    static const char16* getUserFolderName();
    static void setUserFolderName(const char16* name) { userFolderName = name; }
    static void setTranslationEnabled(bool state) { translationEnabled = state; }
    static bool isTranslationEnabled() { return translationEnabled; }
    static const char16* getCompanyName() { return u"Vellamoor"; }

    /// "MenuSelect" and "MenuCanSelect" for the menu items quit (7) and about (16).
    int notify(FMessage* message) override;

    /// Whether the user folder is made at start.
    static bool createUserFolder;
    /// Milliseconds.
    static int splashScreenDelay;

protected:
    static FString appName;
    static FString appVersion;
    static FString appBuild;
    static FString userFolderName;
    static bool translationEnabled;

private:
    void initTranslator();
    void runPrepared(int64 startTicks);
    void waitForSplash(int64 startTicks);
    void stopStart();
    void destroyGlobals();
    const AppFeatureTableEntry* findFeature(const char* feature) const;

    UAppType appType;
    bool exitRequested = false;
    bool warningsEnabled = false;

protected:
    /// What the base `postInit` waits for: 1 while there is work in the background, which may be done by another
    /// thread; then above -2 to quit, or -2.
    std::atomic<int> backgroundState{-2};
    FNPath skinPath;
    UMenu* fileMenu = nullptr;
    UMenu* editMenu = nullptr;
    UView* splashView = nullptr;

private:
    std::unique_ptr<FThread> mainThread;
    CmLinkedList warnings;

    static int documentFileVersion;
};

/// Null before the application is built and after it has gone.
extern UApplication* gApplication;

/// The arguments of `main`, which stores them first of all.
extern int Argc;
extern char** Argv;

/// Keeps the desktop's dock and menu bar out of the way of a program without windows of its own. Desktops here show
/// neither for such a program, so nothing is left to do.
void configureApplication();
