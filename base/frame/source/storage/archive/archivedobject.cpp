#include "storage/archive/archivedobject.h"

#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/attribute/fxmlinstance.h"

ArchivedKind getArchivedKind(const CmObject* object)
{
    if (!object)
        return ArchivedKind::kNothing;
    if (FCast(FAttributes, object))
        return ArchivedKind::kTree;
    if (FCast(FObjectList, object))
        return ArchivedKind::kObjectList;
    if (FCast(FSubList, object))
        return ArchivedKind::kSubList;
    if (FCast(FIntList, object))
        return ArchivedKind::kIntList;
    if (FCast(FFloatList, object))
        return ArchivedKind::kFloatList;
    if (FCast(FStringList, object))
        return ArchivedKind::kStringList;
    const void* data = nullptr;
    uint32 size = 0;
    return getBinaryBlock(object, data, size) ? ArchivedKind::kBinary : ArchivedKind::kObject;
}

CmObject* getArchivedObject(const FAttributeValue& value)
{
    CmObject* object = value.getObj();
    return object ? object : toCmObject(value.getUnknown());
}

bool isArchived(const FAttributeValue& value)
{
    constexpr unsigned plain = FAttributeValue::kInteger | FAttributeValue::kFloat | FAttributeValue::kString;
    return value.getType() & plain || getArchivedObject(value);
}

CmObject* getSharedObject(CmObject* object)
{
    auto* placeholder = FCast(FXmlObject, object);
    if (!placeholder)
        return object;
    FXmlInstance* instance = placeholder->getInstance();
    CmObject* made = instance ? instance->getMadeObject() : nullptr;
    return made ? made : instance;
}

const char* getArchivedClass(const CmObject* object)
{
    const auto* instance = FCast(FXmlInstance, object);
    return instance ? instance->getClassName() : object->getClass()->persistentName;
}

IPtr<FAttributes> getArchivedTree(const CmObject* object)
{
    if (const auto* instance = FCast(FXmlInstance, object))
        return instance->getStoredAttributes();
    auto tree = adopt(new FAttributes);
    return object->storeAttributes(*tree) ? tree : nullptr;
}
