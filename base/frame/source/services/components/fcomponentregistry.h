#pragma once

#include "containers/sequence/cmarray.h"
#include "services/components/fcomponentdescription.h"

/// The components that the program can make, found by category or identifier.
///
/// All are registered on the main thread, at start or while a module is loaded; a lookup is free to any thread as
/// long as nobody registers.
class FComponentRegistry : public CmObject
{
    DECLARE_TYPE(FComponentRegistry, CmObject)

    FComponentRegistry();
    FComponentRegistry(const FComponentRegistry&) = delete;
    FComponentRegistry& operator=(const FComponentRegistry&) = delete;

    /// Makes the registry of the process, with the components that the program brings along, unless it is there.
    static void bringUp();

    /// Takes over the caller's reference, also when it refuses: null, or an identifier that is invalid or taken.
    bool registerComponent(FComponentDescription* description);
    /// Forgets a component, as before its module goes. False where it isn't registered.
    bool unregisterComponent(const FUID& uid);

    int countComponents(const char* category) const;
    /// The component at `index` of its category, in order of registration. Borrowed; null out of range.
    const FComponentDescription* getComponent(const char* category, int index) const;
    const FComponentDescription* findComponent(const FUID& uid) const;

    /// A new object for the caller; null where the component is unknown or can't be made.
    FUnknown* createComponent(const char* category, int index) const;
    /// The same by identifier. Where `module` is given it tells the library that the object is from, or null.
    FUnknown* createUnknownComponent(const FUID& uid, FModule** module = nullptr) const;

    /// As `createUnknownComponent`, asked for an interface.
    template <class Interface>
    Interface* createInterface(const FUID& uid) const
    {
        FUnknown* unknown = createUnknownComponent(uid);
        Interface* view = askInterface<Interface>(unknown);
        if (unknown)
            unknown->release();
        return view;
    }

private:
    FComponentDescription* find(const FUID& uid) const;

    CmArray components{0, 10};
};

/// Made at the start of a program, and null before and after.
extern FComponentRegistry* gComponentRegistry;
