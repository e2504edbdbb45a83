#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "services/presets/fpresetitem.h"

/// A named stored object.
///
/// The preset holds a reference on its object and shares it with its copies. It tells its dependents of a new name, by
/// `kMessageRenamed`, and of its end. Main thread.
class FPreset : public FPresetItem
{
    DECLARE_CLASS(FPreset, FPresetItem)

    static constexpr int kMessageRenamed = 1;

    enum Flags : uint32
    {
        kMayBeModified = 1,
        kRenamed = 2
    };

    FPreset() : FPreset(nullptr, nullptr, kMayBeModified) {}
    FPreset(const char16* itsName, CmObject* itsObject, uint32 itsFlags);
    FPreset(const FPreset& other) = default;
    ~FPreset() override;

    const char16* getName() const override { return name.text16(); }
    /// The preset then counts as renamed.
    void setName(const char16* text);
    /// Borrowed. Null where there is none, or its class is unknown.
    CmObject* getObject() const;
    bool mayBeModified() const { return (flags & kMayBeModified) != 0; }
    bool isRenamed() const { return (flags & kRenamed) != 0; }
    void setFlag(Flags flag, bool state) { flags = state ? flags | flag : flags & ~uint32{flag}; }

    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

protected:
    FString name;
    /// The object, or its stored form while its class is unknown.
    IPtr<CmObject> object;
    uint32 flags;
};
