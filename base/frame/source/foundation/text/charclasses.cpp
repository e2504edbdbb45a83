#include "foundation/text/conststring.h"
#include "foundation/text/itextservices.h"

#include <cctype>

namespace
{
// The classes of the plain locale, whatever locale the process has taken on.
template <class Char>
bool isBetween(Char character, char first, char last)
{
    return character >= Char(first) && character <= Char(last);
}

bool isAscii(char16 character)
{
    return character < 0x80;
}
} // namespace

bool ConstString::isCharSpace(char character)
{
    return character == ' ' || isBetween(character, '\t', '\r');
}

bool ConstString::isCharSpace(char16 character)
{
    switch (character)
    {
    case 0x20:
    case 0xA0:
    case 0x202F:
    case 0x205F:
    case 0x3000:
        return true;
    default:
        return character >= 0x2002 && character <= 0x200B;
    }
}

bool ConstString::isCharDigit(char character)
{
    return isBetween(character, '0', '9');
}

bool ConstString::isCharDigit(char16 character)
{
    return isBetween(character, '0', '9');
}

bool ConstString::isCharAlpha(char character)
{
    return isCharUpper(character) || isCharLower(character);
}

bool ConstString::isCharAlpha(char16 character)
{
    if (isAscii(character))
        return isCharAlpha(static_cast<char>(character));
    return ITextServices::instance().isAlpha(character);
}

bool ConstString::isCharAlphaNum(char character)
{
    return isCharAlpha(character) || isCharDigit(character);
}

bool ConstString::isCharAlphaNum(char16 character)
{
    return isCharAlpha(character) || isCharDigit(character);
}

bool ConstString::isCharAscii(char character)
{
    return static_cast<unsigned char>(character) < 0x80;
}

bool ConstString::isCharAscii(char16 character)
{
    return isAscii(character);
}

bool ConstString::isCharUpper(char character)
{
    return isBetween(character, 'A', 'Z');
}

bool ConstString::isCharUpper(char16 character)
{
    if (isAscii(character))
        return isCharUpper(static_cast<char>(character));
    return ITextServices::instance().isUpper(character);
}

bool ConstString::isCharLower(char character)
{
    return isBetween(character, 'a', 'z');
}

bool ConstString::isCharLower(char16 character)
{
    if (isAscii(character))
        return isCharLower(static_cast<char>(character));
    return ITextServices::instance().isLower(character);
}

char ConstString::toUpper(char character)
{
    if (isCharLower(character))
        return static_cast<char>(character - 32);
    return static_cast<char>(std::toupper(static_cast<unsigned char>(character)));
}

char16 ConstString::toUpper(char16 character)
{
    if (isAscii(character))
        return static_cast<char16>(toUpper(static_cast<char>(character)));
    return ITextServices::instance().toUpper(character);
}

char ConstString::toLower(char character)
{
    if (isCharUpper(character))
        return static_cast<char>(character + 32);
    return static_cast<char>(std::tolower(static_cast<unsigned char>(character)));
}

char16 ConstString::toLower(char16 character)
{
    if (isAscii(character))
        return static_cast<char16>(toLower(static_cast<char>(character)));
    return ITextServices::instance().toLower(character);
}
