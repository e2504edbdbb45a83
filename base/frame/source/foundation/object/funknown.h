#pragma once

#include "foundation/object/fuid.h"
#include "foundation/object/types.h"

/// Declares the identifier of an interface inside its class; `DEFINE_INTERFACE_ID` gives it its value.
#define DECLARE_INTERFACE_ID static const FUID iid;

/// Defines the constant `<Interface>_iid` and, from it, `<Interface>::iid`. Both are constants of the program
/// image, so an identifier can be used by any static initialiser.
#define DEFINE_INTERFACE_ID(Interface, word1, word2, word3, word4)                                           \
    extern constexpr FUIDBytes Interface##_iid = fuidBytes(word1, word2, word3, word4);                      \
    constinit const FUID Interface::iid(Interface##_iid);

/// Lets a class that is reached through several interfaces count its references in one place, its `Base`.
#define FORWARD_FUNKNOWN(Base)                                                                               \
public:                                                                                                      \
    uint32 addRef() override                                                                                 \
    {                                                                                                        \
        return Base::addRef();                                                                               \
    }                                                                                                        \
    uint32 release() override                                                                                \
    {                                                                                                        \
        return Base::release();                                                                              \
    }

/// Root of all interfaces: identity by identifier, and a count of references.
///
/// Whoever gets a pointer from a maker or from `queryInterface` holds one reference and gives it back by `release`.
class FUnknown
{
public:
    /// Gives the object's view of the interface with these 16 bytes, with one reference for the caller.
    /// -1 and a null `object` where it isn't offered.
    virtual int32 queryInterface(const char* interfaceID, void** object) = 0;
    /// Gives the count after the increment.
    virtual uint32 addRef() = 0;
    /// Gives the count after the decrement; 0 when the object is gone.
    virtual uint32 release() = 0;

    /// Adds with a full barrier; gives the new value.
    static int atomicAdd(int& value, int delta);

    DECLARE_INTERFACE_ID
};

/// Whether the 16 bytes at `interfaceID` are those of `wanted`.
bool isSameInterface(const char* interfaceID, const FUID& wanted);

/// The answer of a `queryInterface` that offers an interface: stores the view and counts the reference.
template <class Interface>
int32 offerInterface(Interface* view, void** object)
{
    view->addRef();
    *object = view;
    return kResultOk;
}

/// Asks `unknown` for an interface; null when it isn't offered. The caller gets the reference.
template <class Interface>
Interface* askInterface(FUnknown* unknown)
{
    void* view = nullptr;
    if (!unknown || unknown->queryInterface(Interface::iid, &view) != kResultOk)
        return nullptr;
    return static_cast<Interface*>(view);
}
