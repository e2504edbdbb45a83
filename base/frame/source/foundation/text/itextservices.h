#pragma once

#include "foundation/text/conststring.h"

/// How much a date says: 1/2/26, Jan 2, 2026, or January 2, 2026.
enum class TextDateStyle
{
    kShort,
    kMedium,
    kLong
};

/// A date of the Gregorian calendar; months and days count from 1.
struct TextDate
{
    int year = 0;
    int month = 0;
    int day = 0;
};

struct TextTime
{
    int hour = 0;
    int minute = 0;
    int second = 0;
};

/// What the platform knows of text: encodings, case, forms of Unicode, and the customs of the user's country.
///
/// Buffers that are given back come from `malloc`, are terminated, and belong to the caller; null says that
/// memory ran out. Encodings are the numbers of encodings.h. Thread-safe.
class ITextServices
{
public:
    static ITextServices& instance();

    virtual ~ITextServices() = default;

    // Encodings. A byte that means nothing becomes one `loss` character; an element that the encoding doesn't
    // have, or half of a surrogate pair, one `loss` byte. `resultLength` is without the terminator.
    virtual char16* toWide(const char* text, unsigned length, unsigned encoding, char16 loss,
                           unsigned& resultLength) = 0;
    virtual char* toMultiByte(const char16* text, unsigned length, unsigned encoding, char loss,
                              unsigned& resultLength) = 0;

    // Unicode
    /// The character itself where its mapping has more than one.
    virtual char16 toUpper(char16 character) = 0;
    virtual char16 toLower(char16 character) = 0;
    virtual bool isAlpha(char16 character) = 0;
    virtual bool isUpper(char16 character) = 0;
    virtual bool isLower(char16 character) = 0;
    /// -1, 0 or 1.
    virtual int compareIgnoringCase(const char16* a, unsigned lengthA, const char16* b, unsigned lengthB) = 0;
    virtual char16* normalize(const char16* text, unsigned length, UnicodeNormalization form,
                              unsigned& resultLength) = 0;
    virtual bool isNormalized(const char16* text, unsigned length, UnicodeNormalization form) = 0;

    // Dates and times in the customs of the user's country. Reading takes all three styles; false, with the
    // result as it was, where the text is none.
    virtual bool formatDate(const TextDate& date, TextDateStyle style, String& result) = 0;
    virtual bool formatTime(const TextTime& time, bool withSeconds, String& result) = 0;
    virtual bool parseDate(const char16* text, TextDate& result) = 0;
    virtual bool parseTime(const char16* text, TextTime& result) = 0;

    // The clock on the wall
    /// The date and time now, in the local zone with its daylight saving.
    virtual void getLocalNow(TextDate& date, TextTime& time) = 0;
    /// Whether the local zone has daylight saving this year.
    virtual bool hasDaylightSaving() = 0;

    // The user
    /// English names of the languages that the process should speak, separated by line feeds, the most wanted
    /// one first. May be empty.
    virtual void getPreferredLanguages(String& result) = 0;
    /// 0 the system of the United States, 1 the metric one, -1 another or unknown.
    virtual int getMeasurementSystem() = 0;
};
