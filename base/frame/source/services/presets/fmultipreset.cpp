#include "services/presets/fmultipreset.h"

#include "foundation/object/iptr.h"
#include "services/presets/storedobject.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/ringguard.h"
#include "storage/stream/fstream.h"

DEFINE_CLASS(FMultiPreset, CmObject)

namespace
{
constexpr const char* kObjects = "Objects";
constexpr const char* kIsCopy = "IsCopy";
} // namespace

FMultiPreset::FMultiPreset(bool holdsCopies) : isCopy(holdsCopies)
{
    objects.retainElements();
}

FMultiPreset::FMultiPreset(const FMultiPreset& other) : CmObject(other), isCopy(other.isCopy)
{
    objects.retainElements();
    for (int i = 0; i < other.objects.total(); i++)
        addObject(other.objects.at(i));
}

FMultiPreset::~FMultiPreset()
{
    removeObjects();
}

// Objects

bool FMultiPreset::addObject(CmObject* object)
{
    if (!object || object == this)
        return false;
    return isCopy ? keep(adopt(object->newCopy())) : keep(object);
}

bool FMultiPreset::keep(CmObject* object)
{
    if (object == this || !objects.add(object))
        return false;
    if (!isCopy)
        object->addDependent(this);
    return true;
}

void FMultiPreset::removeObjects()
{
    for (int i = 0; i < objects.total() && !isCopy; i++)
        objects.at(i)->removeDependent(this);
    objects.removeAll();
}

CmObject* FMultiPreset::getPresetObject(unsigned int index) const
{
    return index < countObjects() ? resolveKeptObject(objects.at(static_cast<int>(index))) : nullptr;
}

// Changes

void FMultiPreset::update(CmObject*, int message)
{
    // The objects are held, so that none goes while it is here; what one says at its end isn't for others.
    if (message == kMessageDestroyed)
        return;
    isForwarding = true;
    changed(message);
    isForwarding = false;
}

void FMultiPreset::updateDone(int message)
{
    if (isForwarding)
        return;
    for (int i = 0; i < objects.total(); i++)
        objects.at(i)->updateDone(message);
}

// Comparison

bool FMultiPreset::isEqual(const CmObject* other) const
{
    const auto* preset = FCast(FMultiPreset, other);
    if (!preset || preset->countObjects() != countObjects())
        return false;
    for (int i = 0; i < objects.total(); i++)
        if (!objects.at(i)->isEqual(preset->objects.at(i)))
            return false;
    return true;
}

unsigned FMultiPreset::hash(unsigned size) const
{
    if (size == 0)
        return 0;
    uint64 sum = countObjects();
    for (int i = 0; i < objects.total(); i++)
        sum = sum * 31 + objects.at(i)->hash(size);
    return static_cast<unsigned>(sum % size);
}

// Storage

bool FMultiPreset::storeAttributes(FAttributes& attributes) const
{
    for (int i = 0; i < objects.total(); i++)
        attributes.queueObject(kObjects, objects.at(i));
    return attributes.set(kIsCopy, isCopy);
}

bool FMultiPreset::restoreAttributes(FAttributes& attributes)
{
    removeObjects();
    isCopy = attributes.getInt(kIsCopy) != 0;
    const auto* stored = attributes.containsAttribute(kObjects)
                             ? FCast(FObjectList, attributes.entry(kObjects).getObj())
                             : nullptr;
    const RingGuard guard(*this);
    for (int i = 0; stored && i < stored->total(); i++)
    {
        const IPtr<CmObject> object = keepStoredObject(stored->at(i));
        if (!guard.isRing())
            keep(object);
    }
    return true;
}

bool FMultiPreset::externalize(FArchive& archive) const
{
    if (!archive.getStream().writeBool(isCopy) || !archive.writeCount(objects.total()))
        return false;
    for (unsigned int i = 0; i < countObjects(); i++)
        if (!archive.writeObject(getPresetObject(i), true))
            return false;
    return true;
}

bool FMultiPreset::internalize(FArchive& archive)
{
    removeObjects();
    int count = 0;
    if (!archive.getStream().readBool(isCopy) || !archive.readCount(count))
        return false;
    const RingGuard guard(*this);
    for (int i = 0; i < count; i++)
    {
        const auto object = adopt(archive.readObject(nullptr, true));
        if (!object || guard.isRing())
            return false;
        keep(object);
    }
    return true;
}
