#include "platform/icu/codepage.h"

#include "foundation/text/encodings.h"

#include <algorithm>
#include <unicode/ucnv.h>

const CodePage& CodePage::get(unsigned encoding)
{
    if (encoding == kEncodingDefault)
        return get(getDefaultEncoding());
    if (encoding == kEncodingMacRoman)
    {
        static const CodePage macRoman("macos-0_2-10.2", false);
        return macRoman;
    }
    if (encoding == kEncodingDosJapanese)
    {
        static const CodePage dosJapanese("ibm-943_P15A-2003", true);
        return dosJapanese;
    }
    if (encoding == kEncodingWindowsLatin1)
    {
        static const CodePage windowsLatin1("ibm-5348_P100-1997", false);
        return windowsLatin1;
    }
    if (encoding == kEncodingMacCentralEurope)
    {
        static const CodePage macCentralEurope("macos-29-10.2", false);
        return macCentralEurope;
    }
    static const CodePage ascii(nullptr, false);
    return ascii;
}

namespace
{
/// The one character of these bytes; 0 where they are none.
char16 askCharacter(UConverter* converter, const char* bytes, int count)
{
    UErrorCode status = U_ZERO_ERROR;
    char16 text[4];
    ucnv_reset(converter);
    const int length = ucnv_toUChars(converter, text, 4, bytes, count, &status);
    return U_SUCCESS(status) && length == 1 ? text[0] : u'\0';
}
} // namespace

CodePage::CodePage(const char* converterName, bool hasDoubleBytes)
{
    UErrorCode status = U_ZERO_ERROR;
    UConverter* converter = converterName ? ucnv_open(converterName, &status) : nullptr;
    if (!converter)
        return;
    ucnv_setToUCallBack(converter, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
    ucnv_setFromUCallBack(converter, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
    addSingles(converter);
    if (hasDoubleBytes)
        addDoubles(converter);
    ucnv_close(converter);
    std::sort(entries.begin(), entries.end(),
              [](const Entry& a, const Entry& b) { return a.character < b.character; });
}

void CodePage::addSingles(UConverter* converter)
{
    for (unsigned byte = 0x80; byte < 0x100; ++byte)
    {
        const char text = static_cast<char>(byte);
        singles[byte - 0x80] = askCharacter(converter, &text, 1);
        addEntry(converter, singles[byte - 0x80]);
    }
}

void CodePage::addDoubles(UConverter* converter)
{
    doubles.resize(0x80 * 0x100);
    for (unsigned i = 0; i < doubles.size(); ++i)
    {
        const char text[] = {static_cast<char>(0x80 + i / 0x100), static_cast<char>(i % 0x100)};
        if (singles[i / 0x100] != 0 || i % 0x100 < 0x40)
            continue;
        doubles[i] = askCharacter(converter, text, 2);
        addEntry(converter, doubles[i]);
    }
}

/// Where several bytes mean one character, the converter knows which of them to write.
void CodePage::addEntry(UConverter* converter, char16 character)
{
    if (character < 0x80)
        return;
    UErrorCode status = U_ZERO_ERROR;
    char bytes[4];
    ucnv_reset(converter);
    const int length = ucnv_fromUChars(converter, bytes, 4, &character, 1, &status);
    const auto first = static_cast<unsigned char>(bytes[0]);
    if (U_FAILURE(status) || length < 1 || length > 2)
        return;
    const auto second = static_cast<unsigned char>(bytes[1]);
    entries.push_back({character, static_cast<uint16>(length == 1 ? first : first << 8 | second)});
}

unsigned CodePage::decode(const unsigned char* text, unsigned rest, char16& character) const
{
    if (text[0] < 0x80)
    {
        character = text[0];
        return 1;
    }
    const unsigned lead = text[0] - 0x80u;
    character = singles[lead];
    if (character != 0)
        return 1;
    if (doubles.empty() || rest < 2)
        return 0;
    character = doubles[lead * 0x100 + text[1]];
    return character != 0 ? 2 : 0;
}

unsigned CodePage::encode(char16 character, char* bytes) const
{
    if (character < 0x80)
    {
        bytes[0] = static_cast<char>(character);
        return 1;
    }
    const auto place =
        std::lower_bound(entries.begin(), entries.end(), character,
                         [](const Entry& entry, char16 wanted) { return entry.character < wanted; });
    if (place == entries.end() || place->character != character)
        return 0;
    if (place->bytes > 0xFF)
        *bytes++ = static_cast<char>(place->bytes >> 8);
    *bytes = static_cast<char>(place->bytes);
    return place->bytes > 0xFF ? 2 : 1;
}
