#pragma once

#include "containers/typed/tarray.h"
#include "foundation/object/fobject.h"
#include "foundation/object/istring.h"

#include <memory>

namespace MetaClasses
{
struct Tables;
}

/// Makes objects by class name or identifier.
///
/// Descriptors enter themselves during static start-up; afterwards the tables are only read, by any thread, without
/// a lock. The descriptors are not owned.
class ClassFactory : public FObject
{
    DECLARE_TYPE(ClassFactory, FObject)

    ~ClassFactory() override;

    /// The one factory. Null when there is none and none may be made: without `create`, or after the process-wide
    /// objects were torn down.
    static ClassFactory* instance(bool create);

    void registerMetaClass(MetaClass* meta);
    void unregisterMetaClass(MetaClass* meta);
    MetaClass* getMetaClassByName(const char* name) const;
    /// `uid` points at 16 raw bytes.
    MetaClass* getMetaClassByID(const char* uid) const;

    /// A new object for the caller. `text` is a class name or the 32 digits of an identifier; null where it is
    /// unknown or its class can't be made.
    FUnknown* createObjectByName(const char* text) const;
    FUnknown* createObjectByID(const char* uid) const;

    /// The name under which `object` is stored: its persistent class name, or the identifier of an object that only
    /// offers IPersistent. False where it has none, or with `mustBeRegistered` none that the factory knows.
    bool getStorageID(FUnknown* object, IString& result, bool mustBeRegistered) const;

    /// Adds every descriptor, those with a name first; borrowed.
    void listClasses(TArray<const MetaClass*>& result) const;

private:
    ClassFactory();

    std::unique_ptr<MetaClasses::Tables> tables;
};
