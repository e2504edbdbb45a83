#pragma once

#include "foundation/object/funknown.h"

/// The descriptor of a class: its names, its maker and its place in the chain of base classes.
///
/// One static instance a class, built before `main` and never copied; the constructors enter it in the
/// `ClassFactory`. Immutable after static start-up.
class MetaClass
{
public:
    using CreateFunction = FUnknown* (*)();

    /// `uid` is null or 16 raw bytes. A descriptor with neither `create` nor `base` is built but cannot be found.
    MetaClass(const char* name, CreateFunction create, const char* uid, MetaClass* base, int16 version);
    /// A second name for `target`, under which older files hold its objects; new ones are stored under it too.
    MetaClass(MetaClass* target, const char* alias);
    MetaClass(const MetaClass&) = delete;
    MetaClass& operator=(const MetaClass&) = delete;

    /// Whether this class or one of its bases has the name; false for null.
    bool isTypeOf(const char* name) const;

    const char* className;
    const char* persistentName;
    FUID classID;
    CreateFunction createFunction;
    MetaClass* baseClass;
    int16 classVersion;

private:
    void enter();
};
