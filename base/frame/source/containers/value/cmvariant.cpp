#include "containers/value/cmvariant.h"

#include "foundation/object/fvariant.h"
#include "foundation/object/stringhash.h"
#include "foundation/object/textcopy.h"
#include "foundation/text/string.h"

#include <cmath>
#include <cstdlib>
#include <limits>

DEFINE_CLASS(CmVariant, CmObject)

namespace
{
int64 nearestInteger(double number)
{
    // The greatest integers have no exact double; 2^63 is the first beyond them.
    constexpr double kLimit = 9223372036854775808.0;
    if (std::isnan(number))
        return 0;
    if (number >= kLimit)
        return std::numeric_limits<int64>::max();
    if (number < -kLimit)
        return std::numeric_limits<int64>::min();
    return static_cast<int64>(number);
}

/// Its place among the kinds: nothing, numbers, texts, objects.
int rankOf(const FVariant& variant)
{
    switch (variant.getType())
    {
    case FVariant::kInteger:
    case FVariant::kFloat:
        return 1;
    case FVariant::kString8:
    case FVariant::kString16:
        return 2;
    case FVariant::kObject:
        return 3;
    default:
        return 0;
    }
}

template <class Number>
int compareNumbers(Number left, Number right)
{
    return left < right ? -1 : left > right;
}

int compareFloats(double left, double right)
{
    // What is no number sorts before all numbers, so that the order stays one.
    if (std::isnan(left) || std::isnan(right))
        return static_cast<int>(std::isnan(right)) - static_cast<int>(std::isnan(left));
    return compareNumbers(left, right);
}

int compareNumbers(const FVariant& left, const FVariant& right)
{
    const bool leftIsInteger = left.getType() == FVariant::kInteger;
    const bool rightIsInteger = right.getType() == FVariant::kInteger;
    if (leftIsInteger && rightIsInteger)
        return compareNumbers(left.getInt(), right.getInt());
    return compareFloats(leftIsInteger ? static_cast<double>(left.getInt()) : left.getFloat(),
                         rightIsInteger ? static_cast<double>(right.getInt()) : right.getFloat());
}

int compareObjects(FUnknown* left, FUnknown* right)
{
    const auto* leftObject = toCmObject(left);
    const auto* rightObject = toCmObject(right);
    if (leftObject && rightObject)
        return leftObject->compare(rightObject);
    return left < right ? -1 : left > right;
}
} // namespace

CmVariant::CmVariant(int number)
{
    setLong(number);
}

CmVariant::CmVariant(int64 number)
{
    setLong(number);
}

CmVariant::CmVariant(double number)
{
    setFloat(number);
}

CmVariant::CmVariant(const char16* text, bool copy)
{
    setString(text, copy);
}

CmVariant::CmVariant(const FVariant& other)
{
    assign(other);
}

CmVariant::CmVariant(const CmVariant& other) : CmObject(other), type(other.type), value(other.value)
{
    setOwner(false);
    emancipate();
}

CmVariant::~CmVariant()
{
    empty();
}

CmVariant& CmVariant::operator=(const CmVariant& other)
{
    if (this != &other)
        assign(other);
    return *this;
}

CmVariant& CmVariant::operator=(const FVariant& other)
{
    assign(other);
    return *this;
}

CmVariant& CmVariant::operator=(int number)
{
    setLong(number);
    return *this;
}

CmVariant& CmVariant::operator=(int64 number)
{
    setLong(number);
    return *this;
}

CmVariant& CmVariant::operator=(double number)
{
    setFloat(number);
    return *this;
}

int64 CmVariant::getLong() const
{
    if (isInteger())
        return value.number;
    if (isFloat())
        return nearestInteger(value.real);
    int64 number = 0;
    if (isString())
        ConstString(*this).scanInt64(number, 0, false);
    return number;
}

double CmVariant::getFloat() const
{
    if (isFloat())
        return value.real;
    if (isInteger())
        return static_cast<double>(value.number);
    double number = 0;
    if (isString())
        ConstString(*this).scanFloat(number, 0, false);
    return number;
}

bool CmVariant::getString(String& result) const
{
    return result.fromVariant(*this);
}

CmObject* CmVariant::getObject(const char* className) const
{
    CmObject* object = toCmObject(getUnknown());
    return object && object->isTypeOf(className, true) ? object : nullptr;
}

FUnknown* CmVariant::getUnknown() const
{
    return isObject() ? value.object : nullptr;
}

void CmVariant::setLong(int64 number)
{
    empty();
    type = kInteger;
    value.number = number;
}

void CmVariant::setFloat(double number)
{
    empty();
    type = kFloat;
    value.real = number;
}

void CmVariant::setString(const char16* text, bool copy)
{
    // The text may be the variant's own.
    CmVariant old;
    std::swap(type, old.type);
    std::swap(value, old.value);
    if (!text)
        return;
    type = kText16;
    value.text16 = text;
    if (copy)
        emancipate();
}

void CmVariant::setString8(const char* text, bool copy)
{
    CmVariant old;
    std::swap(type, old.type);
    std::swap(value, old.value);
    if (!text)
        return;
    type = kText8;
    value.text8 = text;
    if (copy)
        emancipate();
}

void CmVariant::setUnknown(FUnknown* object)
{
    empty();
    if (!object)
        return;
    type = kObject;
    value.object = object;
}

void CmVariant::assign(const FVariant& other)
{
    switch (other.getType())
    {
    case FVariant::kInteger:
        return setLong(other.getInt());
    case FVariant::kFloat:
        return setFloat(other.getFloat());
    case FVariant::kString8:
        return setString8(other.getString8(), true);
    case FVariant::kString16:
        return setString(other.getString16(), true);
    case FVariant::kObject:
        return assignObject(other.getObject());
    default:
        return empty();
    }
}

void CmVariant::assignObject(FUnknown* object)
{
    // The reference comes first: releasing the old object may release this one.
    if (object)
        object->addRef();
    setUnknown(object);
    setOwner(true);
}

void CmVariant::assignTo(FVariant& target) const
{
    target = static_cast<FVariant>(*this);
}

CmVariant::operator FVariant() const
{
    // Each result is made in its place: a copy would own.
    switch (type & kKindMask)
    {
    case kInteger:
        return FVariant(value.number);
    case kFloat:
        return FVariant(value.real);
    case kText8:
        return FVariant(value.text8);
    case kText16:
        return FVariant(value.text16);
    case kObject:
        return FVariant(value.object);
    default:
        return FVariant();
    }
}

void CmVariant::setOwner(bool owner)
{
    const bool canOwn = isString() || isObject();
    type = (type & kKindMask) | (owner && canOwn ? kOwner : 0u);
}

void CmVariant::empty()
{
    const uint32 oldType = type;
    const Value oldValue = value;
    type = 0;
    value.number = 0;
    if ((oldType & kOwner) == 0)
        return;
    if ((oldType & kText8) != 0)
        free(const_cast<char*>(oldValue.text8));
    else if ((oldType & kText16) != 0)
        free(const_cast<char16*>(oldValue.text16));
    else
        oldValue.object->release();
}

void CmVariant::emancipate()
{
    if (isOwner())
        return;
    if (isObject())
        value.object->addRef();
    else if ((type & kText8) != 0)
        value.text8 = copyOfText(value.text8);
    else if ((type & kText16) != 0)
        value.text16 = copyOfText(value.text16);
    setOwner(true);
}

int CmVariant::compareVariants(const FVariant& left, const FVariant& right)
{
    const int rank = rankOf(left);
    if (rank != rankOf(right))
        return rank - rankOf(right);
    switch (rank)
    {
    case 1:
        return compareNumbers(left, right);
    case 2:
        return ConstString(left).compare(ConstString(right));
    case 3:
        return compareObjects(left.getObject(), right.getObject());
    default:
        return 0;
    }
}

bool CmVariant::operator==(const CmVariant& other) const
{
    return compareVariants(*this, other) == 0;
}

bool CmVariant::isEqual(const CmObject* other) const
{
    const auto* variant = FCast(CmVariant, other);
    return variant ? *this == *variant : CmObject::isEqual(other);
}

int CmVariant::compare(const CmObject* other) const
{
    const auto* variant = FCast(CmVariant, other);
    return variant ? compareVariants(*this, *variant) : CmObject::compare(other);
}

unsigned CmVariant::hash(unsigned size) const
{
    if (isInteger() || isFloat())
        return static_cast<unsigned>(static_cast<uint64>(getLong()) % size);
    if (isString())
    {
        // Equal texts may differ in width.
        const String text{ConstString(*this)};
        return hashString16(text.text16(), size);
    }
    const CmObject* object = toCmObject(getUnknown());
    return object ? object->hash(size) : 0;
}
