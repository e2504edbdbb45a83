#include "storage/attribute/fxmlreference.h"

#include "storage/attribute/fxmlinstance.h"

#include <algorithm>

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
    if (instance && !counted)
        instance->uncounted.push_back(this);
}

void FXmlReference::drop()
{
    FXmlObject* former = target;
    target = nullptr;
    if (!former)
        return;
    auto& uncounted = former->getInstance()->uncounted;
    if (isCounted)
        former->release();
    else
        uncounted.erase(std::find(uncounted.begin(), uncounted.end(), this));
}
