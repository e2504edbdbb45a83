#pragma once

#include "foundation/object/cmobject.h"

/// The screen and its windows, as far as there are any: none yet, so there is nothing to do, to close or to refuse.
/// *Main thread*.
class UDesktop : public CmObject
{
    DECLARE_TYPE(UDesktop, CmObject)

    /// The desktop's share of the idle pulse.
    virtual void onIdle() {}
    /// Whether a window keeps the user from everything else.
    virtual bool isInModalLoop() const { return false; }
    /// Closes all windows; false as soon as one refuses.
    virtual bool closeAll() { return true; }
    /// Closes the popup windows; whether there were any.
    virtual bool closePopups() { return false; }

    /// While true, the windows stay open when the application quits.
    bool isClosingForbidden() const { return closingForbidden; }
    void forbidClosing(bool state) { closingForbidden = state; }

private:
    bool closingForbidden = false;
};

/// Null before the controller is built and after it has gone.
extern UDesktop* gDesktop;
