#pragma once

#include "containers/sequence/cmarray.h"
#include "services/presets/fpresetpointer.h"

/// A choice of presets from any lists, as a user's favourites. It owns its pointers. Main thread.
class FPresetPointerList : public CmArray
{
    DECLARE_CLASS(FPresetPointerList, CmArray)

    FPresetPointerList() { takeElements(); }
    FPresetPointerList(const FPresetPointerList& other) = default;

    /// Points to the preset and follows it. False where there is none, or the list has it already.
    bool addPointerTo(FPresetList& presetList, int index);
    /// Borrowed; null out of range.
    FPresetPointer* pointerAt(int index) const { return FCast(FPresetPointer, at(index)); }
};
