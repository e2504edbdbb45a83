#include "storage/attribute/fobjectlist.h"

#include "foundation/object/fvariant.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fxmlobject.h"
#include "storage/attribute/ringguard.h"

DEFINE_CLASS(FObjectList, FAttrList)

void FObjectList::queue(CmObject* object, bool takeOver)
{
    objects.push_back(takeOver ? adopt(object) : IPtr<CmObject>(object));
}

CmObject* FObjectList::unqueue()
{
    const int index = advance();
    return index < 0 ? nullptr : at(index);
}

bool FObjectList::unqueueVariant(FVariant& value)
{
    CmObject* object = unqueue();
    if (!object)
        return false;
    value.setObject(resolveUnknown(object));
    return true;
}

bool FObjectList::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const auto& object : objects)
        if (!archive.writeObject(object, true))
            return false;
    return true;
}

bool FObjectList::internalize(FArchive& archive)
{
    objects.clear();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    const RingGuard guard(*this);
    for (int i = 0; i < count; i++)
    {
        const auto object = adopt(archive.readObject("CmObject", true));
        if (!object || guard.isRing())
            return false;
        queue(object, false);
    }
    return true;
}
