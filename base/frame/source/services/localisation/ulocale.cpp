#include "services/localisation/ulocale.h"

#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

#include <cstring>

namespace
{
constexpr int kLanguageNone = -1;

int findLanguage(const ConstString& name, CompareMode mode)
{
    for (int i = 0; i < kLanguageCount; ++i)
        if (name.compare(gLanguageTable[i], mode) == 0)
            return i;
    return kLanguageNone;
}

bool isInTable(int language)
{
    return language >= 0 && language < kLanguageCount;
}
} // namespace

ULanguage ULocale::getSystemLanguage()
{
    if (systemLanguageKnown)
        return systemLanguage;

    String names;
    ITextServices::instance().getPreferredLanguages(names);
    systemLanguage = getLastKnownLanguage(names);
    setDefaultEncoding(systemLanguage == kLanguageJapanese ? kEncodingDosJapanese : kEncodingDefault);
    systemLanguageKnown = true;
    return systemLanguage;
}

ULanguage ULocale::getLastKnownLanguage(const ConstString& names)
{
    ULanguage result = kLanguageEnglish;
    for (unsigned start = 0; start < names.length();)
    {
        const int lineEnd = names.findNext(static_cast<int>(start), u'\n');
        const unsigned end = lineEnd < 0 ? names.length() : static_cast<unsigned>(lineEnd);
        String name;
        names.extract(name, start, static_cast<int>(end - start));
        if (const int language = findLanguage(name, kCaseInsensitive); language != kLanguageNone)
            result = language;
        start = end + 1;
    }
    return result;
}

ULanguage ULocale::getUserLanguage()
{
    return userLanguageSet ? userLanguage : getSystemLanguage();
}

void ULocale::setUserLanguage(ULanguage language)
{
    userLanguage = language;
    userLanguageSet = true;
}

const char* ULocale::getLanguageCode(int language) const
{
    return isInTable(language) ? gLanguageCodeTable[language] : nullptr;
}

const char16* ULocale::getLanguageString(int language) const
{
    return isInTable(language) ? gLanguageTable[language] : nullptr;
}

ULanguage ULocale::getLanguageFromString(const char16* name) const
{
    const int language = findLanguage(name, kCaseSensitive);
    return language == kLanguageNone ? kLanguageEnglish : language;
}

ULanguage ULocale::getLanguageFromCode(const char* code) const
{
    for (int i = 0; code && i < kLanguageCount; ++i)
        if (std::strcmp(gLanguageCodeTable[i], code) == 0)
            return i;
    return kLanguageEnglish;
}

bool ULocale::isLeadByteLanguage(int language) const
{
    return language == kLanguageJapanese || language == kLanguageChinese || language == kLanguageKorean;
}

bool ULocale::isLeadByte(int language, unsigned char byte) const
{
    switch (language)
    {
    case kLanguageJapanese:
        return (byte >= 0x81 && byte <= 0x9F) || (byte >= 0xE0 && byte <= 0xFC);
    case kLanguageChinese:
        return byte >= 0x81 && byte <= 0xFC;
    case kLanguageKorean:
        return byte >= 0x81 && byte <= 0xBF;
    default:
        return false;
    }
}

int ULocale::getMeasure() const
{
    return ITextServices::instance().getMeasurementSystem();
}

ULocale& __getLocale()
{
    static ULocale locale;
    return locale;
}
