#pragma once

#include "foundation/object/funknown.h"

class FFileSystem;

/// Offered by a file system that may go away while the program runs. *Thread-safe*.
class FRemovableFileSystem : public FUnknown
{
public:
    /// Borrowed.
    virtual FFileSystem* getFileSystem() = 0;
    /// Lets go of what it stands on; from then on nothing can be opened. False, and mounted still, while one of its
    /// streams is open, and where it refuses.
    virtual bool unmount() = 0;

    DECLARE_INTERFACE_ID
};
