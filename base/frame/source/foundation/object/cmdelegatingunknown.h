#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"

class FModule;

/// Lets an object that is known only as FUnknown stand in containers and archives of CmObjects.
///
/// The wrapper has no identity of its own: what it is asked for, the delegate answers, so it cannot be reached
/// again from what it returns. Only an empty one answers for itself, so that an archive can make and fill it. Its
/// count of references is its own. While it lives, its module stays loaded; a copy shares the delegate but doesn't
/// hold the module. Beware: two wrappers of one module are equal, whatever they wrap. One thread at a time.
class CmDelegatingUnknown : public CmObject
{
    DECLARE_CLASS(CmDelegatingUnknown, CmObject)

    CmDelegatingUnknown() = default;
    /// Adds a reference to `wrapped`. `owner` may be null and is borrowed.
    CmDelegatingUnknown(FUnknown* wrapped, FModule* owner);
    CmDelegatingUnknown(const CmDelegatingUnknown& other);
    CmDelegatingUnknown& operator=(const CmDelegatingUnknown&) = delete;
    ~CmDelegatingUnknown() override;

    /// Borrowed; null in an empty wrapper.
    FUnknown* getDelegate() const { return delegate; }

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    /// Drops what it holds; null holds none.
    void setModule(FModule* owner);
    /// Puts a new component in place of the delegate, and holds its module.
    void makeDelegate(const FUID& uid);

    IPtr<FUnknown> delegate;
    FModule* module = nullptr;
};
