#pragma once

#include "foundation/object/cmobject.h"

/// As FCast, where nearly all objects are of the very class: these cost one comparison of descriptors, and no names.
/// `Class` must have a descriptor.
template <class Class>
const Class* castLikely(const CmObject* object, const char* className)
{
    if (object && object->getClass() == &Class::__fClass)
        return static_cast<const Class*>(object);
    return castObject<Class>(object, className);
}

/// `FCastLikely(CmString, object)`
#define FCastLikely(Class, object) castLikely<Class>(object, #Class)
