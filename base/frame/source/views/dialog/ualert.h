#pragma once

#include "foundation/object/types.h"

/// The message box. *Main thread*.
class UAlert
{
public:
    enum Style : int
    {
        kInformation = 0,
        kQuestion = 1,
        kWarning = 2
    };

    /// Shows `text` until a button is pressed and gives its number, from 1; 0 where none was, also because the
    /// application is quitting. A null first button is labelled "OK"; the others are left out. `notAgain` may be
    /// null; else it is set by a check box "don't ask again".
    static int run(const char16* text, Style style, const char16* button1, const char16* button2,
                   const char16* button3, bool* notAgain);

    /// Lets the application say whether a box may open at all; null always may.
    static void setPermission(bool (*mayRun)()) { permission = mayRun; }
    /// From now on code below the dialogs can ask the user.
    static void serveLowerRooms();

private:
    static inline bool (*permission)() = nullptr;
};
