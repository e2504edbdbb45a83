#pragma once

#include "foundation/object/types.h"

class CmContainer;
class FNPath;
class FString;

/// Helpers of the file dialogs. Main thread.
class FSys
{
public:
    /// Finds where a file dialog begins: the folder that was last used for the first of `types` (of
    /// FFileType, may be null), else the one last used for any. `folder` takes a new path for the caller, or
    /// null where none is known. `name`, a proposed file name, is made valid and for a saving dialog
    /// (`forSaving` isn't 0) gets the extension of the type. True where a folder was found.
    static bool getInitPath(FNPath*& folder, FString& name, CmContainer* types, int16 forSaving);
    /// Remembers `folder` for these types, and for all.
    static void storeInitPath(const FNPath& folder, CmContainer* types);
    /// The key of a type with this name: Default Path for "Audio" Files.
    static void getDefaultKey(const FString& typeName, FString& key);
};
