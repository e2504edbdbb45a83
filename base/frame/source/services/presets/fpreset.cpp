#include "services/presets/fpreset.h"

#include "services/presets/storedobject.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/optionaltext.h"
#include "storage/attribute/ringguard.h"
#include "storage/stream/fstream.h"

DEFINE_CLASS(FPreset, FPresetItem)

namespace
{
constexpr const char* kName = "Name";
constexpr const char* kObject = "Object";
constexpr const char* kNoModify = "No Modify";
constexpr const char* kUnrenamed = "Unrenamed";

bool isSet(const FAttributes& attributes, const char* key)
{
    return attributes.getInt(key) != 0;
}
} // namespace

FPreset::FPreset(const char16* itsName, CmObject* itsObject, uint32 itsFlags)
    : name(itsName),
      object(itsObject),
      flags(itsFlags)
{
}

FPreset::~FPreset()
{
    changed(kMessageDestroyed);
}

void FPreset::setName(const char16* text)
{
    name.assign(text ? text : u"");
    setFlag(kRenamed, true);
    changed(kMessageRenamed);
}

CmObject* FPreset::getObject() const
{
    return resolveKeptObject(object);
}

bool FPreset::storeAttributes(FAttributes& attributes) const
{
    attributes.set(kName, name);
    attributes.setObject(kObject, object);
    if (!mayBeModified())
        attributes.set(kNoModify, 1);
    if (!isRenamed())
        attributes.set(kUnrenamed, 1);
    return true;
}

bool FPreset::restoreAttributes(FAttributes& attributes)
{
    OptionalText::restore(attributes, kName, name);
    object = nullptr;
    const RingGuard guard(*this);
    IPtr<CmObject> stored;
    if (attributes.containsAttribute(kObject))
        stored = keepStoredObject(attributes.entry(kObject).getObj());
    if (!guard.isRing())
        object = stored;
    setFlag(kMayBeModified, !isSet(attributes, kNoModify));
    setFlag(kRenamed, !isSet(attributes, kUnrenamed));
    return true;
}

bool FPreset::externalize(FArchive& archive) const
{
    return name.externalize(archive) && archive.writeObject(getObject(), true) &&
           archive.getStream().writeInt32(static_cast<int32>(flags));
}

bool FPreset::internalize(FArchive& archive)
{
    if (!name.internalize(archive))
        return false;
    object = nullptr;
    const RingGuard guard(*this);
    // An object of an unknown class is passed over.
    const auto stored = adopt(archive.readObject(nullptr, true));
    if (!guard.isRing())
        object = stored;
    int32 storedFlags = 0;
    const bool isRead = archive.getStream().readInt32(storedFlags);
    flags = static_cast<uint32>(storedFlags) & (kMayBeModified | kRenamed);
    return isRead;
}
