#pragma once

#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

#include <string>

/// The name of a locale as ICU has it: "de_DE" for "de_DE.UTF-8". Empty for what is none.
std::string canonicalLocale(const char* name);

/// The name by which ICU knows the user's locale for a category of the environment, such as "LC_TIME".
/// Empty where the environment names none but the plain one.
std::string findLocale(const char* category);

/// Writes and reads dates and times in the customs of one locale.
///
/// Texts have plain blanks where ICU's patterns have those that don't break, so that they survive 8-bit encodings.
/// Dates count by the calendar of the locale, and are Gregorian before 1582 too where that calendar is Gregorian.
class LocaleCustoms
{
public:
    /// An empty name stands for the customs of the United States.
    explicit LocaleCustoms(const std::string& name) : locale(name.empty() ? "en_US" : name) {}

    bool formatDate(const TextDate& date, TextDateStyle style, String& result) const;
    bool formatTime(const TextTime& time, bool withSeconds, String& result) const;
    bool parseDate(const char16* text, TextDate& result) const;
    bool parseTime(const char16* text, TextTime& result) const;

private:
    std::string locale;
};
