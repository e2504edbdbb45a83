#include "foundation/object/metaclass.h"

#include "foundation/object/classfactory.h"

#include <cstring>

MetaClass::MetaClass(const char* name, CreateFunction create, const char* uid, MetaClass* base, int16 version)
    : className(name),
      persistentName(name),
      classID(uid),
      createFunction(create),
      baseClass(base),
      classVersion(version)
{
    enter();
}

MetaClass::MetaClass(MetaClass* target, const char* alias)
    : className(alias),
      persistentName(alias),
      createFunction(target->createFunction),
      baseClass(nullptr),
      classVersion(0)
{
    target->persistentName = alias;
    enter();
}

bool MetaClass::isTypeOf(const char* name) const
{
    if (!name)
        return false;
    for (const MetaClass* meta = this; meta; meta = meta->baseClass)
        if (meta->className && strcmp(meta->className, name) == 0)
            return true;
    return false;
}

void MetaClass::enter()
{
    if (!createFunction && !baseClass)
        return;
    if (ClassFactory* factory = ClassFactory::instance(true))
        factory->registerMetaClass(this);
}
