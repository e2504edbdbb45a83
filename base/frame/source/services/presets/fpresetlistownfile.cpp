#include "services/presets/fpresetlistownfile.h"

DEFINE_CLASS(FPresetListOwnFile, FPresetList)
