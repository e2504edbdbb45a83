#include "foundation/text/conststring.h"

#include "foundation/object/fvariant.h"
#include "foundation/object/istring.h"
#include "foundation/text/charwidth.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

#include <algorithm>
#include <cstring>

namespace
{
template <class Char>
int copyCharacters(Char* result, const Char* source, unsigned index, unsigned count)
{
    if (count > 0)
        std::memcpy(result, source + index, count * sizeof(Char));
    result[count] = 0;
    return static_cast<int>(count);
}
} // namespace

ConstString::ConstString(const char* text)
    : buffer(const_cast<char*>(text)),
      len(measureText(text) & kMaxTextLength)
{
}

ConstString::ConstString(const char16* text)
    : buffer(const_cast<char16*>(text)),
      len(measureText(text) & kMaxTextLength),
      isWide(1)
{
}

ConstString::ConstString(const ConstString& text, int offset) : ConstString(text)
{
    if (offset <= 0 || !buffer)
        return;
    const unsigned step = std::min(static_cast<unsigned>(offset), length());
    buffer = static_cast<char*>(buffer) + step * charSize(isWideString());
    len = (len - step) & kMaxTextLength;
}

ConstString::ConstString(const FVariant& variant)
{
    if (variant.getType() == FVariant::kString8)
        *this = ConstString(variant.getString8());
    else if (variant.getType() == FVariant::kString16)
        *this = ConstString(variant.getString16());
}

ConstString::ConstString(const ConstString& other)
    : buffer(other.buffer),
      len(other.len),
      isWide(other.isWide)
{
}

ConstString& ConstString::operator=(const ConstString& other)
{
    buffer = other.buffer;
    len = other.len;
    isWide = other.isWide;
    return *this;
}

const char* ConstString::text8() const
{
    return buffer && !isWide ? chars8() : "";
}

const char16* ConstString::text16() const
{
    return buffer && isWide ? chars16() : kEmptyString16;
}

char ConstString::getChar8(unsigned index) const
{
    return index < len && !isWide ? chars8()[index] : '\0';
}

char16 ConstString::getChar16(unsigned index) const
{
    return index < len && isWide ? chars16()[index] : u'\0';
}

// Questions about characters

bool ConstString::testChar8(unsigned index, char character) const
{
    if (index >= len)
        return character == 0;
    return isWide ? chars16()[index] == widenCharacter(character) : chars8()[index] == character;
}

bool ConstString::testChar16(unsigned index, char16 character) const
{
    if (index >= len)
        return character == 0;
    return (isWide ? chars16()[index] : widenCharacter(chars8()[index])) == character;
}

bool ConstString::isDigit(unsigned index) const
{
    if (index >= len)
        return false;
    return isWide ? isCharDigit(chars16()[index]) : isCharDigit(chars8()[index]);
}

int ConstString::getTrailingNumberIndex(unsigned width) const
{
    unsigned start = len;
    while (start > 0 && isDigit(start - 1))
        --start;
    const unsigned digits = len - start;
    if (digits == 0 || (width > 0 && digits != width))
        return -1;
    return static_cast<int>(start);
}

bool ConstString::isAsciiString() const
{
    return isWide ? isAsciiText(chars16(), len) : isAsciiText(chars8(), len);
}

bool ConstString::isNormalized(UnicodeNormalization form) const
{
    if (!isWide || form != kUnicodeNormC)
        return false;
    return isEmpty() || ITextServices::instance().isNormalized(chars16(), len, form);
}

// Copying

unsigned ConstString::clampedCount(unsigned index, int count) const
{
    if (index >= len)
        return 0;
    const unsigned rest = len - index;
    return count < 0 ? rest : std::min(rest, static_cast<unsigned>(count));
}

bool ConstString::extract(String& result, unsigned index, int count) const
{
    if (index >= len)
        return false;
    // Made apart, since `result` may be this very text.
    const unsigned taken = clampedCount(index, count);
    const int given = static_cast<int>(taken);
    String part = isWide ? String(chars16() + index, given, false) : String(chars8() + index, given, false);
    if (part.length() != taken)
        return false;
    result.take(part);
    return true;
}

int ConstString::copyTo8(char* result, unsigned index, int count) const
{
    if (!isWide)
        return copyCharacters(result, chars8(), index, clampedCount(index, count));
    String narrow(*this);
    if (!narrow.toMultiByte())
        return copyCharacters(result, "", 0, 0);
    return ConstString(narrow.text8()).copyTo8(result, index, count);
}

int ConstString::copyTo16(char16* result, unsigned index, int count) const
{
    if (isWide)
        return copyCharacters(result, chars16(), index, clampedCount(index, count));
    String wide(*this);
    if (!wide.toWideString())
        return copyCharacters(result, kEmptyString16, 0, 0);
    return ConstString(wide.text16()).copyTo16(result, index, count);
}

int ConstString::copyTo(void* result, unsigned index, int count) const
{
    return isWide ? copyTo16(static_cast<char16*>(result), index, count)
                  : copyTo8(static_cast<char*>(result), index, count);
}

void ConstString::copyTo(IString& result) const
{
    if (isWide)
        result.setText16(ConstString::text16());
    else
        result.setText8(ConstString::text8());
}

void ConstString::copyTo(IStringResult* result) const
{
    if (!result)
        return;
    if (IString* string = askInterface<IString>(result))
    {
        copyTo(*string);
        string->release();
        return;
    }
    // Who takes 8-bit text only gets a copy, since the conversion must not change this text.
    String narrow(*this);
    result->setText(narrow.text8());
}

void ConstString::toVariant(FVariant& variant) const
{
    if (isWide)
        variant.setString16(ConstString::text16());
    else
        variant.setString8(ConstString::text8());
}
