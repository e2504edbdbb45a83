#include "containers/value/cmdate.h"

#include "containers/value/resultcodes.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

#include <algorithm>

DEFINE_CLASS(CmDate, CmObject)

DEFINE_INTERFACE_CLASS(IDate, CmDate)

namespace
{
const char16* wide(const char* literal)
{
    return ConstStringTable::instance().getString(literal);
}

const char16* const monthNames[] = {wide("January"),   wide("February"), wide("March"),    wide("April"),
                                    wide("May"),       wide("June"),     wide("July"),     wide("August"),
                                    wide("September"), wide("October"),  wide("November"), wide("December")};
const char16* const ucMonthNames[] = {wide("JANUARY"), wide("FEBRUARY"), wide("MARCH"),
                                      wide("APRIL"),   wide("MAY"),      wide("JUNE"),
                                      wide("JULY"),    wide("AUGUST"),   wide("SEPTEMBER"),
                                      wide("OCTOBER"), wide("NOVEMBER"), wide("DECEMBER")};
const char16* const weekDayNames[] = {wide("Monday"), wide("Tuesday"),  wide("Wednesday"), wide("Thursday"),
                                      wide("Friday"), wide("Saturday"), wide("Sunday")};
const char16* const ucWeekDayNames[] = {wide("MONDAY"), wide("TUESDAY"),  wide("WEDNESDAY"), wide("THURSDAY"),
                                        wide("FRIDAY"), wide("SATURDAY"), wide("SUNDAY")};

constexpr unsigned monthLengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
constexpr unsigned kFebruary = 2;
constexpr unsigned kLastMonth = 12;
constexpr unsigned kDaysInWeek = 7;

// Day numbers count from 1 March of the year 0, so that leap days end a year; 146097 days are 400 years, 1461 are
// four, and 153 are five months from March on.
constexpr unsigned kMarchOfYear0 = 1721119;
constexpr unsigned kJanuaryOfYear1 = 1721425;
constexpr unsigned kDaysBefore1901 = 2415386;

unsigned daysOfYears(unsigned years)
{
    return ((years / 100) * 146097 >> 2) + ((years % 100) * 1461 >> 2);
}

template <unsigned count>
const char16* nameAt(const char16* const (&names)[count], unsigned number)
{
    return number >= 1 && number <= count ? names[number - 1] : kEmptyString16;
}

template <unsigned count>
unsigned numberOf(const char16* name, const char16* const (&upperCaseNames)[count])
{
    const ConstString wanted(name);
    for (unsigned i = 0; i < count; i++)
        if (wanted.compare(upperCaseNames[i], kCaseInsensitive) == 0)
            return i + 1;
    return 0;
}

TextDateStyle textStyle(int style)
{
    switch (style)
    {
    case CmDate::kLong:
        return TextDateStyle::kLong;
    case CmDate::kMedium:
        return TextDateStyle::kMedium;
    default:
        return TextDateStyle::kShort;
    }
}
} // namespace

CmDate::CmDate()
{
    makeCurrent();
}

CmDate::CmDate(unsigned julianDay) : julian(julianDay) {}

CmDate::CmDate(unsigned day, unsigned year)
    : julian(year == 0 ? day + kDaysBefore1901 : day + daysOfYears(year - 1) + kJanuaryOfYear1)
{
}

CmDate::CmDate(unsigned day, unsigned month, unsigned year) : julian(julDay(day, month, year)) {}

CmDate::CmDate(unsigned day, const char16* monthName, unsigned year)
    : julian(julDay(day, indexOfMonth(monthName), year))
{
}

void CmDate::makeCurrent()
{
    TextDate date;
    TextTime time;
    ITextServices::instance().getLocalNow(date, time);
    julian = julDay(static_cast<unsigned>(date.day), static_cast<unsigned>(date.month),
                    static_cast<unsigned>(date.year));
}

unsigned CmDate::julDay(unsigned day, unsigned month, unsigned year)
{
    if (day == 0 || day > getDaysInMonth(month, year))
        return 0;

    const bool inLeapDayYear = month > kFebruary;
    const unsigned m = inLeapDayYear ? month - 3 : month + 9;
    const unsigned y = inLeapDayYear ? year : year - 1;
    return day + (153 * m + 2) / 5 + daysOfYears(y) + kMarchOfYear0;
}

void CmDate::mdy(unsigned& month, unsigned& day, unsigned& year) const
{
    month = day = year = 0;
    if (julian <= kMarchOfYear0)
        return;

    const uint64 quarters = 4 * uint64{julian - kMarchOfYear0} - 1;
    const uint64 century = quarters / 146097;
    const uint64 dayOfCentury = quarters % 146097 / 4;
    const uint64 yearOfCentury = (4 * dayOfCentury + 3) / 1461;
    const uint64 dayOfMarchYear = (4 * dayOfCentury + 3) % 1461 / 4 + 1;
    const uint64 fifths = 5 * dayOfMarchYear - 3;

    day = static_cast<unsigned>(fifths % 153 / 5 + 1);
    month = static_cast<unsigned>(fifths / 153 + 3);
    year = static_cast<unsigned>(100 * century + yearOfCentury);
    if (month <= kLastMonth)
        return;
    month -= kLastMonth;
    year++;
}

unsigned CmDate::dayOfMonth() const
{
    unsigned m, d, y;
    mdy(m, d, y);
    return d;
}

unsigned CmDate::month() const
{
    unsigned m, d, y;
    mdy(m, d, y);
    return m;
}

unsigned CmDate::year() const
{
    unsigned m, d, y;
    mdy(m, d, y);
    return y;
}

unsigned CmDate::dayOfYear() const
{
    return isValid() ? julian - julDay(1, 1, year()) + 1 : 0;
}

unsigned CmDate::firstDayOfMonth() const
{
    return isValid() ? dayOfYear() - dayOfMonth() + 1 : 0;
}

bool CmDate::leap() const
{
    return isValid() && leapYear(year());
}

bool CmDate::leapYear(unsigned year)
{
    return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
}

unsigned CmDate::getDaysInMonth(unsigned month, unsigned year)
{
    if (month < 1 || month > kLastMonth)
        return 0;
    return monthLengths[month - 1] + (month == kFebruary && leapYear(year) ? 1 : 0);
}

CmDate CmDate::previous(unsigned dayOfWeek) const
{
    if (!isValid() || dayOfWeek < 1 || dayOfWeek > kDaysInWeek)
        return CmDate(0u);
    const unsigned daysBack = (weekDay() + kDaysInWeek - dayOfWeek) % kDaysInWeek;
    return CmDate(julian - std::min(julian, daysBack == 0 ? kDaysInWeek : daysBack));
}

CmDate CmDate::previous(const char16* nameOfWeekDay) const
{
    return previous(dayOfWeek(nameOfWeekDay));
}

const char16* CmDate::nameOfDay() const
{
    return dayName(weekDay());
}

const char16* CmDate::nameOfMonth() const
{
    return monthName(month());
}

const char16* CmDate::dayName(unsigned dayOfWeek)
{
    return nameAt(weekDayNames, dayOfWeek);
}

const char16* CmDate::monthName(unsigned month)
{
    return nameAt(monthNames, month);
}

unsigned CmDate::dayOfWeek(const char16* name)
{
    return numberOf(name, ucWeekDayNames);
}

unsigned CmDate::indexOfMonth(const char16* name)
{
    return numberOf(name, ucMonthNames);
}

bool CmDate::toString(String& result, int style) const
{
    unsigned m, d, y;
    mdy(m, d, y);
    if (d == 0)
    {
        result = kEmptyString16;
        return false;
    }
    const TextDate date{static_cast<int>(y), static_cast<int>(m), static_cast<int>(d)};
    return ITextServices::instance().formatDate(date, textStyle(style), result);
}

bool CmDate::fromString(const char16* text)
{
    TextDate date;
    if (!text || !ITextServices::instance().parseDate(text, date) || date.year < 0)
        return false;
    return setChecked(static_cast<unsigned>(date.day), static_cast<unsigned>(date.month),
                      static_cast<unsigned>(date.year)) == kResultOk;
}

int32 CmDate::setChecked(unsigned day, unsigned month, unsigned year)
{
    const CmDate changed(day, month, year);
    // The number of a year that is far out wraps around and stands for another one.
    if (!changed.isValid() || changed.year() != year)
        return kResultInvalidArgument;
    julian = changed.julian;
    return kResultOk;
}

int32 CmDate::day(int* result)
{
    return answerNumber(result, dayOfMonth());
}

int32 CmDate::month(int* result)
{
    return answerNumber(result, month());
}

int32 CmDate::year(int* result)
{
    return answerNumber(result, year());
}

int32 CmDate::setDay(int day)
{
    return setChecked(static_cast<unsigned>(day), month(), year());
}

int32 CmDate::setMonth(int month)
{
    const auto newMonth = static_cast<unsigned>(month);
    return setChecked(std::min(dayOfMonth(), getDaysInMonth(newMonth, year())), newMonth, year());
}

int32 CmDate::setYear(int year)
{
    const auto newYear = static_cast<unsigned>(year);
    if (!isValid())
        return setChecked(1, 1, newYear);
    return setChecked(std::min(dayOfMonth(), getDaysInMonth(month(), newYear)), month(), newYear);
}

int32 CmDate::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IDate::iid))
        return offerInterface<IDate>(this, object);
    if (isSameInterface(interfaceID, IDateModifier::iid))
        return offerInterface<IDateModifier>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

bool CmDate::isEqual(const CmObject* other) const
{
    const auto* date = FCast(CmDate, other);
    return date ? julian == date->julian : CmObject::isEqual(other);
}

int CmDate::compare(const CmObject* other) const
{
    const auto* date = FCast(CmDate, other);
    if (!date)
        return CmObject::compare(other);
    return julian < date->julian ? -1 : julian > date->julian;
}

unsigned CmDate::hash(unsigned size) const
{
    return julian % size;
}
