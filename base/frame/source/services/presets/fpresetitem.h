#pragma once

#include "foundation/object/cmobject.h"

class FPresetList;

/// What stands in a list of presets: a preset or a list below it.
///
/// An item belongs to one list at most, so that lists form trees, whatever a file says. Main thread.
class FPresetItem : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FPresetItem, CmObject)

    FPresetItem() = default;
    /// The copy belongs to no list.
    FPresetItem(const FPresetItem& other) : CmObject(other) {}
    FPresetItem& operator=(const FPresetItem&) = delete;

    /// For the user; borrowed, never null.
    virtual const char16* getName() const = 0;
    /// The list in which the item stands; null where it stands in none.
    FPresetList* getOwner() const { return owner; }

private:
    friend class FPresetList;

    FPresetList* owner = nullptr;
};
