#pragma once

#include "foundation/object/blockpool.h"
#include "foundation/object/classmacros.h"
#include "foundation/object/idependent.h"

class IUpdateHandler;

/// Base of everything that is counted: one word of data, the type test, and changes that others depend on.
///
/// Objects come from the pool of small blocks, since trees and messages make and drop them by the thousands.
/// A new object has the count 1, which belongs to its maker. An object on the stack or a member by value keeps
/// that count and is never released. `addRef` and `release` are thread-safe; all else belongs to one thread at a
/// time.
class FObject : public IDependent
{
    friend FClassTag<FObject> fNearestDeclaredClass(const FObject*, FDeclaredAs<FObject>);

public:
    FPOOLED_OBJECTS

    FObject() = default;
    /// A copy is an object of its own: it starts at the count 1.
    FObject(const FObject&) : IDependent() {}
    FObject& operator=(const FObject&) { return *this; }

    int32 queryInterface(const char* interfaceID, void** object) override;
    uint32 addRef() override;
    /// At zero the count becomes -1000, so that a release by the destructor doesn't delete twice, and the object goes.
    uint32 release() override;
    void update(FUnknown* changedUnknown, int message) override;

    virtual ~FObject() = default;
    virtual const char* isA() const { return "FObject"; }
    /// Whether the object is of exactly this class.
    virtual bool isA(const char* name) const { return FObject::isTypeOf(name, false); }
    /// Whether the object is of this class or, with `askBaseClass`, of one derived from it. False for null.
    virtual bool isTypeOf(const char* name, bool askBaseClass) const;
    /// Tells all dependents now; `updateDone` follows.
    virtual void changed(int message);
    /// Tells all dependents at the next idle pulse; equal changes of one object are told once.
    virtual void deferUpdate(int message);
    virtual void updateDone(int message);

    void addDependent(IDependent* dependent);
    void removeDependent(IDependent* dependent);

    uint32 getRefCount() const;

    /// Asks an FUnknown whether it is an FObject. Made anew in each run: never store it.
    static const FUID iid;
    /// Null until an UpdateHandler exists.
    static IUpdateHandler* gUpdateHandler;

private:
    mutable volatile int refCount = 1;
};

/// The FObject behind `unknown`, borrowed; null where there is none.
FObject* toFObject(FUnknown* unknown);
