#include "storage/attribute/fxmlreference.h"

#include "storage/attribute/fxmlinstance.h"

DEFINE_CLASS(FXmlReference, FXmlObject)

FXmlReference::FXmlReference(const FXmlReference& other) : FXmlObject(other)
{
    if (other.target)
        setTarget(other.target->getInstance(), true);
}

FXmlReference::~FXmlReference()
{
    drop();
}

FXmlInstance* FXmlReference::getInstance()
{
    return target ? target->getInstance() : nullptr;
}

void FXmlReference::setTarget(FXmlInstance* instance, bool counted)
{
    if (instance && counted)
        instance->addRef();
    drop();
    target = instance;
    isCounted = counted;
    if (!instance || counted)
        return;
    place = instance->uncounted.size();
    instance->uncounted.push_back(this);
}

void FXmlReference::drop()
{
    FXmlObject* former = target;
    target = nullptr;
    if (!former)
        return;
    if (isCounted)
    {
        former->release();
        return;
    }
    // The last one takes this one's place: a parent may have very many children that refer to it.
    auto& uncounted = former->getInstance()->uncounted;
    uncounted[place] = uncounted.back();
    uncounted[place]->place = place;
    uncounted.pop_back();
}
