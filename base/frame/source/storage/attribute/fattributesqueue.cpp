#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/fvariant.h"
#include "foundation/text/string.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/attribute/fxmlobject.h"

// The queues of an attribute tree.

FAttrList* FAttributes::findQueue(const char* key) const
{
    const FAttributeValue* found = find(key);
    return found ? FCast(FAttrList, found->getObj()) : nullptr;
}

/// The queue of this key, if it is of the kind `List`.
template <class List>
List* FAttributes::queueOf(const char* key, const char* className) const
{
    const FAttributeValue* found = find(key);
    return found ? castObject<List>(found->getObj(), className) : nullptr;
}

template <class List>
List& FAttributes::makeQueue(const char* key, const char* className)
{
    if (List* present = queueOf<List>(key, className))
        return *present;
    auto* made = new List;
    setObject(key, made, true);
    return *made;
}

// Putting in

bool FAttributes::queueInt(const char* key, long long value)
{
    makeQueue<FIntList>(key, "FIntList").queue(value);
    return true;
}

bool FAttributes::queueFloat(const char* key, double value)
{
    makeQueue<FFloatList>(key, "FFloatList").queue(value);
    return true;
}

bool FAttributes::queueString(const char* key, const char16* text, bool copy)
{
    return queueString16(key, text, copy);
}

bool FAttributes::queueString8(const char* key, const char* text, bool copy)
{
    makeQueue<FStringList>(key, "FStringList").queue(text, false, copy);
    return true;
}

bool FAttributes::queueString16(const char* key, const char16* text, bool copy)
{
    makeQueue<FStringList>(key, "FStringList").queue(text, true, copy);
    return true;
}

bool FAttributes::queueObject(const char* key, CmObject* object, bool takeOver)
{
    if (!object)
        return false;
    makeQueue<FObjectList>(key, "FObjectList").queue(object, takeOver);
    return true;
}

bool FAttributes::queueMember(const char* key, const CmObject& object, bool strip)
{
    auto tree = adopt(new FAttributes);
    if (!object.storeAttributes(*tree))
        return false;
    if (strip)
        tree->stripObjects();
    return queueAttributes(key, tree);
}

bool FAttributes::queueAttributes(const char* key, FAttributes* attributes)
{
    if (!attributes)
        return false;
    makeQueue<FSubList>(key, "FSubList").queue(attributes, false);
    return true;
}

bool FAttributes::queue(const char* key, const FVariant& value)
{
    switch (value.getType())
    {
    case FVariant::kInteger:
        return queueInt(key, value.getInt());
    case FVariant::kFloat:
        return queueFloat(key, value.getFloat());
    case FVariant::kString8:
        return queueString8(key, value.getString8());
    case FVariant::kString16:
        return queueString16(key, value.getString16());
    case FVariant::kObject:
        return queueUnknown(key, value.getObject());
    default:
        return false;
    }
}

bool FAttributes::queueUnknown(const char* key, FUnknown* unknown)
{
    CmObject* object = toCmObject(unknown);
    if (auto* tree = FCast(FAttributes, object))
        return queueAttributes(key, tree);
    if (object || !unknown)
        return queueObject(key, object);
    return queueObject(key, new CmDelegatingUnknown(unknown, nullptr), true);
}

// Reading

bool FAttributes::unqueueInt(const char* key, long long& value) const
{
    auto* list = queueOf<FIntList>(key, "FIntList");
    return list && list->unqueue(value);
}

bool FAttributes::unqueueFloat(const char* key, double& value) const
{
    auto* list = queueOf<FFloatList>(key, "FFloatList");
    return list && list->unqueue(value);
}

const char16* FAttributes::unqueueString(const char* key) const
{
    auto* list = queueOf<FStringList>(key, "FStringList");
    return list ? list->unqueue() : nullptr;
}

bool FAttributes::unqueueString(const char* key, String& text) const
{
    const char16* next = unqueueString(key);
    if (!next)
        return false;
    text.assign(next);
    return true;
}

CmObject* FAttributes::unqueueObject(const char* key, const char* className) const
{
    auto* list = queueOf<FObjectList>(key, "FObjectList");
    while (CmObject* stored = list ? list->unqueue() : nullptr)
        if (CmObject* object = resolveObject(stored, className))
        {
            object->addRef();
            return object;
        }
    return nullptr;
}

FAttributes* FAttributes::unqueueAttributes(const char* key) const
{
    auto* list = queueOf<FSubList>(key, "FSubList");
    return list ? list->unqueue() : nullptr;
}

bool FAttributes::unqueueMember(const char* key, CmObject& object) const
{
    FAttributes* tree = unqueueAttributes(key);
    return tree && object.restoreAttributes(*tree);
}

bool FAttributes::unqueue(const char* key, FVariant& value) const
{
    FAttrList* list = findQueue(key);
    return list && list->unqueueVariant(value);
}

int FAttributes::getQueueItemCount(const char* key) const
{
    const FAttrList* list = findQueue(key);
    return list ? list->total() : 0;
}

FAttributes* FAttributes::lookupQueueObjectAttributes(const char* key) const
{
    const FAttrList* list = findQueue(key);
    if (!list || list->getPosition() >= list->total())
        return nullptr;
    if (const auto* trees = FCast(FSubList, list))
        return trees->at(list->getPosition());
    const auto* objects = FCast(FObjectList, list);
    auto* placeholder = objects ? FCast(FXmlObject, objects->at(list->getPosition())) : nullptr;
    return placeholder ? placeholder->getAttributes() : nullptr;
}

bool FAttributes::resetQueue(const char* key) const
{
    FAttrList* list = findQueue(key);
    if (list)
        list->reset();
    return list != nullptr;
}

bool FAttributes::resetAllQueues() const
{
    for (int i = 0; i < total(); i++)
        if (auto* list = FCast(FAttrList, entryAt(i)->getObj()))
            list->reset();
    return true;
}
