#pragma once

#include "foundation/object/types.h"

/// Where the folders of the program are; the application answers.
///
/// Each operation gives a folder's full path, with or without a delimiter at its end, valid until the answer
/// changes; null or empty where there is no such folder. Set once at start. Main thread for setting,
/// thread-safe for asking.
class IStandardFolders
{
public:
    virtual ~IStandardFolders() = default;
    /// The user's settings; holds secrets, so what is made below it is for the owner only.
    virtual const char16* getUserPath() = 0;
    virtual const char16* getTempPath() = 0;
    /// What is shipped with the program.
    virtual const char16* getAppPath() = 0;
    virtual const char16* getSystemPath() = 0;

    /// Null until the application has set it, and after it has gone.
    static IStandardFolders* instance();
    /// Not owned; null takes it away.
    static void setInstance(IStandardFolders* folders);
};
