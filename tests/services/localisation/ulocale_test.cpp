#include "services/localisation/ulocale.h"

#include "foundation/text/conststring.h"

#include <cstdlib>
#include <gtest/gtest.h>
#include <string>

namespace
{
/// What a fresh locale takes for the system's language under this environment.
ULanguage systemLanguageUnder(const char* lang)
{
    const char* all = std::getenv("LC_ALL");
    const std::string before = all ? all : "";
    setenv("LC_ALL", lang, 1);
    ULocale locale;
    const ULanguage result = locale.getSystemLanguage();
    if (all)
        setenv("LC_ALL", before.c_str(), 1);
    else
        unsetenv("LC_ALL");
    EXPECT_EQ(locale.getSystemLanguage(), result) << "the first answer holds";
    return result;
}
} // namespace

TEST(ULocale, TakesTheSystemsLanguageAndItsEncoding)
{
    unsetenv("LANGUAGE");
    EXPECT_EQ(systemLanguageUnder("de_DE.UTF-8"), 1);
    EXPECT_EQ(getDefaultEncoding(), kEncodingMacRoman);
    EXPECT_EQ(systemLanguageUnder("ja_JP.UTF-8"), kLanguageJapanese);
    EXPECT_EQ(getDefaultEncoding(), kEncodingDosJapanese);
    EXPECT_EQ(systemLanguageUnder("eo"), kLanguageEnglish);
    EXPECT_EQ(systemLanguageUnder("C"), kLanguageEnglish);
    EXPECT_EQ(getDefaultEncoding(), kEncodingMacRoman);

    // The platform's names of languages are those of the table.
    for (int i = 0; i < kLanguageCount; ++i)
    {
        const std::string ours = gLanguageCodeTable[i];
        const std::string code = ours == "jp" ? "ja" : ours == "us" ? "en" : ours == "bp" ? "pt_BR" : ours;
        EXPECT_EQ(systemLanguageUnder((code + ".UTF-8").c_str()), i) << code;
    }
}

TEST(ULocale, TheLastKnownLanguageWins)
{
    EXPECT_EQ(ULocale::getLastKnownLanguage(u"French\ngerman\nKlingon"), 1);
    EXPECT_EQ(ULocale::getLastKnownLanguage("\nEnglish\n\nBRAZILIAN PORTUGUESE\n"), 49);
    EXPECT_EQ(ULocale::getLastKnownLanguage(u"Klingon"), kLanguageEnglish);
    EXPECT_EQ(ULocale::getLastKnownLanguage(u""), kLanguageEnglish);
}

TEST(ULocale, EveryRowOfTheTableIsFoundByItsNames)
{
    ULocale locale;
    for (int i = 0; i < kLanguageCount; ++i)
    {
        EXPECT_EQ(locale.getLanguageFromString(locale.getLanguageString(i)), i);
        EXPECT_EQ(locale.getLanguageFromCode(locale.getLanguageCode(i)), i);
    }
    EXPECT_STREQ(locale.getLanguageCode(3), "jp");
    EXPECT_EQ(locale.getLanguageFromCode("xx"), kLanguageEnglish);
    EXPECT_EQ(locale.getLanguageFromCode(nullptr), kLanguageEnglish);
    EXPECT_EQ(locale.getLanguageFromString(u"german"), kLanguageEnglish) << "names respect case";
    EXPECT_EQ(locale.getLanguageCode(50), nullptr);
    EXPECT_EQ(locale.getLanguageString(-1), nullptr);
}

TEST(ULocale, TheUsersChoiceGoesFirst)
{
    ULocale locale;
    locale.setUserLanguage(0);
    EXPECT_EQ(locale.getUserLanguage(), 0);
    locale.setUserLanguage(17);
    EXPECT_EQ(locale.getUserLanguage(), 17);
    EXPECT_EQ(&__getLocale(), &__getLocale());
}

TEST(ULocale, KnowsLeadBytes)
{
    struct Case
    {
        int language;
        unsigned char byte;
        bool isLead;
    };
    const Case cases[] = {{3, 0x80, false}, {3, 0x81, true},  {3, 0x9F, true},  {3, 0xA0, false},
                          {3, 0xE0, true},  {3, 0xFC, true},  {3, 0xFD, false}, {9, 0x81, true},
                          {9, 0xC0, true},  {9, 0xFD, false}, {17, 0xBF, true}, {17, 0xC0, false},
                          {0, 0x81, false}};
    const ULocale locale;
    for (const Case& each : cases)
        EXPECT_EQ(locale.isLeadByte(each.language, each.byte), each.isLead)
            << each.language << " " << int{each.byte};
    for (int language = -1; language < kLanguageCount; ++language)
        EXPECT_EQ(locale.isLeadByteLanguage(language), language == 3 || language == 9 || language == 17);
}
