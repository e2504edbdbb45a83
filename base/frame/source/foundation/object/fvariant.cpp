#include "foundation/object/fvariant.h"

#include "foundation/object/textcopy.h"

#include <cstdlib>
#include <utility>

FVariant& FVariant::operator=(const FVariant& other)
{
    if (this == &other)
        return *this;
    // The old value goes last: the new one may live in it.
    FVariant old;
    std::swap(old.type, type);
    std::swap(old.value, value);
    assign(other);
    return *this;
}

void FVariant::setOwner(bool isOwned)
{
    const bool canBeOwned = (type & (kString8 | kString16 | kObject)) != 0;
    type = getType() | (isOwned && canBeOwned ? kOwner : kEmpty);
}

void FVariant::empty()
{
    if (type == (kString8 | kOwner))
        free(const_cast<char*>(value.text8));
    else if (type == (kString16 | kOwner))
        free(const_cast<char16*>(value.text16));
    else if (type == (kObject | kOwner) && value.object)
        value.object->release();
    type = kEmpty;
    value.integer = 0;
}

void FVariant::setInt(int64 integer)
{
    empty();
    type = kInteger;
    value.integer = integer;
}

void FVariant::setFloat(double number)
{
    empty();
    type = kFloat;
    value.number = number;
}

void FVariant::setString8(const char* text)
{
    empty();
    type = kString8;
    value.text8 = text;
}

void FVariant::setString16(const char16* text)
{
    empty();
    type = kString16;
    value.text16 = text;
}

void FVariant::setObject(FUnknown* object)
{
    empty();
    type = kObject;
    value.object = object;
}

void FVariant::assign(const FVariant& other)
{
    type = other.getType();
    value = other.value;
    if (type == kString8)
        value.text8 = copyOfText(other.value.text8);
    else if (type == kString16)
        value.text16 = copyOfText(other.value.text16);
    else if (type == kObject && value.object)
        value.object->addRef();
    setOwner(true);
}
