#pragma once

#include "foundation/object/funknown.h"

class UApplication;
class UKeyCode;
class UPoint;

/// The platform's events, as the application's logic sees them. *Main thread*.
class IPlatformEventHandler : public FUnknown
{
public:
    /// Prepares event handling. False stops start-up without a word: also where another process of this program
    /// runs, which has then got the arguments of this one.
    virtual bool open(int appType) = 0;
    virtual void close(bool isFinal) = 0;
    virtual void startupFinished(UApplication* application) = 0;
    /// Runs until `quitPlatformEventLoop`. The idle pulse comes every 16 ms.
    virtual void runPlatformEventLoop() = 0;
    /// Ends the loop, if it runs. The application lives on until whoever runs the loop has come back.
    virtual void quitPlatformEventLoop() = 0;
    virtual void doUpdates() = 0;
    /// Handles one event, waiting for it if need be.
    virtual void doNextEvent() = 0;
    virtual bool eventPending() = 0;

    // Input, for windows
    virtual bool waitKeyReleased(const UKeyCode& key) = 0;
    virtual bool waitMouseDoubleClick() = 0;
    virtual char16 mapScanCodeToCharacter(unsigned scanCode) = 0;
    virtual bool getMouseLocation(UPoint& location) = 0;
    virtual bool setMouseLocation(const UPoint& location) = 0;
    virtual int getCurrentMouseButtons() = 0;
    virtual int getCurrentModifiers() = 0;
    virtual bool checkEventQueueForUserCancel() = 0;
    virtual void enableScreenSaver(bool state) = 0;
    virtual void cancelMenuLoop() = 0;
    virtual void onLocalEventLoop(bool begins) = 0;

    /// The one of this process, made at the first call.
    static IPlatformEventHandler* instance();

    DECLARE_INTERFACE_ID
};
