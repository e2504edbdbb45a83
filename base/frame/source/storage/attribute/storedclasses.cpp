#include "storage/attribute/storedclasses.h"

#include "foundation/object/classfactory.h"
#include "foundation/object/cmobject.h"

namespace
{
/// Whether objects of the class can be a `className`. An alias has no base, so only its objects can tell.
bool mayBe(const MetaClass& meta, const char* className)
{
    return !className || !meta.baseClass || meta.isTypeOf(className);
}
} // namespace

MetaClass* findStoredClass(const std::string& name)
{
    const ClassFactory* factory = ClassFactory::instance(false);
    return factory ? factory->getMetaClassByName(name.c_str()) : nullptr;
}

IPtr<CmObject> createStoredObject(const MetaClass* meta, const char* className)
{
    if (!meta || !meta->createFunction || !mayBe(*meta, className))
        return nullptr;
    const auto made = adopt(meta->createFunction());
    CmObject* object = toCmObject(made);
    return object && (!className || object->isTypeOf(className, true)) ? object : nullptr;
}
