#include "services/localisation/utranslationchecker.h"

#include <string>
#include <string_view>

namespace
{
bool isAnyOf(char16 c, std::u16string_view set)
{
    return c != 0 && set.find(c) != std::u16string_view::npos;
}

/// Reads to the next conversion. Gives what decides on its argument: stars, length and kind; empty at the end.
std::u16string nextConversion(const char16*& text)
{
    while (*text)
    {
        if (*text++ != '%')
            continue;
        if (*text == '%')
        {
            text++;
            continue;
        }
        std::u16string conversion;
        for (; isAnyOf(*text, u"-+ #0123456789.*'$"); text++)
            if (*text == '*' || *text == '$')
                conversion += *text;
        for (; isAnyOf(*text, u"hljztLq"); text++)
            conversion += *text;
        if (*text == 0)
            break;
        conversion += *text == 'i' ? u'd' : *text;
        text++;
        return conversion;
    }
    return {};
}
} // namespace

void UTranslationChecker::addLanguage(const char*, const char16*) {}

int UTranslationChecker::addTranslation(const char16* key, const char*, const char16* text)
{
    const bool isKeyItself = text[0] == '=' && text[1] == 0;
    mismatch = !isKeyItself && !takeSameArguments(key, text);
    return mismatch ? kStop : kTaken;
}

bool UTranslationChecker::takeSameArguments(const char16* first, const char16* second)
{
    while (true)
    {
        const std::u16string conversion = nextConversion(first);
        if (conversion != nextConversion(second))
            return false;
        if (conversion.empty())
            return true;
    }
}
