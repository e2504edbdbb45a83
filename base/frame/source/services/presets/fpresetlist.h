#pragma once

#include "containers/sequence/cmarray.h"
#include "foundation/object/iptr.h"
#include "services/presets/fpreset.h"

#include <vector>

class RingGuard;

/// A list of presets, with further lists below it.
///
/// Presets are counted apart from lists, each from 0; an index out of range gives null, false or -1. A copy has items
/// of its own, whose objects are shared. Main thread.
class FPresetList : public FPresetItem
{
    DECLARE_CLASS(FPresetList, FPresetItem)

    FPresetList();
    /// `listID` tells the list from others; without a name it is the name, too.
    explicit FPresetList(const char16* listID, const char16* listName = nullptr);
    FPresetList(const FPresetList& other);
    ~FPresetList() override;

    const char16* getName() const override { return name.text16(); }
    const char16* getID() const { return id.text16(); }

    /// Borrowed, until the preset is renamed or goes.
    virtual const char16* getPresetName(int index);
    /// Borrowed; null also where the object can't be had.
    virtual CmObject* getPresetObject(int index);
    virtual bool setPresetName(int index, const char16* presetName);
    virtual bool canModifiyPreset(int index);
    /// Whether the preset has got its name from the user.
    virtual bool presetRenamed(int index);
    virtual bool resetRenameState(int index);
    /// Holds a reference on `object`. Gives the new preset's index; -1 without an object.
    virtual int addPreset(CmObject* object, const char16* presetName, bool mayBeModified = true,
                          bool isRenamed = true);
    virtual bool removePresetAt(int index);
    /// Of this list, not of those below it.
    virtual void removeNonModifyPresets();
    /// Adds the objects of this list and of all below it, in a way that fits the container's mode; gives their number.
    virtual int collectPresetObjects(CmContainer& result);
    virtual int countSubLists();
    /// Borrowed, as are the other lists given.
    virtual FPresetList* getSubList(int index);
    /// The first one of that name.
    virtual FPresetList* getSubListByName(const char16* listName);
    /// Gives the list of that name where there is one already.
    virtual FPresetList* addSubList(const char16* listName);
    virtual int countPresets();

    /// The entry itself, borrowed, for dependents.
    FPreset* getPreset(int index);
    /// The first preset of that name; -1 where there is none.
    int findPreset(const char16* presetName);

    bool storeAttributes(FAttributes& attributes) const override;
    /// False where there is no ID.
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

protected:
    /// Called before the items are looked at.
    virtual void prepare() {}
    /// False, with the item given back, where it belongs to a list already or this list stands below it.
    bool addItem(const IPtr<FPresetItem>& item);
    bool removeItem(FPresetItem* item);
    void removeAll();
    const std::vector<FPreset*>& getPresets() const { return presets; }
    const std::vector<FPresetList*>& getSubLists() const { return subLists; }

    FString name;
    FString id;
    CmArray items{0, -1};

private:
    bool isWithin(const FPresetItem* item) const;
    template <class Item>
    void restoreMembers(FAttributes& attributes, const char* key, const RingGuard& guard);

    // The items by kind, so that an index needs no search.
    std::vector<FPreset*> presets;
    std::vector<FPresetList*> subLists;
};
