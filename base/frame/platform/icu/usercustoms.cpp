#include "platform/icu/localecustoms.h"
#include "platform/icu/textservices.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <unicode/uloc.h>
#include <unicode/ulocdata.h>
#include <utility>

namespace
{
/// The framework's own names for languages that ICU calls otherwise.
constexpr std::pair<const char*, const char*> kOwnNames[] = {
    {"az", "Azeri"}, {"fa", "Farsi"}, {"fo", "Faeroese"}, {"nb", "Norwegian"}, {"nn", "Norwegian"},
};

std::tm localNow()
{
    const std::time_t now = std::time(nullptr);
    std::tm result{};
    tzset();
    localtime_r(&now, &result);
    return result;
}

/// The local time at noon of the first day of this year's `month`, from 0.
std::tm localNoonInMonth(int month)
{
    std::tm moment = localNow();
    moment.tm_mon = month;
    moment.tm_mday = 1;
    moment.tm_hour = 12;
    moment.tm_isdst = -1;
    std::mktime(&moment);
    return moment;
}

LocaleCustoms timeCustoms()
{
    return LocaleCustoms(findLocale("LC_TIME"));
}

/// The locale for messages: the first of LANGUAGE, which counts only where a locale is set at all.
std::string findLanguage()
{
    const std::string locale = findLocale("LC_MESSAGES");
    const char* wanted = std::getenv("LANGUAGE");
    if (locale.empty() || !wanted)
        return locale;
    wanted += std::strspn(wanted, ":");
    const std::string first(wanted, std::strcspn(wanted, ":"));
    return first.empty() ? locale : canonicalLocale(first.c_str());
}
} // namespace

bool IcuTextServices::formatDate(const TextDate& date, TextDateStyle style, String& result)
{
    return timeCustoms().formatDate(date, style, result);
}

bool IcuTextServices::formatTime(const TextTime& time, bool withSeconds, String& result)
{
    return timeCustoms().formatTime(time, withSeconds, result);
}

bool IcuTextServices::parseDate(const char16* text, TextDate& result)
{
    return text && timeCustoms().parseDate(text, result);
}

bool IcuTextServices::parseTime(const char16* text, TextTime& result)
{
    return text && timeCustoms().parseTime(text, result);
}

void IcuTextServices::getLocalNow(TextDate& date, TextTime& time)
{
    const std::tm now = localNow();
    date = {now.tm_year + 1900, now.tm_mon + 1, now.tm_mday};
    time = {now.tm_hour, now.tm_min, now.tm_sec};
}

bool IcuTextServices::hasDaylightSaving()
{
    return localNoonInMonth(0).tm_isdst > 0 || localNoonInMonth(6).tm_isdst > 0;
}

void IcuTextServices::getPreferredLanguages(String& result)
{
    result.assign(u"");
    const std::string locale = findLanguage();
    char code[ULOC_LANG_CAPACITY];
    char country[ULOC_COUNTRY_CAPACITY];
    char16 name[ULOC_FULLNAME_CAPACITY];
    UErrorCode status = U_ZERO_ERROR;
    uloc_getLanguage(locale.c_str(), code, ULOC_LANG_CAPACITY, &status);
    uloc_getCountry(locale.c_str(), country, ULOC_COUNTRY_CAPACITY, &status);
    if (U_FAILURE(status) || code[0] == 0)
        return;

    const bool isBrazilian = std::strcmp(code, "pt") == 0 && std::strcmp(country, "BR") == 0;
    const auto* own = std::find_if(std::begin(kOwnNames), std::end(kOwnNames),
                                   [&](const auto& entry) { return std::strcmp(entry.first, code) == 0; });
    const int length = uloc_getDisplayLanguage(code, "en", name, ULOC_FULLNAME_CAPACITY, &status);
    if (isBrazilian)
        result.assign(u"Brazilian Portuguese");
    else if (own != std::end(kOwnNames))
        result.assign(own->second).toWideString();
    else if (U_SUCCESS(status) && length < ULOC_FULLNAME_CAPACITY)
        result.assign(name, length, false);
}

int IcuTextServices::getMeasurementSystem()
{
    const std::string locale = findLocale("LC_MEASUREMENT");
    if (locale.empty())
        return -1;
    UErrorCode status = U_ZERO_ERROR;
    const UMeasurementSystem system = ulocdata_getMeasurementSystem(locale.c_str(), &status);
    if (U_FAILURE(status))
        return -1;
    if (system == UMS_US)
        return 0;
    return system == UMS_SI ? 1 : -1;
}
