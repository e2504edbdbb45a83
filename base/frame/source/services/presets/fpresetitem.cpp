#include "services/presets/fpresetitem.h"

DEFINE_ABSTRACT_CLASS(FPresetItem, CmObject)
