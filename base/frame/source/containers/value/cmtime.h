#pragma once

#include "containers/value/cmdate.h"
#include "containers/value/itime.h"

class ConstString;
class String;

/// A point in time, in seconds since the start of `refDate`, 1 January 1901; or a time of day, on that very date.
///
/// The value is Greenwich Mean Time. "Local" here means daylight saving alone: an hour is added between the dates
/// of one fixed table where the system's time zone has daylight saving at all, whatever the zone's own rules and
/// its distance from Greenwich are. Reaches into the year 2037. One thread at a time.
class CmTime : public CmObject, public ITime
{
    DECLARE_CLASS(CmTime, CmObject)
    FORWARD_FUNKNOWN(CmObject)

    /// The current time of day by the local clock, with no date part.
    CmTime();
    explicit CmTime(unsigned count);
    CmTime(unsigned hour, unsigned minute, unsigned second);
    /// With `local`, an hour is taken off in daylight saving.
    CmTime(const CmDate& date, unsigned hour, unsigned minute, unsigned second, bool local);
    /// Joins a date and a time of day; a date part of `time` is not used.
    CmTime(const CmDate& date, const CmTime& time);
    CmTime(const CmTime&) = default;
    CmTime& operator=(const CmTime&) = default;

    static const CmDate refDate;

    void makeCurrent();
    unsigned getSeconds() const { return seconds; }
    /// The date of the value, in Greenwich Mean Time.
    operator CmDate() const;

    // Parts of the time of day

    unsigned hour() const;
    unsigned minute() const;
    unsigned second() const;
    unsigned hourGMT() const { return seconds % 86400 / 3600; }
    unsigned minuteGMT() const { return seconds % 3600 / 60; }
    unsigned secondGMT() const { return seconds % 60; }

    // Daylight saving

    /// The value with an hour added in daylight saving.
    CmTime localTime() const;
    bool isDST() const;
    static CmTime beginDST(unsigned year);
    static CmTime endDST(unsigned year);

    // Text

    /// The local time of day in the current locale's form: medium with seconds, short without.
    bool toString(String& result, bool withSeconds = false) const;
    /// Takes over a time of day; on failure the value stays what it was.
    bool fromString(const ConstString& text);
    /// The value as a length of time, such as "2 d 3 h 5 min 7 s"; units that are 0 are left out, and seconds too
    /// where there are none wanted and the length is at least a minute.
    void toFriendlyDurationString(String& result, bool withSeconds) const;
    void appendFriendlyDurationString(String& result, bool withSeconds) const;

    bool operator==(const CmTime& other) const { return seconds == other.seconds; }
    bool operator<(const CmTime& other) const { return seconds < other.seconds; }

    int32 hour(int* result) override;
    int32 minute(int* result) override;
    int32 second(int* result) override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    unsigned seconds;
};
