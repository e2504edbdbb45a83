#pragma once

#include "foundation/object/types.h"

/// The steps in the life of the process that belong to screens and network, at their places in the order.
///
/// Those of screens do nothing until their classes exist; what stands above the application fills them in. *Main thread*.
class ApplicationSteps
{
public:
    virtual ~ApplicationSteps() = default;

    // Start
    virtual void prepareToolTips() {}
    virtual void registerFonts() {}
    virtual void setupScheme() {}
    /// Whether a mouse button or a modifier key is down, which takes the splash screen away.
    virtual bool isUserImpatient() { return false; }

    // Run
    virtual void activateMenuBar(bool) {}
    virtual void idlePlugObjects() {}
    /// Drives the modal dialog of a plug-in, if one is up.
    virtual void serveModalPlugDialog() {}
    virtual void flushWindows() {}
    /// `duration` in milliseconds.
    virtual void popupMessage(const char16*, int) {}

    // End
    virtual void clearClipboard() {}
    /// Stops `gNetMessenger`, if there is one.
    virtual void stopNetMessenger();
    virtual void deleteWindowManager() {}
    virtual void deleteSkinManager() {}
    virtual void deleteUIWizard() {}
    virtual void deleteUIScripts() {}
    virtual void deleteScriptManager() {}
    virtual void clearDrawDeviceFactory() {}

    static ApplicationSteps& get() { return *current; }
    /// `steps` is borrowed; null brings back those that do nothing.
    static void set(ApplicationSteps* steps);

private:
    static ApplicationSteps none;
    static ApplicationSteps* current;
};
