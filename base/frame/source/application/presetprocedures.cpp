#include "application/onetimeprocedure.h"
#include "services/defaults/fdefaultpool.h"
#include "services/presets/fpresetpool.h"

// The presets are loaded and saved with the user's settings, and go after those were saved.

namespace
{
constexpr unsigned kLevelBeforeClasses = 1;
constexpr unsigned kLevelAfterSettings = 100;

bool registerPresets()
{
    FDefaultPool::addPostLoadFunc(&PostDefLoadFPresetPool);
    FDefaultPool::addPreSaveFunc(&PreDefSaveFPresetPool);
    return true;
}

bool releasePresets()
{
    if (gPresetPool)
        gPresetPool->release();
    gPresetPool = nullptr;
    return true;
}

OneTimeProcedure registering("register presets", kLevelBeforeClasses, &registerPresets);
OneTimeProcedure releasing("release presets", kLevelAfterSettings, &releasePresets,
                           OneTimeProcedure::kTerminator);
} // namespace
