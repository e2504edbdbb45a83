#include "platform/icu/localecustoms.h"

#include "foundation/text/charwidth.h"

#include <chrono>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <unicode/ucal.h>
#include <unicode/udat.h>
#include <unicode/uloc.h>

namespace
{
constexpr double kMillisecondsPerDay = 86400000.0;
constexpr int kMaxText = 256;
constexpr char16 kZone[] = u"Etc/GMT";

void replaceBlanks(String& text)
{
    for (unsigned i = 0; i < text.length(); ++i)
        if (ConstString::isCharSpace(text.getChar16(i)))
            text.setChar16(i, u' ');
}

/// Owns a format of ICU; makes its dates Gregorian throughout and its blanks plain.
class DateFormat
{
public:
    DateFormat(const std::string& locale, UDateFormatStyle dateStyle, UDateFormatStyle timeStyle)
        : format(udat_open(timeStyle, dateStyle, locale.c_str(), kZone, -1, nullptr, 0, &status))
    {
        makeGregorian();
        makeBlanksPlain();
        setStrict();
    }

    DateFormat(const std::string& locale, const char16* pattern)
        : format(udat_open(UDAT_PATTERN, UDAT_PATTERN, locale.c_str(), kZone, -1, pattern, -1, &status))
    {
        setStrict();
    }

    ~DateFormat()
    {
        if (format)
            udat_close(format);
    }

    DateFormat(const DateFormat&) = delete;
    DateFormat& operator=(const DateFormat&) = delete;

    bool print(double moment, String& result)
    {
        char16 text[kMaxText];
        if (!isUsable())
            return false;
        const int length = udat_format(format, moment, text, kMaxText, nullptr, &status);
        if (U_FAILURE(status) || length <= 0 || length >= kMaxText)
            return false;
        result.assign(text, length, false);
        return true;
    }

    /// Days, months and hours that are written with two digits are read with one as well.
    void takeShortNumbers()
    {
        const String pattern = getPattern();
        String shortened;
        bool isQuoted = false;
        for (unsigned i = 0, run = 0; i < pattern.length(); ++i)
        {
            const char16 letter = pattern.getChar16(i);
            isQuoted = isQuoted != (letter == u'\'');
            run = i > 0 && pattern.getChar16(i - 1) == letter ? run + 1 : 1;
            const bool isPair = run == 2 && pattern.getChar16(i + 1) != letter;
            if (isQuoted || !isPair || ConstString(u"dMLHhkK").findNext(0, letter) < 0)
                shortened.append(letter);
        }
        setPattern(shortened);
    }

    /// Takes the whole text, or nothing.
    bool parse(const ConstString& text, double& moment)
    {
        if (!isUsable())
            return false;
        int end = 0;
        const double found =
            udat_parse(format, text.text16(), static_cast<int>(text.length()), &end, &status);
        const bool isWhole = U_SUCCESS(status) && static_cast<unsigned>(end) == text.length();
        status = U_ZERO_ERROR;
        if (isWhole)
            moment = found;
        return isWhole;
    }

private:
    bool isUsable() const { return format && U_SUCCESS(status); }

    void makeGregorian()
    {
        if (!isUsable())
            return;
        UCalendar* calendar = ucal_clone(udat_getCalendar(format), &status);
        if (std::strcmp(ucal_getType(calendar, &status), "gregorian") == 0)
        {
            ucal_setGregorianChange(calendar, -1e15, &status);
            udat_setCalendar(format, calendar);
        }
        ucal_close(calendar);
    }

    void makeBlanksPlain()
    {
        String pattern = getPattern();
        replaceBlanks(pattern);
        setPattern(pattern);
    }

    /// 31 February is no date.
    void setStrict()
    {
        if (isUsable())
            udat_setLenient(format, false);
    }

    String getPattern()
    {
        char16 pattern[kMaxText] = {};
        if (isUsable())
            udat_toPattern(format, false, pattern, kMaxText - 1, &status);
        return String(pattern);
    }

    void setPattern(const String& pattern)
    {
        if (isUsable())
            udat_applyPattern(format, false, pattern.text16(), static_cast<int>(pattern.length()));
    }

    UErrorCode status = U_ZERO_ERROR;
    UDateFormat* format;
};

/// Milliseconds since 1970 at the start of the day.
double momentOf(const TextDate& date)
{
    const std::chrono::year_month_day day(std::chrono::year(date.year),
                                          std::chrono::month(static_cast<unsigned>(date.month)),
                                          std::chrono::day(static_cast<unsigned>(date.day)));
    return static_cast<double>(std::chrono::sys_days(day).time_since_epoch().count()) * kMillisecondsPerDay;
}

UDateFormatStyle styleOf(TextDateStyle style)
{
    switch (style)
    {
    case TextDateStyle::kLong:
        return UDAT_LONG;
    case TextDateStyle::kMedium:
        return UDAT_MEDIUM;
    default:
        return UDAT_SHORT;
    }
}

TextDate dateOf(double moment)
{
    const std::chrono::sys_days days{
        std::chrono::days(static_cast<int>(std::floor(moment / kMillisecondsPerDay)))};
    const std::chrono::year_month_day day(days);
    return {static_cast<int>(day.year()), static_cast<int>(static_cast<unsigned>(day.month())),
            static_cast<int>(static_cast<unsigned>(day.day()))};
}

TextTime timeOf(double moment)
{
    const double days = std::floor(moment / kMillisecondsPerDay);
    const int seconds = static_cast<int>((moment - days * kMillisecondsPerDay) / 1000);
    return {seconds / 3600, seconds / 60 % 60, seconds % 60};
}

/// The text without white space around it, and with plain blanks only.
String withPlainBlanks(const char16* text)
{
    String result(text);
    replaceBlanks(result);
    result.trim();
    return result;
}

/// Names of months and halves of the day may hold other blanks than the patterns, so the text is tried as it is too.
bool parseEither(DateFormat&& format, const ConstString& plain, const ConstString& text, double& moment)
{
    format.takeShortNumbers();
    return format.parse(plain, moment) || format.parse(text, moment);
}
} // namespace

std::string canonicalLocale(const char* name)
{
    UErrorCode status = U_ZERO_ERROR;
    char canonical[ULOC_FULLNAME_CAPACITY];
    const int length = uloc_canonicalize(name, canonical, ULOC_FULLNAME_CAPACITY, &status);
    return U_SUCCESS(status) && length < ULOC_FULLNAME_CAPACITY ? std::string(canonical) : std::string();
}

std::string findLocale(const char* category)
{
    const char* value = nullptr;
    for (const char* name : {"LC_ALL", category, "LANG"})
        if (!value || !*value)
            value = std::getenv(name);
    if (!value || !*value)
        return {};
    const std::string bare(value, std::strcspn(value, "."));
    if (bare == "C" || bare == "POSIX")
        return {};
    return canonicalLocale(value);
}

bool LocaleCustoms::formatDate(const TextDate& date, TextDateStyle style, String& result) const
{
    return DateFormat(locale, styleOf(style), UDAT_NONE).print(momentOf(date), result);
}

bool LocaleCustoms::formatTime(const TextTime& time, bool withSeconds, String& result) const
{
    const double moment = (time.hour * 3600 + time.minute * 60 + time.second) * 1000.0;
    return DateFormat(locale, UDAT_NONE, withSeconds ? UDAT_MEDIUM : UDAT_SHORT).print(moment, result);
}

bool LocaleCustoms::parseDate(const char16* text, TextDate& result) const
{
    const String plain = withPlainBlanks(text);
    double moment = 0;
    for (UDateFormatStyle style : {UDAT_SHORT, UDAT_MEDIUM, UDAT_LONG})
        if (parseEither(DateFormat(locale, style, UDAT_NONE), plain, text, moment))
        {
            result = dateOf(moment);
            return true;
        }
    return false;
}

bool LocaleCustoms::parseTime(const char16* text, TextTime& result) const
{
    const String plain = withPlainBlanks(text);
    double moment = 0;
    const bool isTime = parseEither(DateFormat(locale, UDAT_NONE, UDAT_MEDIUM), plain, text, moment) ||
                        parseEither(DateFormat(locale, UDAT_NONE, UDAT_SHORT), plain, text, moment) ||
                        parseEither(DateFormat(locale, u"H:mm:ss"), plain, text, moment) ||
                        parseEither(DateFormat(locale, u"H:mm"), plain, text, moment);
    if (isTime)
        result = timeOf(moment);
    return isTime;
}
