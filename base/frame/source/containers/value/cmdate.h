#pragma once

#include "containers/value/idate.h"
#include "foundation/object/cmobject.h"

class String;

/// A calendar date as a Julian day number.
///
/// The number 0 is the invalid date; every constructor gives it for a date that no calendar has. Day numbers count
/// from 1, and weeks begin with Monday. One thread at a time.
class CmDate : public CmObject, public IDateModifier
{
    DECLARE_CLASS(CmDate, CmObject)
    FORWARD_FUNKNOWN(CmObject)

    enum DateStyle
    {
        kShort,
        kMedium,
        kLong
    };

    /// Today, in local time.
    CmDate();
    explicit CmDate(unsigned julianDay);
    /// The day of a year; with the year 0 the days since 1 January 1901.
    CmDate(unsigned day, unsigned year);
    CmDate(unsigned day, unsigned month, unsigned year);
    CmDate(unsigned day, const char16* monthName, unsigned year);
    CmDate(const CmDate&) = default;
    CmDate& operator=(const CmDate&) = default;

    void makeCurrent();
    bool isValid() const { return julian != 0; }
    unsigned getJulian() const { return julian; }

    // Parts of the date. All are 0 for the invalid date, save weekDay, which is then Monday

    void mdy(unsigned& month, unsigned& day, unsigned& year) const;
    unsigned dayOfMonth() const;
    unsigned month() const;
    unsigned year() const;
    unsigned dayOfYear() const;
    /// 1 for Monday to 7 for Sunday.
    unsigned weekDay() const { return julian % 7 + 1; }
    /// The day of the year on which the month begins.
    unsigned firstDayOfMonth() const;
    bool leap() const;
    /// The latest date before this one on that weekday; invalid where there is no such weekday.
    CmDate previous(unsigned dayOfWeek) const;
    CmDate previous(const char16* nameOfWeekDay) const;

    // Names, in English

    const char16* nameOfDay() const;
    const char16* nameOfMonth() const;
    /// The name of a weekday or month by its number from 1; empty for any other number.
    static const char16* dayName(unsigned dayOfWeek);
    static const char16* monthName(unsigned month);
    /// The number of a weekday or month by its name, upper or lower case alike; 0 where there is none.
    static unsigned dayOfWeek(const char16* name);
    static unsigned indexOfMonth(const char16* name);

    // The calendar

    /// 0 for a date that doesn't exist.
    static unsigned julDay(unsigned day, unsigned month, unsigned year);
    static bool leapYear(unsigned year);
    /// 0 for a month that doesn't exist.
    static unsigned getDaysInMonth(unsigned month, unsigned year);

    // Text, in the forms of the current locale

    /// `style` is a DateStyle; any other number is short. The invalid date gives the empty text.
    bool toString(String& result, int style = kShort) const;
    /// On failure the date stays what it was.
    bool fromString(const char16* text);

    bool operator==(const CmDate& other) const { return julian == other.julian; }
    bool operator<(const CmDate& other) const { return julian < other.julian; }

    int32 day(int* result) override;
    int32 month(int* result) override;
    int32 year(int* result) override;
    // An unset date is put together year first: that gives it a New Year's Day.
    int32 setDay(int day) override;
    int32 setMonth(int month) override;
    int32 setYear(int year) override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    int32 setChecked(unsigned day, unsigned month, unsigned year);

    unsigned julian;
};
