#include "foundation/text/string.h"

#include "foundation/object/fvariant.h"
#include "foundation/object/iattributes.h"
#include "foundation/text/charwidth.h"
#include "foundation/text/itextservices.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <utility>

char16 widenCharacter(char character)
{
    if (ConstString::isCharAscii(character))
        return static_cast<char16>(character);
    String text(&character, 1, false);
    return text.getChar16(0);
}

String::String(const char* text, int count, bool isTerminated)
{
    isWide = 0;
    assign(text, count, isTerminated);
}

String::String(const char16* text, int count, bool isTerminated)
{
    isWide = 1;
    assign(text, count, isTerminated);
}

String::String(const ConstString& text, int count)
{
    isWide = text.isWideString();
    assign(text, count);
}

String::String(const String& text, int count) : ConstString()
{
    isWide = text.isWide;
    assign(text, count);
}

String::String(String&& other) noexcept
{
    isWide = other.isWide;
    take(other);
}

String::String(const FVariant& variant)
{
    isWide = 1;
    fromVariant(variant);
}

String::~String()
{
    std::free(buffer);
}

String& String::operator=(String&& other) noexcept
{
    if (this != &other)
        take(other);
    return *this;
}

// Reading, which settles the width

const char* String::text8() const
{
    if (isWide)
        const_cast<String*>(this)->toMultiByte();
    return ConstString::text8();
}

const char16* String::text16() const
{
    if (!isWide)
        const_cast<String*>(this)->toWideString();
    return ConstString::text16();
}

char String::getChar8(unsigned index) const
{
    if (isWide)
        const_cast<String*>(this)->toMultiByte();
    return ConstString::getChar8(index);
}

char16 String::getChar16(unsigned index) const
{
    if (!isWide)
        const_cast<String*>(this)->toWideString();
    return ConstString::getChar16(index);
}

// The buffer

bool String::resize(unsigned newLength, bool wide, bool fill)
{
    if (newLength > kMaxTextLength)
        return false;
    if (newLength == 0)
    {
        std::free(buffer);
        buffer = nullptr;
        len = 0;
        isWide = wide;
        return true;
    }

    const std::size_t oldSize = buffer ? (std::size_t{len} + 1) * charSize(isWide) : 0;
    const std::size_t newSize = (std::size_t{newLength} + 1) * charSize(wide);
    if (newSize != oldSize && !reallocate(newSize))
        return false;
    isWide = wide;
    if (oldSize == 0)
        terminate(0);
    else if (newSize < oldSize)
        terminate(newLength);
    if (fill && newLength > len)
    {
        fillWith(' ', len, newLength - len);
        terminate(newLength);
    }
    return true;
}

bool String::reallocate(std::size_t size)
{
    void* changed = std::realloc(buffer, size);
    if (changed)
        buffer = changed;
    return changed != nullptr;
}

void String::terminate(unsigned index)
{
    if (isWide)
        chars16()[index] = 0;
    else
        chars8()[index] = 0;
}

void String::fillWith(char character, unsigned index, unsigned count)
{
    if (isWide)
        std::fill_n(chars16() + index, count, static_cast<char16>(character));
    else
        std::fill_n(chars8() + index, count, character);
}

void String::shrink(unsigned newLength)
{
    // A buffer that can't be made smaller stays as large as it is.
    resize(newLength, isWide);
    len = newLength & kMaxTextLength;
    if (buffer)
        terminate(newLength);
}

void String::updateLength()
{
    len = (isWide ? measureText(chars16()) : measureText(chars8())) & kMaxTextLength;
}

void String::take(void* text, bool wide)
{
    if (text != buffer)
        std::free(buffer);
    buffer = text;
    isWide = wide;
    updateLength();
}

void String::take(void* text, bool wide, unsigned newLength)
{
    if (text != buffer)
        std::free(buffer);
    buffer = text;
    isWide = wide;
    len = newLength & kMaxTextLength;
}

void String::take(String& other)
{
    if (this == &other)
        return;
    std::free(buffer);
    isWide = other.isWide;
    len = other.len;
    buffer = other.pass();
}

void* String::pass()
{
    len = 0;
    return std::exchange(buffer, nullptr);
}

void String::swapContent(String& other)
{
    const unsigned otherLength = other.len;
    const bool otherWide = other.isWide;
    other.len = len;
    other.isWide = isWide;
    len = otherLength & kMaxTextLength;
    isWide = otherWide;
    std::swap(buffer, other.buffer);
}

// Width and form

bool String::toWideString(unsigned encoding)
{
    if (isWide)
        return true;
    if (isEmpty())
        return resize(0, true);
    // The text ends at the first zero, where there is one before its length.
    return takeWide(chars8(), measureText(chars8(), len), encoding);
}

bool String::takeWide(const char* text, unsigned length, unsigned encoding)
{
    if (length > kMaxTextLength)
        return false;
    unsigned newLength = 0;
    char16* wide = ITextServices::instance().toWide(text, length, encoding, u' ', newLength);
    if (wide)
        take(wide, true, newLength);
    return wide != nullptr;
}

bool String::toMultiByte(unsigned encoding)
{
    if (!isWide)
        return encoding == kEncodingDefault || recode(encoding);
    if (isEmpty())
        return resize(0, false);
    unsigned newLength = 0;
    char* narrow = ITextServices::instance().toMultiByte(chars16(), len, encoding, '?', newLength);
    if (narrow)
        take(narrow, false);
    return narrow != nullptr;
}

bool String::recode(unsigned encoding)
{
    // In a copy, so that a failure of the second step leaves the text as it was.
    String copy(*this);
    if (!copy.toWideString() || !copy.toMultiByte(encoding))
        return false;
    take(copy);
    return true;
}

bool String::fromUTF8(const char* text)
{
    const unsigned newLength = measureText(text);
    return newLength == 0 ? resize(0, true) : takeWide(text, newLength, kEncodingUtf8);
}

bool String::normalize(UnicodeNormalization form)
{
    if (!isWide)
        return false;
    if (!buffer)
        return true;
    unsigned newLength = 0;
    char16* normal = ITextServices::instance().normalize(chars16(), len, form, newLength);
    if (normal)
        take(normal, true);
    return normal != nullptr;
}

void String::toLower()
{
    for (unsigned i = 0; i < len; ++i)
        toLower(i);
}

void String::toUpper()
{
    for (unsigned i = 0; i < len; ++i)
        toUpper(i);
}

void String::toLower(unsigned index)
{
    if (index >= len)
        return;
    if (isWide)
        chars16()[index] = toLower(chars16()[index]);
    else
        chars8()[index] = toLower(chars8()[index]);
}

void String::toUpper(unsigned index)
{
    if (index >= len)
        return;
    if (isWide)
        chars16()[index] = toUpper(chars16()[index]);
    else
        chars8()[index] = toUpper(chars8()[index]);
}

// Handing over

bool String::fromVariant(const FVariant& variant)
{
    switch (variant.getType())
    {
    case FVariant::kInteger:
        printInt64(variant.getInt());
        return true;
    case FVariant::kFloat:
        printFloat(variant.getFloat());
        return true;
    case FVariant::kString8:
        assign(variant.getString8());
        return true;
    case FVariant::kString16:
        assign(variant.getString16());
        return true;
    default:
        remove();
        return false;
    }
}

void String::passToVariant(FVariant& variant)
{
    // The empty text of a missing buffer belongs to nobody.
    toVariant(variant);
    variant.setOwner(buffer != nullptr);
    pass();
}

bool String::toAttributes(IAttributes* attributes, const char* id) const
{
    FVariant variant;
    toVariant(variant);
    return attributes && attributes->set(id, variant);
}

bool String::fromAttributes(IAttributes* attributes, const char* id)
{
    FVariant variant;
    return attributes && attributes->get(id, variant) && fromVariant(variant);
}

void String::toPascalString(unsigned char* result) const
{
    const String copy(*this);
    const ConstString narrow(copy.text8());
    const unsigned count = std::min(narrow.length(), 255u);
    result[0] = static_cast<unsigned char>(count);
    std::memcpy(result + 1, narrow.text8(), count);
}

String& String::fromPascalString(const unsigned char* text)
{
    if (!text)
        return assign("");
    return assign(reinterpret_cast<const char*>(text) + 1, text[0], false);
}
