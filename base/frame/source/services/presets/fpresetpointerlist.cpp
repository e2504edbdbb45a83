#include "services/presets/fpresetpointerlist.h"

#include "foundation/object/iptr.h"

DEFINE_CLASS(FPresetPointerList, CmArray)

bool FPresetPointerList::addPointerTo(FPresetList& presetList, int index)
{
    auto pointer = adopt(new FPresetPointer);
    return pointer->setPreset(presetList, index) && !contains(pointer) && add(pointer.get()) &&
           pointer.take();
}
