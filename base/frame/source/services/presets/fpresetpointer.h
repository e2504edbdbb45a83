#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "services/presets/fpresetlist.h"

/// Points to a preset of a list in the pool by their names, and so leads to it again in the next run of the program.
///
/// While it follows the preset, the pointer takes over its new names and tells its own dependents of them. When the
/// preset goes, it stays with the last name. Main thread.
class FPresetPointer : public CmObject
{
    DECLARE_CLASS(FPresetPointer, CmObject)

    FPresetPointer() = default;
    /// Points to the preset of this name, whether or not there is one yet.
    FPresetPointer(const char16* listID, const char16* presetName);
    /// The copy follows what the other follows.
    FPresetPointer(const FPresetPointer& other);
    FPresetPointer& operator=(const FPresetPointer&) = delete;
    ~FPresetPointer() override;

    const char16* getListID() const { return list.text16(); }
    const char16* getPresetName() const { return name.text16(); }
    /// Points to the preset and follows it. False, with all as it was, where there is none.
    bool setPreset(FPresetList& presetList, int index);
    /// Borrowed; null where the pool has no such list or preset.
    CmObject* getPresetObject() const;
    /// Follows the object, and no other any more; null follows none. The object isn't held.
    void setDependent(CmObject* followedObject);

    using CmObject::update;
    void update(CmObject* changedObject, int message) override;
    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

private:
    FString list;
    FString name;
    CmObject* followed = nullptr;
};
