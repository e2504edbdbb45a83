#include "storage/attribute/fcmobjectstripper.h"

#include "containers/value/cmbuffer.h"
#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/stream/fmemorystream.h"

namespace
{
/// What trees hold and files know as such.
bool isPlainData(const CmObject* object)
{
    return FCast(FAttrList, object) || FCast(FAttrBuffer, object) || FCast(CmBuffer, object) ||
           FCast(FMemoryStream, object);
}

FXmlInstance* getInstance(CmObject* object)
{
    auto* placeholder = FCast(FXmlObject, object);
    return placeholder ? placeholder->getInstance() : nullptr;
}

/// The object at a place of a tree, or that which was made of the placeholder there; null where neither is.
CmObject* getLiveObject(CmObject* object)
{
    if (const FXmlInstance* instance = getInstance(object))
        return instance->getMadeObject();
    return FCast(FXmlObject, object) || isPlainData(object) ? nullptr : object;
}
} // namespace

void FCmObjectStripper::stripCmObjects(FAttributes& attributes)
{
    CmHashTable seen(50);
    seen.setHashFunction(gHashObject);
    seen.setAutoResize(true);
    stripAttributes(attributes, seen);
    // By index: stripping what an object stores finds further ones.
    for (size_t i = 0; i < waiting.size(); i++)
    {
        const IPtr<FXmlInstance> instance = waiting[i];
        holder = instance;
        stripAttributes(*instance->getStoredAttributes(), seen);
    }
    linker.link();
}

void FCmObjectStripper::stripAttributes(FAttributes& attributes, CmHashTable& seen)
{
    for (int i = 0; i < attributes.total();)
        if (stripValue(*attributes.entryAt(i), seen))
            i++;
        else
            attributes.removeEntryAt(i);
}

bool FCmObjectStripper::stripValue(FAttributeValue& value, CmHashTable& seen)
{
    CmObject* object = value.getObj();
    if (!object)
        object = toCmObject(value.getUnknown());
    if (auto* tree = FCast(FAttributes, object))
        stripAttributes(*tree, seen);
    else if (auto* trees = FCast(FSubList, object))
        for (int i = 0; i < trees->total(); i++)
            stripAttributes(*trees->at(i), seen);
    else if (auto* list = FCast(FObjectList, object))
        stripList(*list, seen);
    else if (CmObject* live = getLiveObject(object))
    {
        FXmlObject* placeholder = stripObject(live, seen);
        value.setObj(placeholder, FAttributeValue::kOwned);
        return placeholder != nullptr;
    }
    else if (value.getKind() == FAttributeValue::kUnknown)
        return false;
    else
        stripStored(object);
    return true;
}

/// Has the tree behind a placeholder stripped too: it may lead to objects that were made.
void FCmObjectStripper::stripStored(CmObject* object)
{
    FXmlInstance* instance = getInstance(object);
    if (instance && instance->getStoredAttributes() && met.insert(instance).second)
        waiting.push_back(instance);
}

void FCmObjectStripper::stripList(FObjectList& list, CmHashTable& seen)
{
    for (int i = 0; i < list.total();)
    {
        CmObject* live = getLiveObject(list.at(i));
        auto placeholder = live ? adopt(stripObject(live, seen)) : nullptr;
        if (placeholder)
            list.replaceAt(i, placeholder);
        else if (!live)
            stripStored(list.at(i));
        if (placeholder || !live)
            i++;
        else
            list.removeAt(i);
    }
}

FXmlObject* FCmObjectStripper::stripObject(CmObject* object, CmHashTable& seen)
{
    auto reference = adopt(new FXmlReference(getObjectNumber(object)));
    if (!seen.lookup(reference))
    {
        auto tree = adopt(new FAttributes);
        if (!object->storeAttributes(*tree))
            return nullptr;
        auto instance = adopt(new FXmlInstance(reference->getID(), object->getClass()->persistentName, tree));
        stripped.push_back(object);
        seen.add(instance);
        met.insert(instance);
        waiting.push_back(instance);
        linker.addInstance(instance);
        if (!holder)
        {
            linker.addRoot(instance);
            return instance.take();
        }
    }
    // In what an object stores, all places are references: these may form circles, which the linker sees to.
    linker.addReference(reference, holder);
    return reference.take();
}
