#include "foundation/object/cmdelegatingunknown.h"

#include "foundation/object/fmodule.h"

DEFINE_CLASS(CmDelegatingUnknown, CmObject)

CmDelegatingUnknown::CmDelegatingUnknown(FUnknown* wrapped, FModule* owner) : delegate(wrapped)
{
    setModule(owner);
}

CmDelegatingUnknown::CmDelegatingUnknown(const CmDelegatingUnknown& other)
    : CmObject(other),
      delegate(other.delegate)
{
}

CmDelegatingUnknown::~CmDelegatingUnknown()
{
    // The delegate's code is in its module, so it goes first.
    delegate = nullptr;
    setModule(nullptr);
}

void CmDelegatingUnknown::setModule(FModule* owner)
{
    if (module)
        module->releaseInstance(this);
    module = owner;
    if (module)
        module->addInstance(this);
}

int32 CmDelegatingUnknown::queryInterface(const char* interfaceID, void** object)
{
    return delegate ? delegate->queryInterface(interfaceID, object)
                    : CmObject::queryInterface(interfaceID, object);
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
