#pragma once

#include "foundation/object/metaclass.h"

#include <cstring>
#include <type_traits>

// The declarations by which a class joins the object model. Each degree adds to the one before:
//
//   DECLARE_TYPE             type test: isA, isTypeOf
//   DECLARE_COPYABLE         and newCopy, by the copy constructor
//   DECLARE_DESCRIBED_CLASS  and a descriptor, so that the class is found by name        (DEFINE_DESCRIBED_CLASS)
//   DECLARE_CLASS            and a maker, by the default constructor                      (DEFINE_CLASS)
//   DECLARE_ABSTRACT_CLASS   type test and descriptor, but neither copy nor maker         (DEFINE_ABSTRACT_CLASS)
//
// A declaration stands first in its class and leaves the access at `public`. Its definition stands in the class's
// source. `Base` is the direct base through which the class descends from FObject; naming another one, in either
// place, or copying the line from another class does not compile. Classes that are stored in a changed form since
// their first version are defined by DEFINE_CLASS_VERSION.

/// What the check of a declared base hands around; never made.
template <class T>
struct FClassTag
{
};
template <class T>
struct FDeclaredAs
{
};
template <class Self>
struct FAllBut
{
    template <class T>
    requires(!std::is_same_v<T, Self>) operator FDeclaredAs<T>() const;
};
FClassTag<void> fNearestDeclaredClass(const void*, FDeclaredAs<void>);

// Overload resolution finds the nearest declared ancestor: the class's own overload is left out by FAllBut, and of
// the others the most derived one wins.
#define FCHECK_BASE_(Class, Base)                                                                            \
    [[maybe_unused]] friend FClassTag<Class> fNearestDeclaredClass(const Class*, FDeclaredAs<Class>)         \
    {                                                                                                        \
        return {};                                                                                           \
    }                                                                                                        \
    void __fCheckDeclaration() const                                                                         \
    {                                                                                                        \
        static_assert(std::is_same_v<std::remove_cvref_t<decltype(*this)>, Class>,                           \
                      "declared for another class");                                                         \
        static_assert(std::is_same_v<decltype(fNearestDeclaredClass(static_cast<const Class*>(nullptr),      \
                                                                    FAllBut<Class>{})),                      \
                                     FClassTag<Base>>,                                                       \
                      #Base " is not the direct base of " #Class);                                           \
    }

#define DECLARE_TYPE(Class, Base)                                                                            \
private:                                                                                                     \
    FCHECK_BASE_(Class, Base)                                                                                \
public:                                                                                                      \
    using FDeclaredBase = Base;                                                                              \
    const char* isA() const override                                                                         \
    {                                                                                                        \
        return #Class;                                                                                       \
    }                                                                                                        \
    bool isA(const char* askedName) const override                                                           \
    {                                                                                                        \
        return Class::isTypeOf(askedName, false);                                                            \
    }                                                                                                        \
    bool isTypeOf(const char* askedName, bool askBaseClass) const override                                   \
    {                                                                                                        \
        if (askedName && strcmp(askedName, #Class) == 0)                                                     \
            return true;                                                                                     \
        return askBaseClass && Base::isTypeOf(askedName, true);                                              \
    }

#define DECLARE_COPYABLE(Class, Base)                                                                        \
    DECLARE_TYPE(Class, Base)                                                                                \
    CmObject* newCopy() const override                                                                       \
    {                                                                                                        \
        return new Class(*this);                                                                             \
    }

#define FDECLARE_DESCRIPTOR_                                                                                 \
    static MetaClass __fClass;                                                                               \
    MetaClass* getClass() const override                                                                     \
    {                                                                                                        \
        return &__fClass;                                                                                    \
    }

#define DECLARE_ABSTRACT_CLASS(Class, Base)                                                                  \
    DECLARE_TYPE(Class, Base)                                                                                \
    CmObject* newCopy() const override = 0;                                                                  \
    FDECLARE_DESCRIPTOR_

#define DECLARE_DESCRIBED_CLASS(Class, Base)                                                                 \
    DECLARE_COPYABLE(Class, Base)                                                                            \
    FDECLARE_DESCRIPTOR_

#define DECLARE_CLASS(Class, Base)                                                                           \
    DECLARE_DESCRIBED_CLASS(Class, Base)                                                                     \
    static FUnknown* __fCreate();

#define FCHECK_DEFINITION_(Class, Base)                                                                      \
    static_assert(std::is_same_v<Class::FDeclaredBase, Base>, #Base " is not the declared base of " #Class);

#define DEFINE_ABSTRACT_CLASS(Class, Base)                                                                   \
    FCHECK_DEFINITION_(Class, Base)                                                                          \
    MetaClass Class::__fClass(#Class, nullptr, nullptr, &Base::__fClass, 0);
#define DEFINE_DESCRIBED_CLASS(Class, Base) DEFINE_ABSTRACT_CLASS(Class, Base)

#define DEFINE_CLASS_VERSION(Class, Base, version)                                                           \
    FCHECK_DEFINITION_(Class, Base)                                                                          \
    MetaClass Class::__fClass(#Class, &Class::__fCreate, nullptr, &Base::__fClass, version);                 \
    FUnknown* Class::__fCreate()                                                                             \
    {                                                                                                        \
        return static_cast<CmObject*>(new Class);                                                            \
    }
#define DEFINE_CLASS(Class, Base) DEFINE_CLASS_VERSION(Class, Base, 0)

// Interfaces that callers get by their identifier alone, through ClassFactory::createObjectByID. The descriptor has no
// name. The definition stands in the source of the class that implements the interface.

/// Each request makes a new `Implementer`.
#define DEFINE_INTERFACE_CLASS(Interface, Implementer)                                                       \
    namespace Meta                                                                                           \
    {                                                                                                        \
    static FUnknown* make##Interface##Implementer()                                                          \
    {                                                                                                        \
        return static_cast<Interface*>(new Implementer);                                                     \
    }                                                                                                        \
    static MetaClass meta##Interface##Implementer(nullptr, &make##Interface##Implementer, Interface::iid,    \
                                                  nullptr, 0);                                               \
    }

/// Each request gives the one object that `global` points at, with a reference; null while there is none.
#define DEFINE_INTERFACE_HOST(Interface, global)                                                             \
    namespace Meta                                                                                           \
    {                                                                                                        \
    static FUnknown* createHost##Interface()                                                                 \
    {                                                                                                        \
        Interface* host = global;                                                                            \
        if (host)                                                                                            \
            host->addRef();                                                                                  \
        return host;                                                                                         \
    }                                                                                                        \
    static MetaClass meta##Interface##HostClass(nullptr, &createHost##Interface, Interface::iid, nullptr,    \
                                                0);                                                          \
    }
