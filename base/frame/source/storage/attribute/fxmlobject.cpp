#include "storage/attribute/fxmlobject.h"

#include "foundation/object/classfactory.h"
#include "foundation/object/cmdelegatingunknown.h"
#include "storage/attribute/fxmlinstance.h"

#include <cstdint>

DEFINE_ABSTRACT_CLASS(FXmlObject, CmObject)

namespace
{
/// Whether the class of that name can be made and be a `className`; an alias has no base, so only its objects tell.
bool mayBe(const char* storedClass, const char* className)
{
    const ClassFactory* factory = ClassFactory::instance(false);
    const MetaClass* meta = factory && *storedClass ? factory->getMetaClassByName(storedClass) : nullptr;
    return !className || !meta || !meta->baseClass || meta->isTypeOf(className);
}
} // namespace

CmObject* FXmlObject::getObject(const char* className)
{
    FXmlInstance* instance = getInstance();
    if (!instance || !mayBe(instance->getClassName(), className))
        return nullptr;
    CmObject* object = instance->makeObject(className);
    return object && (!className || object->isTypeOf(className, true)) ? object : nullptr;
}

FAttributes* FXmlObject::getAttributes()
{
    const FXmlInstance* instance = getInstance();
    return instance ? instance->getStoredAttributes() : nullptr;
}

bool FXmlObject::isEqual(const CmObject* other) const
{
    const auto* placeholder = FCast(FXmlObject, other);
    return placeholder && placeholder->id == id;
}

int FXmlObject::compare(const CmObject* other) const
{
    const auto* placeholder = FCast(FXmlObject, other);
    if (!placeholder)
        return CmObject::compare(other);
    return id < placeholder->id ? -1 : id > placeholder->id;
}

unsigned FXmlObject::hash(unsigned size) const
{
    return gHashObject(this, size);
}

uint64 getObjectNumber(const CmObject* object)
{
    if (const auto* placeholder = FCast(FXmlObject, object))
        return placeholder->getID();
    return reinterpret_cast<uintptr_t>(object);
}

unsigned gHashObject(const CmObject* object, unsigned size)
{
    return static_cast<unsigned>(getObjectNumber(object) % size);
}

CmObject* resolveObject(CmObject* object, const char* className)
{
    if (auto* placeholder = FCast(FXmlObject, object))
        return placeholder->getObject(className);
    return object && (!className || object->isTypeOf(className, true)) ? object : nullptr;
}

FUnknown* resolveUnknown(CmObject* object)
{
    CmObject* live = resolveObject(object, nullptr);
    if (const auto* wrapper = FCast(CmDelegatingUnknown, live))
        return wrapper->getDelegate();
    return live;
}
