#pragma once

#include "foundation/object/types.h"

/// How code below the dialogs asks the user.
///
/// The dialogs fill it in at start; until then there is nobody to ask, and code that finds null takes 0 for the
/// answer. *Main thread*.
class IUserAlert
{
public:
    virtual ~IUserAlert() = default;

    /// Shows `text` and waits. Style 0 is a notice, 1 a question. A null button takes the default of the dialog or,
    /// but for the first, is left out. Gives the number of the button, from 1; 0 where it was closed without one.
    virtual int run(const char16* text, int style, const char16* button1, const char16* button2,
                    const char16* button3) = 0;

    static IUserAlert* get() { return current; }
    /// `alert` is borrowed and may be null.
    static void set(IUserAlert* alert) { current = alert; }

private:
    static inline IUserAlert* current = nullptr;
};
