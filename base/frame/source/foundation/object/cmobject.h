#pragma once

#include "foundation/object/fobject.h"

class FArchive;
class FAttributes;
class FMessage;

/// Root of the framework's classes: comparison, storage, messages, and a descriptor.
///
/// The containers treat their elements through `isEqual`, `compare` and `hash`; a class that overrides one of
/// `isEqual` and `hash` overrides the other. One thread at a time.
class CmObject : public FObject
{
    DECLARE_TYPE(CmObject, FObject)

    CmObject() = default;
    CmObject(const CmObject&) = default;
    CmObject& operator=(const CmObject&) = default;

    /// Hands on to the other `update` if `changedUnknown` is a CmObject.
    void update(FUnknown* changedUnknown, int message) override;

    virtual bool isEqual(const CmObject* other) const;
    /// Negative, 0 or positive, as `this` sorts before, with or after `other`.
    virtual int compare(const CmObject* other) const;
    /// A number below `size`; equal objects give equal numbers.
    virtual unsigned hash(unsigned size) const;
    virtual void update(CmObject* changedObject, int message);
    virtual bool internalize(FArchive& archive);
    virtual bool externalize(FArchive& archive) const;
    /// False where the class has nothing to store.
    virtual bool storeAttributes(FAttributes& attributes) const;
    virtual bool restoreAttributes(FAttributes& attributes);
    /// Takes a message; the result, where it isn't 0, says that it was handled.
    virtual int notify(FMessage* message);
    virtual MetaClass* getClass() const { return &__fClass; }
    /// A copy with the count 1 for the caller.
    virtual CmObject* newCopy() const { return new CmObject(*this); }

    static MetaClass __fClass;
    static FUnknown* __fCreate();
};

/// The CmObject behind `unknown`, borrowed; null where there is none.
CmObject* toCmObject(FUnknown* unknown);

/// `object` as a `Class`, by the type test; null where it is none. `Class` must be declared to the object model.
template <class Class>
Class* castObject(FObject* object, const char* className)
{
    return object && object->isTypeOf(className, true) ? static_cast<Class*>(object) : nullptr;
}
template <class Class>
const Class* castObject(const FObject* object, const char* className)
{
    return object && object->isTypeOf(className, true) ? static_cast<const Class*>(object) : nullptr;
}

/// `FCast(CmString, object)`: `object` as a CmString or null.
#define FCast(Class, object) castObject<Class>(object, #Class)
