#include "foundation/text/wideformat.h"

#include "foundation/text/charwidth.h"
#include "foundation/text/string.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace
{
/// One conversion of a format, "%-8.3lld": its parts, and the text of it for the standard function.
struct Conversion
{
    static constexpr int kMaxText = 64;

    char text[kMaxText] = {};
    int textLength = 0;
    int width = 0;
    int precision = -1;
    bool leftAligned = false;
    char length[3] = {};
    char type = 0;
    const char16* begin = nullptr;
    const char16* end = nullptr;

    bool hasLength(const char* wanted) const { return std::strcmp(length, wanted) == 0; }

    void add(char character)
    {
        if (textLength < kMaxText - 1)
            text[textLength++] = character;
    }

    void addFlag(char flag)
    {
        leftAligned = leftAligned || flag == '-';
        if (!std::strchr(text, flag))
            add(flag);
    }

    void addNumber(int number)
    {
        textLength +=
            std::snprintf(text + textLength, static_cast<std::size_t>(kMaxText - textLength), "%d", number);
    }

    /// A negative width asks for alignment on the left.
    void setWidth(int number)
    {
        if (number < 0)
            addFlag('-');
        width = std::abs(number);
        if (width > 0)
            addNumber(width);
    }

    /// A negative precision counts as none.
    void setPrecision(int number)
    {
        precision = number;
        if (number < 0)
            return;
        add('.');
        addNumber(number);
    }
};

/// Walks a format, takes the arguments as it meets them, and collects what they give.
class Formatter
{
public:
    Formatter(char16* buffer, va_list values) : result(buffer) { va_copy(arguments, values); }
    ~Formatter() { va_end(arguments); }
    Formatter(const Formatter&) = delete;
    Formatter& operator=(const Formatter&) = delete;

    int run(const char16* format);

private:
    void put(char16 character)
    {
        if (count < kMaxFormattedLength)
            result[count++] = character;
    }
    void putNarrow(const char* text);
    void putPadded(const Conversion& conversion, const char16* text, unsigned length);
    template <class T>
    void putNumber(const Conversion& conversion, T value);
    void putInteger(const Conversion& conversion);
    void putFloat(const Conversion& conversion);
    void putText(const Conversion& conversion);
    void putCharacter(const Conversion& conversion);
    void putConversion(const Conversion& conversion);

    Conversion parse(const char16* place);
    int parseNumber(const char16*& place);

    char16* result;
    int count = 0;
    va_list arguments;
};

bool isOneOf(char16 character, const char* set)
{
    return character != 0 && character < 0x80 && std::strchr(set, static_cast<char>(character)) != nullptr;
}

int Formatter::run(const char16* format)
{
    const char16* place = format;
    while (place && *place)
    {
        if (*place != u'%')
        {
            put(*place++);
            continue;
        }
        const Conversion conversion = parse(place);
        putConversion(conversion);
        place = conversion.end;
    }
    result[count] = 0;
    return count;
}

/// A width or precision; no more is needed than the result can hold.
int Formatter::parseNumber(const char16*& place)
{
    if (*place == u'*')
    {
        ++place;
        const int number = va_arg(arguments, int);
        return std::clamp(number, -kMaxFormattedLength, kMaxFormattedLength);
    }
    int number = 0;
    for (; *place >= u'0' && *place <= u'9'; ++place)
        number = std::min(number * 10 + (*place - u'0'), kMaxFormattedLength);
    return number;
}

/// Flags, width, precision, length and type, in this order.
Conversion Formatter::parse(const char16* place)
{
    Conversion found;
    found.begin = place++;
    found.add('%');
    for (; isOneOf(*place, "-+ #0"); ++place)
        found.addFlag(static_cast<char>(*place));
    found.setWidth(parseNumber(place));
    if (*place == u'.')
        found.setPrecision(parseNumber(++place));
    for (int i = 0; i < 2 && isOneOf(*place, "hlqjztL"); ++i, ++place)
    {
        found.length[i] = static_cast<char>(*place);
        found.add(found.length[i]);
    }
    if (*place != 0)
        found.type = *place < 0x80 ? static_cast<char>(*place) : '?';
    found.add(found.type);
    found.end = *place != 0 ? place + 1 : place;
    return found;
}

void Formatter::putConversion(const Conversion& conversion)
{
    if (conversion.type == '%')
        return put(u'%');
    if (conversion.type == 's' || conversion.type == 'S')
        return putText(conversion);
    if (conversion.type == 'c' || conversion.type == 'C')
        return putCharacter(conversion);
    if (isOneOf(static_cast<char16>(conversion.type), "diouxX"))
        return putInteger(conversion);
    if (isOneOf(static_cast<char16>(conversion.type), "fFeEgGaA"))
        return putFloat(conversion);
    if (conversion.type == 'p')
        return putNumber(conversion, va_arg(arguments, void*));
    for (const char16* each = conversion.begin; each != conversion.end; ++each)
        put(*each);
}

void Formatter::putNarrow(const char* text)
{
    for (; *text; ++text)
        put(static_cast<char16>(static_cast<unsigned char>(*text)));
}

template <class T>
void Formatter::putNumber(const Conversion& conversion, T value)
{
    char text[kMaxFormattedLength + 1];
    std::snprintf(text, sizeof(text), conversion.text, value);
    putNarrow(text);
}

void Formatter::putInteger(const Conversion& conversion)
{
    if (conversion.hasLength("ll") || conversion.hasLength("q"))
        return putNumber(conversion, va_arg(arguments, long long));
    if (conversion.hasLength("l"))
        return putNumber(conversion, va_arg(arguments, long));
    if (conversion.hasLength("j"))
        return putNumber(conversion, va_arg(arguments, std::intmax_t));
    if (conversion.hasLength("z"))
        return putNumber(conversion, va_arg(arguments, std::size_t));
    if (conversion.hasLength("t"))
        return putNumber(conversion, va_arg(arguments, std::ptrdiff_t));
    putNumber(conversion, va_arg(arguments, int));
}

void Formatter::putFloat(const Conversion& conversion)
{
    if (conversion.hasLength("L"))
        return putNumber(conversion, va_arg(arguments, long double));
    putNumber(conversion, va_arg(arguments, double));
}

void Formatter::putPadded(const Conversion& conversion, const char16* text, unsigned length)
{
    const int padding = conversion.width - static_cast<int>(length);
    for (int i = 0; i < padding && !conversion.leftAligned; ++i)
        put(u' ');
    for (unsigned i = 0; i < length; ++i)
        put(text[i]);
    for (int i = 0; i < padding && conversion.leftAligned; ++i)
        put(u' ');
}

void Formatter::putText(const Conversion& conversion)
{
    const int limit = conversion.precision < 0 ? kMaxFormattedLength : conversion.precision;
    if (conversion.hasLength("h"))
    {
        const String wide(va_arg(arguments, const char*), limit);
        return putPadded(conversion, wide.text16(), wide.length());
    }
    const char16* text = va_arg(arguments, const char16*);
    if (!text)
        text = u"(null)";
    putPadded(conversion, text, measureText(text, static_cast<unsigned>(limit)));
}

void Formatter::putCharacter(const Conversion& conversion)
{
    const auto character = static_cast<char16>(va_arg(arguments, int));
    putPadded(conversion, &character, 1);
}
} // namespace

int formatWide(char16* result, const char16* format, va_list arguments)
{
    return Formatter(result, arguments).run(format);
}
