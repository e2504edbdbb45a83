#include "foundation/object/cmdelegatingunknown.h"

#include "foundation/object/fmodule.h"

DEFINE_CLASS(CmDelegatingUnknown, CmObject)

CmDelegatingUnknown::CmDelegatingUnknown(FUnknown* wrapped, FModule* owner) : delegate(wrapped), module(owner)
{
    if (module)
        module->addInstance(this);
}

CmDelegatingUnknown::CmDelegatingUnknown(const CmDelegatingUnknown& other)
    : CmObject(other),
      delegate(other.delegate)
{
}

CmDelegatingUnknown::~CmDelegatingUnknown()
{
    // The delegate's code is in the module, so it goes first.
    delegate = nullptr;
    if (module)
        module->releaseInstance(this);
}

int32 CmDelegatingUnknown::queryInterface(const char* interfaceID, void** object)
{
    if (delegate)
        return delegate->queryInterface(interfaceID, object);
    *object = nullptr;
    return kNoInterface;
}

bool CmDelegatingUnknown::isEqual(const CmObject* other) const
{
    if (const CmDelegatingUnknown* wrapper = FCast(CmDelegatingUnknown, other))
        return module == wrapper->module;
    return CmObject::isEqual(other);
}

unsigned CmDelegatingUnknown::hash(unsigned size) const
{
    return static_cast<unsigned>((reinterpret_cast<uintptr_t>(module) >> 4) % size);
}
