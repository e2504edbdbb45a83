#include "foundation/object/fobject.h"

#include "foundation/object/fatomic.h"
#include "foundation/object/iupdatehandler.h"

namespace
{
constexpr int kDying = -1000;

FUID makeRunIdentifier()
{
    FUID result;
    if (!result.generate())
        result.from4Int(0x3A7C51E0, 0x5B0E4F4D, 0x9D6FA2C1, 0x7E10B84C);
    return result;
}
} // namespace

const FUID FObject::iid = makeRunIdentifier();
IUpdateHandler* FObject::gUpdateHandler = nullptr;

int32 FObject::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, FUnknown::iid))
        return offerInterface<FUnknown>(this, object);
    if (isSameInterface(interfaceID, IDependent::iid))
        return offerInterface<IDependent>(this, object);
    if (isSameInterface(interfaceID, FObject::iid))
        return offerInterface<FObject>(this, object);
    *object = nullptr;
    return kNoInterface;
}

uint32 FObject::addRef()
{
    return static_cast<uint32>(FAtomicIncrement(refCount) + 1);
}

uint32 FObject::release()
{
    // A single reference is the caller's, so that no other thread can add or release one: nothing is left to count.
    // Otherwise the member must not be read after the decrement: another thread may have deleted the object by then.
    const int before = FAtomicRead(refCount) == 1 ? 1 : FAtomicDecrement(refCount);
    if (before != 1)
        return static_cast<uint32>(before - 1);
    refCount = kDying;
    delete this;
    return 0;
}

uint32 FObject::getRefCount() const
{
    return static_cast<uint32>(FAtomicRead(refCount));
}

void FObject::update(FUnknown*, int) {}

bool FObject::isTypeOf(const char* name, bool) const
{
    return name && strcmp(name, "FObject") == 0;
}

void FObject::changed(int message)
{
    if (gUpdateHandler)
        gUpdateHandler->triggerUpdates(this, message);
    else
        updateDone(message);
}

void FObject::deferUpdate(int message)
{
    if (gUpdateHandler)
        gUpdateHandler->deferUpdates(this, message);
    else
        updateDone(message);
}

void FObject::updateDone(int) {}

void FObject::addDependent(IDependent* dependent)
{
    if (gUpdateHandler)
        gUpdateHandler->addDependent(this, dependent);
}

void FObject::removeDependent(IDependent* dependent)
{
    if (gUpdateHandler)
        gUpdateHandler->removeDependent(this, dependent);
}

FObject* toFObject(FUnknown* unknown)
{
    FObject* object = askInterface<FObject>(unknown);
    if (object)
        object->release();
    return object;
}
