#include "storage/attribute/fattributevalue.h"

#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/text/cmstring.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fattrlist.h"
#include "storage/stream/fstream.h"

#include <limits>
#include <utility>

DEFINE_CLASS(FAttributeValue, CmObject)

namespace
{
constexpr unsigned kHeld = FAttributeValue::kBorrowed | FAttributeValue::kOwned;
constexpr unsigned kBorrowedText8 = FAttributeValue::kString | FAttributeValue::kBorrowed;
constexpr unsigned kBorrowedText16 = kBorrowedText8 | FAttributeValue::kWide | FAttributeValue::kBorrowedWide;

/// What belongs to one tree alone, and so is copied with it.
bool isPartOfTree(const CmObject* object)
{
    return FCast(FAttributes, object) || FCast(FAttrList, object);
}

long long toInteger(double number)
{
    // Beyond these the conversion is undefined.
    constexpr double limit = 9223372036854775808.0;
    if (number >= limit)
        return std::numeric_limits<long long>::max();
    if (number < -limit)
        return std::numeric_limits<long long>::min();
    return number == number ? static_cast<long long>(number) : 0;
}
} // namespace

FAttributeValue::FAttributeValue(const FAttributeValue& other) : CmObject(other)
{
    assign(other);
}

FAttributeValue& FAttributeValue::operator=(const FAttributeValue& other)
{
    if (this != &other)
        assign(other);
    return *this;
}

FAttributeValue::~FAttributeValue()
{
    empty();
}

void FAttributeValue::assign(const FAttributeValue& other)
{
    empty();
    value = other.value;
    type = other.type;
    if (const CmString* text =
            other.type & kString && !(other.type & kBorrowed) ? other.value.string : nullptr)
        value.string = new CmString(*text);
    else if (type & kObject && isPartOfTree(value.object))
    {
        value.object = value.object->newCopy();
        setType((type & ~kHeld) | kOwned);
    }
    else if (type & kHeld && type & kObject)
        value.object->addRef();
    else if (type & kHeld && type & kUnknown)
        value.unknown->addRef();
}

void FAttributeValue::empty()
{
    // Emptied first: what is released may come back here.
    const auto former = value;
    const unsigned formerType = type;
    value.integer = 0;
    type = 0;
    if (formerType & kString)
    {
        if (!(formerType & kBorrowed))
            former.string->release();
    }
    else if (formerType & kHeld && formerType & kObject)
        former.object->release();
    else if (formerType & kHeld && formerType & kUnknown)
        former.unknown->release();
}

void FAttributeValue::setLong(long long integer)
{
    empty();
    value.integer = integer;
    setType(kInteger);
}

void FAttributeValue::setFloat(double number)
{
    empty();
    value.number = number;
    setType(kFloat);
}

void FAttributeValue::setPointer(void* pointer)
{
    empty();
    value.pointer = pointer;
}

void FAttributeValue::setObj(CmObject* object, unsigned flags)
{
    if (type & kObject && value.object == object)
        return;
    // Counted before the former one goes, which may hold this one.
    if (object && flags & kBorrowed)
        object->addRef();
    empty();
    if (!object)
        return;
    value.object = object;
    setType(kObject | (flags & (kHeld | kUnknown | kUnshared)));
}

void FAttributeValue::setUnknown(FUnknown* unknown, unsigned flags)
{
    if (type & kUnknown && !(type & kObject) && value.unknown == unknown)
        return;
    if (unknown && flags & kBorrowed)
        unknown->addRef();
    empty();
    if (!unknown)
        return;
    value.unknown = unknown;
    setType(kUnknown | (flags & (kHeld | kUnshared)));
}

void FAttributeValue::setString(const char16* text, bool borrow)
{
    if (!borrow)
        return setString16(text);
    empty();
    value.text16 = text ? text : u"";
    setType(kBorrowedText16);
}

void FAttributeValue::setString(const char* text, bool borrow)
{
    if (!borrow)
        return setString8(text);
    empty();
    value.text8 = text ? text : "";
    setType(kBorrowedText8);
}

void FAttributeValue::setString16(const char16* text)
{
    if (type & kString && !(type & kBorrowed))
        value.string->assign(text ? text : u"");
    else
    {
        auto* copy = new CmString(text ? text : u"");
        empty();
        value.string = copy;
    }
    setType(kString | kWide);
}

void FAttributeValue::setString8(const char* text)
{
    if (type & kString && !(type & kBorrowed))
        value.string->assign(text ? text : "");
    else
    {
        auto* copy = new CmString(text ? text : "");
        empty();
        value.string = copy;
    }
    setType(kString);
}

void FAttributeValue::setTString(const ConstString& text, bool borrow)
{
    if (text.isWideString())
        setString(static_cast<const char16*>(text.text()), borrow);
    else
        setString(static_cast<const char*>(text.text()), borrow);
}

void FAttributeValue::takeString(String& text)
{
    auto* taken = new CmString;
    static_cast<String&>(*taken).take(text);
    empty();
    value.string = taken;
    setType(taken->isWideString() ? kString | kWide : unsigned{kString});
}

long long FAttributeValue::getLong() const
{
    if (type & kInteger)
        return value.integer;
    return type & kFloat ? toInteger(value.number) : 0;
}

double FAttributeValue::getFloat() const
{
    if (type & kFloat)
        return value.number;
    return type & kInteger ? static_cast<double>(value.integer) : 0;
}

bool FAttributeValue::isString() const
{
    return type & kString || ownString();
}

/// The text as an object: our own, or the object that the value holds.
CmString* FAttributeValue::ownString() const
{
    if (type & kString)
        return type & kBorrowed ? nullptr : value.string;
    return type & kObject ? FCast(CmString, value.object) : nullptr;
}

const char16* FAttributeValue::getString16()
{
    if ((type & kBorrowedText16) == kBorrowedText16)
        return value.text16;
    if ((type & kBorrowedText16) == kBorrowedText8)
        setString8(value.text8);
    const CmString* text = ownString();
    return text ? text->text16() : nullptr;
}

const char* FAttributeValue::getString8()
{
    if ((type & kBorrowedText16) == kBorrowedText8)
        return value.text8;
    if ((type & kBorrowedText16) == kBorrowedText16)
        setString16(value.text16);
    const CmString* text = ownString();
    return text ? text->text8() : nullptr;
}

bool FAttributeValue::getString(String& text) const
{
    if ((type & kBorrowedText16) == kBorrowedText16)
        text.assign(value.text16);
    else if ((type & kBorrowedText16) == kBorrowedText8)
        text.assign(value.text8);
    else if (const CmString* own = ownString())
        text.assign(static_cast<const ConstString&>(*own));
    else
        return false;
    return true;
}

void* FAttributeValue::getPointer() const
{
    return isNumber() ? nullptr : value.pointer;
}

FUnknown* FAttributeValue::getUnknown() const
{
    if (!(type & kObject))
        return type & kUnknown ? value.unknown : nullptr;
    if (const auto* wrapper = FCast(CmDelegatingUnknown, value.object))
        return wrapper->getDelegate();
    return value.object;
}

CmObject* FAttributeValue::detachObj()
{
    if (!(type & kObject))
        return nullptr;
    CmObject* object = value.object;
    if (!(type & kHeld))
        object->addRef();
    value.integer = 0;
    type = 0;
    return object;
}

void FAttributeValue::makeStringOwner()
{
    if ((type & kBorrowedText16) == kBorrowedText16)
        setString16(value.text16);
    else if ((type & kBorrowedText16) == kBorrowedText8)
        setString8(value.text8);
}

bool FAttributeValue::externalize(FArchive& archive) const
{
    FStream& stream = archive.getStream();
    const bool shared = !(type & kUnshared);
    const bool isLasting =
        type & (kInteger | kFloat | kObject | kUnknown) || (type & kString && !(type & kBorrowed));
    if (!isLasting || !stream.writeInt16u(type))
        return false;
    if (type & kObject)
        return archive.writeObject(value.object, shared);
    if (type & kUnknown)
        return CmDelegatingUnknown(value.unknown, nullptr).externalize(archive);
    if (type & kString)
        return archive.writeObject(value.string, shared);
    if (type & kInteger)
        return stream.writeInt64(value.integer);
    return stream.writeDouble(value.number);
}

bool FAttributeValue::internalize(FArchive& archive)
{
    empty();
    uint16 storedType = 0;
    if (!archive.getStream().readInt16u(storedType))
        return false;
    if (storedType & kObject)
        return internalizeObject(archive, storedType);
    if (storedType & kUnknown)
        return internalizeUnknown(archive);
    if (storedType & kString)
        return internalizeString(archive, storedType);
    if (storedType & (kInteger | kFloat))
        return internalizeNumber(archive, storedType);
    archive.setError(FArchive::kBadValueKind);
    return false;
}

bool FAttributeValue::internalizeObject(FArchive& archive, unsigned storedType)
{
    CmObject* object = archive.readObject("CmObject", !(storedType & kUnshared));
    setObj(object, kOwned | (storedType & (kUnknown | kUnshared)));
    return object != nullptr;
}

bool FAttributeValue::internalizeUnknown(FArchive& archive)
{
    CmDelegatingUnknown wrapper;
    if (!wrapper.internalize(archive))
        return false;
    setUnknown(wrapper.getDelegate(), kBorrowed);
    return true;
}

bool FAttributeValue::internalizeString(FArchive& archive, unsigned storedType)
{
    auto text = IPtr<CmObject>::adopt(archive.readObject("CmString", !(storedType & kUnshared)));
    const auto* read = FCast(CmString, text.get());
    if (!read)
        return false;
    // A copy: a file may refer to one text from several values, which would change together.
    value.string = new CmString(*read);
    setType(read->isWideString() ? kString | kWide : unsigned{kString});
    return true;
}

bool FAttributeValue::internalizeNumber(FArchive& archive, unsigned storedType)
{
    if (storedType & kInteger)
    {
        int64 integer = 0;
        const bool isRead = archive.getStream().readInt64(integer);
        setLong(integer);
        return isRead;
    }
    double number = 0;
    const bool isRead = archive.getStream().readDouble(number);
    setFloat(number);
    return isRead;
}
