#pragma once

#include "foundation/object/types.h"

class FNPath;

/// Hands things to the desktop, which opens them with whatever the user has chosen. Main thread.
class FSystemShell
{
public:
    /// Opens a URL in the default browser, or the program for its scheme. False where there is none.
    static bool executeURL(const char16* url);
    /// Runs a program with `argument` as its argument, or opens a document with the program for its kind,
    /// which an `argument` isn't for. `argument` may be null. False where nothing could be started.
    static bool execute(const char16* command, const FNPath* argument);
    /// Shows a file in the desktop's file manager.
    static bool showInBrowser(const FNPath* path);
};
