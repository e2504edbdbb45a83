#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmiterator.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/ringguard.h"
#include "storage/stream/fstream.h"

#include <memory>

namespace
{
constexpr const char* kOwnership = "ownership";
constexpr const char* kElement = "obj";
} // namespace

bool CmContainer::externalize(FArchive& archive) const
{
    if (!archive.getStream().writeInt16(_ownsObjects) || !archive.writeCount(total()))
        return false;
    for (std::unique_ptr<CmIterator> it(newIterator()); !it->done();)
        if (!archive.writeObject(it->next(), true))
            return false;
    return true;
}

bool CmContainer::internalize(FArchive& archive)
{
    // In mode 0 the elements keep the one reference that the archive gives them.
    _ownsObjects = kShared;
    int16 mode = kShared;
    int count = 0;
    const RingGuard guard(*this);
    bool isRead = archive.getStream().readInt16(mode) && archive.readCount(count);
    for (int i = 0; isRead && i < count; i++)
    {
        auto object = adopt(archive.readObject("CmObject", true));
        isRead = object && !guard.isRing() && addRestored(object.take());
    }
    _ownsObjects = mode;
    return isRead;
}

bool CmContainer::storeAttributes(FAttributes& attributes) const
{
    if (_ownsObjects != kShared)
        attributes.set(kOwnership, _ownsObjects);
    bool isStored = true;
    for (std::unique_ptr<CmIterator> it(newIterator()); !it->done();)
        isStored = attributes.queueObject(kElement, it->next()) && isStored;
    return isStored;
}

bool CmContainer::restoreAttributes(FAttributes& attributes)
{
    // In mode 0 the elements keep the one reference that they come with.
    _ownsObjects = kShared;
    int16 mode = kShared;
    attributes.get(kOwnership, mode);
    const RingGuard guard(*this);
    while (auto object = adopt(attributes.unqueueObject(kElement, "CmObject")))
        if (!guard.isRing())
            addRestored(object.take());
    _ownsObjects = mode;
    return true;
}
