#include "foundation/object/fvariant.h"
#include "services/defaults/fdefaultpool.h"

// The pool's values by group and key. Groups reached this way have the version 0.

const FDefaults* FDefaultPool::findDefaults(const char* group) const
{
    // A group of another version is discarded, as by any other look at it.
    return const_cast<FDefaultPool*>(this)->getDefaults(group, 0, false);
}

bool FDefaultPool::setLong(const char* group, const char* key, int32 value)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setLong(key, value);
    return found != nullptr;
}

bool FDefaultPool::getLong(const char* group, const char* key, int32& value) const
{
    const FDefaults* found = findDefaults(group);
    return found && found->getLong(key, value);
}

bool FDefaultPool::setLongLong(const char* group, const char* key, int64 value)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setLongLong(key, value);
    return found != nullptr;
}

bool FDefaultPool::getLongLong(const char* group, const char* key, int64& value) const
{
    const FDefaults* found = findDefaults(group);
    return found && found->getLongLong(key, value);
}

bool FDefaultPool::setDouble(const char* group, const char* key, double value)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setDouble(key, value);
    return found != nullptr;
}

bool FDefaultPool::getDouble(const char* group, const char* key, double& value) const
{
    const FDefaults* found = findDefaults(group);
    return found && found->getDouble(key, value);
}

bool FDefaultPool::setString8(const char* group, const char* key, const char* text)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setString8(key, text);
    return found != nullptr;
}

const char* FDefaultPool::getString8(const char* group, const char* key) const
{
    const FDefaults* found = findDefaults(group);
    return found ? found->getString8(key) : nullptr;
}

bool FDefaultPool::setString16(const char* group, const char* key, const char16* text)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setString16(key, text);
    return found != nullptr;
}

const char16* FDefaultPool::getString16(const char* group, const char* key) const
{
    const FDefaults* found = findDefaults(group);
    return found ? found->getString16(key) : nullptr;
}

bool FDefaultPool::setTString(const char* group, const char* key, const ConstString& text)
{
    FDefaults* found = getDefaults(group, 0, true);
    if (found)
        found->setString(key, text);
    return found != nullptr;
}

bool FDefaultPool::getTString(const char* group, const char* key, String& text) const
{
    const FDefaults* found = findDefaults(group);
    return found && found->getString(key, text);
}

bool FDefaultPool::setObject(const char* group, const char* key, FUnknown* object)
{
    FDefaults* found = object ? getDefaults(group, 0, true) : nullptr;
    return found && found->makeValues().set(key, FVariant(object));
}

FUnknown* FDefaultPool::getObject(const char* group, const char* key) const
{
    const FDefaults* found = findDefaults(group);
    const FAttributes* values = found ? found->getValues() : nullptr;
    FVariant value;
    return values && values->get(key, value) ? value.getObject() : nullptr;
}

bool FDefaultPool::setObj(const char* group, const char* key, CmObject* object, int version)
{
    FDefaults* found = getDefaults(group, version, true);
    if (found)
        found->setObj(key, object);
    return found != nullptr;
}

CmObject* FDefaultPool::getObj(const char* group, const char* key, const char* className, int version)
{
    const FDefaults* found = getDefaults(group, version, false);
    return found ? found->getObj(key, className) : nullptr;
}
