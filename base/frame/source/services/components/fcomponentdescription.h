#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/fuid.h"

class FModule;

/// One entry of the component registry: what a component is called, where it belongs and how it is made. Immutable.
class FComponentDescription : public CmObject
{
    DECLARE_COPYABLE(FComponentDescription, CmObject)

    using CreateFunction = FUnknown* (*)();

    /// The texts must outlive the description, as literals do. `maker` makes an object at reference count 1.
    /// `owner` is the loaded library that the component is from, borrowed; null for one of this program.
    FComponentDescription(const char* itsCategory, const FUID& classID, const char* itsName,
                          CreateFunction maker, FModule* owner = nullptr)
        : category(itsCategory),
          uid(classID),
          name(itsName),
          createFunction(maker),
          module(owner)
    {
    }

    const char* getCategory() const { return category; }
    const FUID& getClassID() const { return uid; }
    const char* getName() const { return name; }
    FModule* getModule() const { return module; }

    bool isOfCategory(const char* wanted) const;
    /// A new object for the caller; null where it can't be made.
    FUnknown* create() const { return createFunction ? createFunction() : nullptr; }

private:
    const char* category;
    FUID uid;
    const char* name;
    CreateFunction createFunction;
    FModule* module;
};
