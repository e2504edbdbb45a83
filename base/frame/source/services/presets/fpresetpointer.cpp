#include "services/presets/fpresetpointer.h"

#include "foundation/object/stringhash.h"
#include "services/presets/fpresetpool.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/optionaltext.h"

DEFINE_CLASS(FPresetPointer, CmObject)

namespace
{
constexpr const char* kList = "List";
constexpr const char* kPreset = "Preset";
} // namespace

FPresetPointer::FPresetPointer(const char16* listID, const char16* presetName)
    : list(listID),
      name(presetName)
{
}

FPresetPointer::FPresetPointer(const FPresetPointer& other)
    : CmObject(other),
      list(other.list),
      name(other.name)
{
    setDependent(other.followed);
}

FPresetPointer::~FPresetPointer()
{
    setDependent(nullptr);
}

bool FPresetPointer::setPreset(FPresetList& presetList, int index)
{
    FPreset* preset = presetList.getPreset(index);
    if (!preset)
        return false;
    list.assign(presetList.getID());
    name.assign(preset->getName());
    setDependent(preset);
    return true;
}

CmObject* FPresetPointer::getPresetObject() const
{
    FPresetList* presets = gPresetPool ? gPresetPool->getPresetList(list.text16()) : nullptr;
    return presets ? presets->getPresetObject(presets->findPreset(name.text16())) : nullptr;
}

void FPresetPointer::setDependent(CmObject* followedObject)
{
    if (followed)
        followed->removeDependent(this);
    followed = followedObject;
    if (followed)
        followed->addDependent(this);
}

void FPresetPointer::update(CmObject* changedObject, int message)
{
    if (message == kMessageDestroyed)
        return setDependent(nullptr);
    if (const auto* preset = FCast(FPreset, changedObject))
        name.assign(preset->getName());
    changed(message);
}

bool FPresetPointer::isEqual(const CmObject* other) const
{
    const auto* pointer = FCast(FPresetPointer, other);
    return pointer && pointer->list == list && pointer->name == name;
}

unsigned FPresetPointer::hash(unsigned size) const
{
    return hashString16(name.text16(), size);
}

bool FPresetPointer::storeAttributes(FAttributes& attributes) const
{
    return attributes.set(kList, list) && attributes.set(kPreset, name);
}

bool FPresetPointer::restoreAttributes(FAttributes& attributes)
{
    setDependent(nullptr);
    OptionalText::restore(attributes, kList, list);
    OptionalText::restore(attributes, kPreset, name);
    return true;
}

bool FPresetPointer::externalize(FArchive& archive) const
{
    return list.externalize(archive) && name.externalize(archive);
}

bool FPresetPointer::internalize(FArchive& archive)
{
    setDependent(nullptr);
    return list.internalize(archive) && name.internalize(archive);
}
