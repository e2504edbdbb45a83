#include "services/defaults/fdefaults.h"

#include "foundation/object/stringhash.h"

#include <cstring>

DEFINE_CLASS(FDefaults, CmObject)

namespace
{
constexpr const char* kGroup = "Group";
constexpr const char* kVersion = "Version";
constexpr const char* kValues = "Values";
} // namespace

FDefaults::FDefaults(const char* groupName, int groupVersion)
    : group(groupName ? groupName : ""),
      version(groupVersion)
{
}

FDefaults::FDefaults(const FDefaults& other)
    : CmObject(other),
      group(other.group),
      values(other.values ? adopt(new FAttributes(*other.values)) : nullptr),
      version(other.version)
{
}

FAttributes& FDefaults::makeValues()
{
    if (!values)
        values = adopt(new FAttributes);
    return *values;
}

bool FDefaults::containsEntry(const char* key) const
{
    return values && values->containsAttribute(key);
}

bool FDefaults::removeEntry(const char* key)
{
    return values && values->removeAttribute(key);
}

bool FDefaults::isEmpty() const
{
    return !values || values->isEmpty();
}

void FDefaults::removeAll()
{
    values = nullptr;
}

// Numbers

bool FDefaults::getLong(const char* key, int32& value) const
{
    return values && values->get(key, value);
}

int32 FDefaults::getLong(const char* key) const
{
    int32 value = 0;
    getLong(key, value);
    return value;
}

void FDefaults::setLong(const char* key, int32 value)
{
    makeValues().set(key, value);
}

void FDefaults::initLong(const char* key, int32 value)
{
    if (!containsEntry(key))
        setLong(key, value);
}

bool FDefaults::getLongLong(const char* key, int64& value) const
{
    return values && values->get(key, value);
}

int64 FDefaults::getLongLong(const char* key) const
{
    int64 value = 0;
    getLongLong(key, value);
    return value;
}

void FDefaults::setLongLong(const char* key, int64 value)
{
    makeValues().set(key, value);
}

void FDefaults::initLongLong(const char* key, int64 value)
{
    if (!containsEntry(key))
        setLongLong(key, value);
}

bool FDefaults::getDouble(const char* key, double& value) const
{
    return values && values->get(key, value);
}

double FDefaults::getDouble(const char* key) const
{
    double value = 0;
    getDouble(key, value);
    return value;
}

void FDefaults::setDouble(const char* key, double value)
{
    makeValues().set(key, value);
}

void FDefaults::initDouble(const char* key, double value)
{
    if (!containsEntry(key))
        setDouble(key, value);
}

// Texts

bool FDefaults::getString(const char* key, String& text) const
{
    return values && values->get(key, text);
}

void FDefaults::setString(const char* key, const ConstString& text)
{
    makeValues().set(key, text);
}

void FDefaults::initString(const char* key, const ConstString& text)
{
    if (!containsEntry(key))
        setString(key, text);
}

const char* FDefaults::getString8(const char* key) const
{
    return values ? values->getString8(key) : nullptr;
}

void FDefaults::setString8(const char* key, const char* text)
{
    makeValues().setString8(key, text);
}

void FDefaults::initString8(const char* key, const char* text)
{
    if (!containsEntry(key))
        setString8(key, text);
}

const char16* FDefaults::getString16(const char* key) const
{
    return values ? values->getString16(key) : nullptr;
}

void FDefaults::setString16(const char* key, const char16* text)
{
    makeValues().setString16(key, text);
}

void FDefaults::initString16(const char* key, const char16* text)
{
    if (!containsEntry(key))
        setString16(key, text);
}

// Objects

CmObject* FDefaults::getObj(const char* key, const char* className) const
{
    return values ? values->getObject(key, className) : nullptr;
}

void FDefaults::setObj(const char* key, CmObject* object)
{
    makeValues().setObject(key, object);
}

// The group as an object

bool FDefaults::isEqual(const CmObject* other) const
{
    const auto* defaults = FCast(FDefaults, other);
    return defaults && strcmp(getGroup(), defaults->getGroup()) == 0;
}

int FDefaults::compare(const CmObject* other) const
{
    if (const auto* defaults = FCast(FDefaults, other))
        return strcmp(getGroup(), defaults->getGroup());
    return CmObject::compare(other);
}

unsigned FDefaults::hash(unsigned size) const
{
    return hashString8(getGroup(), size);
}

bool FDefaults::storeAttributes(FAttributes& attributes) const
{
    attributes.set(kGroup, getGroup());
    attributes.set(kVersion, version);
    auto copy = adopt(values ? new FAttributes(*values) : new FAttributes);
    return attributes.setAttributes(kValues, copy);
}

bool FDefaults::restoreAttributes(FAttributes& attributes)
{
    FString name;
    if (!attributes.get(kGroup, name))
        return false;
    group.assign(name.text8());
    version = 0;
    attributes.get(kVersion, version);
    values = attributes.getAttributes(kValues);
    return true;
}
