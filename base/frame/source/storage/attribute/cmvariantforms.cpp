#include "containers/value/cmvariant.h"
#include "foundation/text/string.h"
#include "storage/attribute/fattributes.h"

static constexpr const char* kTypeKey = "type";
static constexpr const char* kObjectKey = "obj";
static constexpr const char* kFloatKey = "fValue";
static constexpr const char* kTextKey = "str";
static constexpr const char* kIntegerKey = "lValue";

bool CmVariant::storeAttributes(FAttributes& attributes) const
{
    const uint32 kind = type & kKindMask;
    CmObject* const object = toCmObject(getUnknown());
    if (kind == kObject && !object)
        return false;

    attributes.set(kTypeKey, kind);
    switch (kind)
    {
    case kObject:
        return attributes.setObject(kObjectKey, object);
    case kFloat:
        return attributes.set(kFloatKey, value.real);
    case kText8:
        return attributes.setString8(kTextKey, value.text8);
    case kText16:
        return attributes.setString16(kTextKey, value.text16);
    case kInteger:
        return attributes.set(kIntegerKey, value.number);
    default:
        return true;
    }
}

bool CmVariant::restoreAttributes(FAttributes& attributes)
{
    uint32 kind = 0;
    if (!attributes.get(kTypeKey, kind))
        return false;
    empty();
    switch (kind)
    {
    case 0:
        return true;
    case kObject:
        assignObject(attributes.getObject(kObjectKey, nullptr));
        return isObject();
    case kText8:
    case kText16:
        return restoreText(attributes, kind == kText16);
    case kFloat:
        setFloat(0);
        return attributes.get(kFloatKey, value.real);
    case kInteger:
        setLong(0);
        return attributes.get(kIntegerKey, value.number);
    default:
        return false;
    }
}

bool CmVariant::restoreText(FAttributes& attributes, bool isWide)
{
    String text;
    if (!attributes.get(kTextKey, text))
        return false;
    if (isWide)
        setString(text.text16(), true);
    else
        setString8(text.text8(), true);
    return true;
}
