#include "storage/attribute/fxmlinstance.h"

#include "foundation/object/classfactory.h"
#include "storage/attribute/fxmlreference.h"

DEFINE_CLASS(FXmlInstance, FXmlObject)

namespace
{
thread_local int restoreDepth = 0;

IPtr<CmObject> createObject(const char* name)
{
    const ClassFactory* factory = ClassFactory::instance(false);
    if (!factory || !name || !*name)
        return nullptr;
    auto made = adopt(factory->createObjectByName(name));
    return toCmObject(made);
}

/// Releases a tree. Those of the objects that go with it follow when it is gone: objects form long chains, and one
/// release inside the other would exhaust the stack.
void releaseFlat(FAttributes* released)
{
    thread_local std::vector<FAttributes*>* waiting = nullptr;
    if (waiting)
        return waiting->push_back(released);
    std::vector<FAttributes*> list{released};
    waiting = &list;
    while (!list.empty())
    {
        FAttributes* next = list.back();
        list.pop_back();
        next->release();
    }
    waiting = nullptr;
}
} // namespace

FXmlInstance::FXmlInstance(uint64 objectID, const char* storedClass, FAttributes* storedAttributes)
    : FXmlObject(objectID),
      attributes(storedAttributes),
      className(storedClass ? storedClass : "")
{
    name.assign("");
}

FXmlInstance::FXmlInstance(const FXmlInstance& other)
    : FXmlObject(other),
      object(other.object),
      attributes(other.attributes ? adopt(new FAttributes(*other.attributes)) : nullptr),
      className(other.className),
      name(other.name)
{
}

FXmlInstance::~FXmlInstance()
{
    for (FXmlReference* reference : uncounted)
        reference->target = nullptr;
    if (attributes)
        releaseFlat(attributes.take());
}

CmObject* FXmlInstance::makeObject(const char* wantedClass)
{
    if (object || !attributes || restoreDepth >= FArchive::kMaxDepth)
        return object;
    // Objects that lead back to this one find it made already, and no tree to make it from again.
    const IPtr<FAttributes> tree = std::move(attributes);
    object = createObject(className.isEmpty() ? wantedClass : className.text8());
    if (!object)
        return nullptr;
    restoreDepth++;
    const bool isRestored = object->restoreAttributes(*tree);
    restoreDepth--;
    if (!isRestored)
        object = nullptr;
    return object;
}
