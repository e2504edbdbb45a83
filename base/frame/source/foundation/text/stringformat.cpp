#include "foundation/text/string.h"
#include "foundation/text/wideformat.h"

#include <algorithm>
#include <cstdio>

String& String::printf(const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    vprintf(format, arguments);
    va_end(arguments);
    return *this;
}

String& String::printf(const char16* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    vprintf(format, arguments);
    va_end(arguments);
    return *this;
}

String& String::vprintf(const char* format, va_list arguments)
{
    // The arguments may point into this text, so it stays until all are read.
    char text[kMaxFormattedLength];
    if (!format || std::vsnprintf(text, sizeof(text), format, arguments) < 0)
        text[0] = 0;
    return assign(text);
}

String& String::vprintf(const char16* format, va_list arguments)
{
    char16 text[kMaxFormattedLength + 1];
    return assign(text, formatWide(text, format, arguments), false);
}

String& String::printInt64(int64 value)
{
    const auto number = static_cast<long long>(value);
    return isWide ? printf(u"%lld", number) : printf("%lld", number);
}

String& String::printFloat(double value)
{
    if (isWide)
        printf(u"%lf", value);
    else
        printf("%lf", value);
    const int point = findPrev(-1, '.');
    if (point < 0)
        return *this;
    unsigned end = len;
    while (end > static_cast<unsigned>(point) + 2 && testChar8(end - 1, '0'))
        --end;
    return remove(end);
}

bool String::incrementTrailingNumber(unsigned width, char16 separator, unsigned minNumber)
{
    if (width > 32)
        return false;
    int64 number = 1;
    if (const int digits = getTrailingNumberIndex(); digits >= 0)
    {
        const auto first = static_cast<unsigned>(digits);
        if (scanInt64(number, first, false))
            number = static_cast<int64>(static_cast<uint64>(number) + 1);
        remove(first);
        if (separator != 0 && first > 0 && testChar16(first - 1, separator))
            remove(first - 1);
    }
    number = std::max(number, static_cast<int64>(minNumber));

    if (separator != 0 && !isEmpty())
        separator < 0x80 ? append(static_cast<char>(separator)) : append(separator);
    String digitsText;
    digitsText.printf("%0*u", static_cast<int>(width), static_cast<unsigned>(number));
    if (isWide)
        digitsText.toWideString();
    append(digitsText);
    return true;
}
