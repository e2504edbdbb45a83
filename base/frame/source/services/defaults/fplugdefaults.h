#pragma once

#include "services/defaults/fdefaultpool.h"

/// Settings of a plug-in's own, in a file of its own in the user folder. Main thread.
class FPlugDefaults : public FDefaultPool
{
    DECLARE_CLASS(FPlugDefaults, FDefaultPool)

    /// `name` without folder and extension. A missing or damaged file gives false and leaves the pool as it was.
    bool load(const char16* name, const char* rootTag);
    /// Asks nobody. On failure the earlier file stays.
    bool save(const char16* name, const char* rootTag);
};
