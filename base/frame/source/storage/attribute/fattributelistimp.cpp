#include "storage/attribute/fattributelistimp.h"

#include "foundation/object/cmdelegatingunknown.h"
#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fxmlobject.h"

namespace
{
constexpr int32 kNoSuchValue = 1;

bool toKey(const char* text, const char*& key)
{
    key = text;
    return text != nullptr;
}

bool toKey(const char* text, unsigned int& key)
{
    return text && FIntIDAttribute::parseKey(text, key);
}

std::string toText(const char* key)
{
    return key;
}

std::string toText(unsigned int key)
{
    return std::to_string(key);
}

void copyTo(IAttributeList& target, const char* key, FAttributeValue& value)
{
    const void* block = nullptr;
    uint32 size = 0;
    if (value.getType() & FAttributeValue::kInteger)
        target.setIntAttribute(key, value.getLong());
    else if (value.isNumber())
        target.setFloatAttribute(key, value.getFloat());
    else if (value.isString())
        target.setStringAttribute(key, value.getString16());
    else if (getBinaryBlock(value.getObj(), block, size))
        target.setBinaryAttribute(key, block, size);
    else if (FUnknown* unknown = value.getUnknown())
        target.setObjectAttribute(key, unknown);
}
} // namespace

template <class List>
int32 FAttributeListImp<List>::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IAttributeList::iid))
        return offerInterface<IAttributeList>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

template <class List>
FAttributeValue* FAttributeListImp<List>::find(const char* key) const
{
    decltype(list->entryAt(0)->getKey()) listKey{};
    return toKey(key, listKey) ? list->getAttribute(listKey) : nullptr;
}

/// The value to set; null for a key that the list can't have.
template <class List>
FAttributeValue* FAttributeListImp<List>::make(const char* key)
{
    decltype(list->entryAt(0)->getKey()) listKey{};
    return toKey(key, listKey) ? &list->entry(listKey) : nullptr;
}

template <class List>
int32 FAttributeListImp<List>::setIntAttribute(const char* key, int64 value)
{
    FAttributeValue* target = make(key);
    if (!target)
        return kNoSuchValue;
    target->setLong(value);
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::getIntAttribute(const char* key, int64* value)
{
    const FAttributeValue* found = find(key);
    if (!found || !found->isNumber())
        return kNoSuchValue;
    *value = found->getLong();
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::setFloatAttribute(const char* key, double value)
{
    FAttributeValue* target = make(key);
    if (!target)
        return kNoSuchValue;
    target->setFloat(value);
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::getFloatAttribute(const char* key, double* value)
{
    const FAttributeValue* found = find(key);
    if (!found || !found->isNumber())
        return kNoSuchValue;
    *value = found->getFloat();
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::setStringAttribute(const char* key, const char16* text)
{
    FAttributeValue* target = make(key);
    if (!target)
        return kNoSuchValue;
    target->setString16(text);
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::getStringAttribute(const char* key, const char16** text)
{
    FAttributeValue* found = find(key);
    if (!found || !found->isString())
        return kNoSuchValue;
    *text = found->getString16();
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::setBinaryAttribute(const char* key, const void* data, uint32 size)
{
    FAttributeValue* target = make(key);
    if (!target)
        return kNoSuchValue;
    target->setObj(new FAttrBuffer(data, size, true), FAttributeValue::kOwned);
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::getBinaryAttribute(const char* key, const void** data, uint32* size)
{
    const FAttributeValue* found = find(key);
    return found && getBinaryBlock(found->getObj(), *data, *size) ? kResultOk : kNoSuchValue;
}

template <class List>
int32 FAttributeListImp<List>::setObjectAttribute(const char* key, FUnknown* object)
{
    FAttributeValue* target = object ? make(key) : nullptr;
    if (!target)
        return kNoSuchValue;
    if (CmObject* own = toCmObject(object))
        target->setObj(own, FAttributeValue::kBorrowed);
    else
        target->setUnknown(object, FAttributeValue::kBorrowed);
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::getObjectAttribute(const char* key, FUnknown** object)
{
    const FAttributeValue* found = find(key);
    if (!found)
        return kNoSuchValue;
    FUnknown* unknown = found->getObj() ? resolveUnknown(found->getObj()) : found->getUnknown();
    if (!unknown)
        return kNoSuchValue;
    *object = unknown;
    return kResultOk;
}

template <class List>
int32 FAttributeListImp<List>::removeAttribute(const char* key)
{
    decltype(list->entryAt(0)->getKey()) listKey{};
    return toKey(key, listKey) && list->removeAttribute(listKey) ? kResultOk : kNoSuchValue;
}

template <class List>
int32 FAttributeListImp<List>::addAllTo(IAttributeList* target)
{
    if (!target)
        return kNoSuchValue;
    for (int i = 0; i < list->total(); i++)
        copyTo(*target, toText(list->entryAt(i)->getKey()).c_str(), *list->entryAt(i));
    return kResultOk;
}

template class FAttributeListImp<FStringAttributeList>;
template class FAttributeListImp<FStringAttributeArray>;
template class FAttributeListImp<FIntAttributeList>;
