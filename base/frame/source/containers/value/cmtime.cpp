#include "containers/value/cmtime.h"

#include "containers/value/resultcodes.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

DEFINE_CLASS(CmTime, CmObject)

const CmDate CmTime::refDate(0u, 0u);

DEFINE_INTERFACE_CLASS(ITime, CmTime)

namespace
{
// The number of refDate, for use before the statics of this file are made.
constexpr unsigned kRefJulian = 2415386;
constexpr unsigned kSecondsPerDay = 86400;
constexpr unsigned kSecondsPerHour = 3600;
constexpr unsigned kSecondsPerMinute = 60;
constexpr unsigned kSunday = 7;

unsigned secondsOf(unsigned hour, unsigned minute, unsigned second)
{
    return hour * kSecondsPerHour + minute * kSecondsPerMinute + second;
}

unsigned secondsAt(const CmDate& date)
{
    return (date.getJulian() - kRefJulian) * kSecondsPerDay;
}

/// The date before which lies the Sunday on which daylight saving begins.
CmDate dateAfterBeginOfDST(unsigned year)
{
    if (year > 1986)
        return CmDate(31u, 3u, year);
    if (year == 1975)
        return CmDate(23u, 2u, year);
    if (year == 1974)
        return CmDate(6u, 1u, year);
    return CmDate(30u, 4u, year);
}

void appendUnit(String& result, unsigned count, const char16* unit)
{
    if (count == 0)
        return;
    if (!result.isEmpty())
        result.append(u' ');
    String text;
    text.printInt64(count);
    result.append(text).append(u' ').append(unit);
}
} // namespace

CmTime::CmTime()
{
    makeCurrent();
}

CmTime::CmTime(unsigned count) : seconds(count) {}

CmTime::CmTime(unsigned hour, unsigned minute, unsigned second) : seconds(secondsOf(hour, minute, second)) {}

CmTime::CmTime(const CmDate& date, unsigned hour, unsigned minute, unsigned second, bool local)
    : seconds(secondsAt(date) + secondsOf(hour, minute, second))
{
    if (local && isDST())
        seconds -= kSecondsPerHour;
}

CmTime::CmTime(const CmDate& date, const CmTime& time)
    : seconds(secondsAt(date) + time.seconds % kSecondsPerDay)
{
}

void CmTime::makeCurrent()
{
    TextDate date;
    TextTime time;
    ITextServices::instance().getLocalNow(date, time);
    seconds = secondsOf(static_cast<unsigned>(time.hour), static_cast<unsigned>(time.minute),
                        static_cast<unsigned>(time.second));
}

CmTime::operator CmDate() const
{
    return CmDate(kRefJulian + seconds / kSecondsPerDay);
}

unsigned CmTime::hour() const
{
    return localTime().hourGMT();
}

unsigned CmTime::minute() const
{
    return localTime().minuteGMT();
}

unsigned CmTime::second() const
{
    return localTime().secondGMT();
}

CmTime CmTime::localTime() const
{
    return CmTime(isDST() ? seconds + kSecondsPerHour : seconds);
}

bool CmTime::isDST() const
{
    if (!ITextServices::instance().hasDaylightSaving())
        return false;
    const unsigned year = CmDate(*this).year();
    return seconds >= beginDST(year).seconds && seconds < endDST(year).seconds;
}

CmTime CmTime::beginDST(unsigned year)
{
    return CmTime(dateAfterBeginOfDST(year).previous(kSunday), 2, 0, 0, false);
}

CmTime CmTime::endDST(unsigned year)
{
    return CmTime(CmDate(31u, 10u, year).previous(kSunday), 1, 0, 0, false);
}

bool CmTime::toString(String& result, bool withSeconds) const
{
    const CmTime local = localTime();
    const TextTime time{static_cast<int>(local.hourGMT()), static_cast<int>(local.minuteGMT()),
                        static_cast<int>(local.secondGMT())};
    return ITextServices::instance().formatTime(time, withSeconds, result);
}

bool CmTime::fromString(const ConstString& text)
{
    const String wide(text);
    TextTime time;
    if (!ITextServices::instance().parseTime(wide.text16(), time))
        return false;
    seconds = secondsOf(static_cast<unsigned>(time.hour), static_cast<unsigned>(time.minute),
                        static_cast<unsigned>(time.second));
    return true;
}

void CmTime::toFriendlyDurationString(String& result, bool withSeconds) const
{
    result = kEmptyString16;
    appendFriendlyDurationString(result, withSeconds);
}

void CmTime::appendFriendlyDurationString(String& result, bool withSeconds) const
{
    String duration;
    appendUnit(duration, seconds / kSecondsPerDay, u"d");
    appendUnit(duration, hourGMT(), u"h");
    appendUnit(duration, minuteGMT(), u"min");
    if (withSeconds || seconds < kSecondsPerMinute)
        appendUnit(duration, secondGMT(), u"s");
    if (duration.isEmpty())
        duration = u"0 s";
    result.append(duration);
}

int32 CmTime::hour(int* result)
{
    return answerNumber(result, hour());
}

int32 CmTime::minute(int* result)
{
    return answerNumber(result, minute());
}

int32 CmTime::second(int* result)
{
    return answerNumber(result, second());
}

int32 CmTime::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, ITime::iid))
        return offerInterface<ITime>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

bool CmTime::isEqual(const CmObject* other) const
{
    const auto* time = FCast(CmTime, other);
    return time ? seconds == time->seconds : CmObject::isEqual(other);
}

int CmTime::compare(const CmObject* other) const
{
    const auto* time = FCast(CmTime, other);
    if (!time)
        return CmObject::compare(other);
    return seconds < time->seconds ? -1 : seconds > time->seconds;
}

unsigned CmTime::hash(unsigned size) const
{
    return seconds % size;
}
