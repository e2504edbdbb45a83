#include "foundation/text/natcompare.h"

#include "foundation/text/conststring.h"

namespace
{
int valueOf(char character)
{
    return static_cast<unsigned char>(character);
}

int valueOf(char16 character)
{
    return character;
}

template <class Char>
bool isDigitAt(const Char* text)
{
    return *text >= Char('0') && *text <= Char('9');
}

template <class Char>
int skipZeros(const Char*& text)
{
    const Char* start = text;
    while (*text == Char('0'))
        ++text;
    return static_cast<int>(text - start);
}

template <class Char>
int measureDigits(const Char* text)
{
    const Char* end = text;
    while (isDigitAt(end))
        ++end;
    return static_cast<int>(end - text);
}

/// Compares the digit runs at both places; steps behind them where they are alike.
template <class Char>
int compareNumbers(const Char*& a, const Char*& b)
{
    const int zeros = skipZeros(a) - skipZeros(b);
    int firstDifference = 0;
    for (; isDigitAt(a) && isDigitAt(b); ++a, ++b)
        firstDifference = firstDifference ? firstDifference : *a - *b;
    // At most one of them goes on.
    if (isDigitAt(a))
        return measureDigits(a);
    if (isDigitAt(b))
        return -measureDigits(b);
    return firstDifference ? firstDifference : zeros;
}

template <class Char>
int compareCharacters(Char a, Char b, bool caseSensitive)
{
    if (a == b)
        return 0;
    return caseSensitive ? valueOf(a) - valueOf(b)
                         : valueOf(ConstString::toUpper(a)) - valueOf(ConstString::toUpper(b));
}

/// Steps over characters that are the same in both texts, and no digits: names of files have many of them.
template <class Char>
void skipAlike(const Char*& a, const Char*& b)
{
    for (; *a == *b && *a != 0 && !isDigitAt(a); ++b)
        ++a;
}

template <class Char>
int compareNaturally(const Char* a, const Char* b, bool caseSensitive)
{
    if (!a || !b)
        return (a ? 1 : 0) - (b ? 1 : 0);
    for (skipAlike(a, b); *a && *b; skipAlike(a, b))
    {
        const bool areNumbers = isDigitAt(a) && isDigitAt(b);
        const int difference =
            areNumbers ? compareNumbers(a, b) : compareCharacters(*a++, *b++, caseSensitive);
        if (difference != 0)
            return difference;
    }
    return (*a ? 1 : 0) - (*b ? 1 : 0);
}
} // namespace

int strnatcmp8(const char* a, const char* b, bool caseSensitive)
{
    return compareNaturally(a, b, caseSensitive);
}

int strnatcmp16(const char16* a, const char16* b, bool caseSensitive)
{
    return compareNaturally(a, b, caseSensitive);
}
