#include "services/localisation/ftextutils.h"

#include "containers/value/cmdate.h"
#include "containers/value/cmtime.h"
#include "foundation/text/utranslatedstring.h"

#include <algorithm>
#include <cmath>

namespace
{
const UTranslatedString kCopy("Copy");

const UTranslatedString kFileSizeUnits[] = {UTranslatedString("bytes"), UTranslatedString("KB"),
                                            UTranslatedString("MB"), UTranslatedString("GB"),
                                            UTranslatedString("TB")};

const UTranslatedString kMono("Mono");
const UTranslatedString kStereo("Stereo");
const UTranslatedString kChannels("Channels");

const UTranslatedString kSampleRate("%.1f kHz");
const UTranslatedString kBitRate("%d kbps");

/// The name of a span of time, for one and for more.
struct SpanName
{
    UTranslatedString one;
    UTranslatedString more;
};

const SpanName kDay = {UTranslatedString("day"), UTranslatedString("days")};
const SpanName kHour = {UTranslatedString("hour"), UTranslatedString("hours")};
const SpanName kMinute = {UTranslatedString("minute"), UTranslatedString("minutes")};
const SpanName kSecond = {UTranslatedString("second"), UTranslatedString("seconds")};

constexpr unsigned kSecondsPerMinute = 60;
constexpr unsigned kSecondsPerHour = 3600;
constexpr unsigned kSecondsPerDay = 86400;

void appendSpan(String& result, unsigned count, const SpanName& name)
{
    String span;
    span.printf(u"%u %s", count, (count == 1 ? name.one : name.more).text());
    if (!result.isEmpty())
        result.append(u' ');
    result.append(span);
}

void appendSpanUnlessZero(String& result, unsigned count, const SpanName& name)
{
    if (count > 0)
        appendSpan(result, count, name);
}

/// Cut to the range of the type, since the number may come from anywhere.
int64 toInteger(double value)
{
    constexpr double kLimit = 9.2e18;
    return std::isnan(value) ? 0 : static_cast<int64>(std::clamp(value, -kLimit, kLimit));
}

double findFileSizeFactor(const String& text)
{
    String upper(text);
    upper.toUpper();
    if (upper.findNext(0, 'K') >= 0)
        return 1024;
    if (upper.findNext(0, 'M') >= 0)
        return 1048576;
    return upper.findNext(0, 'G') >= 0 ? 1073741824 : 1;
}
} // namespace

void FTextUtils::makeCopyString(String& name)
{
    if (name.findNext(0, kCopy.text()) < 0)
        name.append(u' ').append(kCopy.text());
    else
        name.incrementTrailingNumber(0, u' ', 2);
}

void FTextUtils::printFileSize(String& result, double bytes)
{
    int unit = 0;
    for (; bytes > 1024 && unit < 4; ++unit)
        bytes /= 1024;
    const char16* name = kFileSizeUnits[unit].text();
    if (unit == 0)
        result.printf(u"%d %s", static_cast<int>(toInteger(bytes)), name);
    else
        result.printf(u"%.2f %s", bytes, name);
}

bool FTextUtils::scanFileSize(const String& text, int64& bytes)
{
    double number = 0;
    if (!text.scanFloat(number))
        return false;
    bytes = toInteger(number * findFileSizeFactor(text) + 0.5);
    return true;
}

void FTextUtils::printDateTime(String& result, int64 seconds)
{
    const CmTime moment(static_cast<unsigned>(seconds));
    String time;
    CmDate(moment).toString(result);
    moment.toString(time, true);
    result.append(u' ').append(time);
}

bool FTextUtils::scanDateTime(const String& text, int64& seconds)
{
    String dateText(text);
    String timeText(u"0:00:00");
    if (const int blank = text.findNext(0, ' '); blank >= 0)
    {
        dateText.remove(static_cast<unsigned>(blank));
        text.extract(timeText, static_cast<unsigned>(blank) + 1);
    }
    CmDate date;
    CmTime time;
    if (!date.fromString(dateText.text16()) || !time.fromString(timeText))
        return false;
    seconds = CmTime(date, time).getSeconds();
    return true;
}

void FTextUtils::printChannels(String& result, int channels)
{
    if (channels == 1)
        result.assign(kMono.text());
    else if (channels == 2)
        result.assign(kStereo.text());
    else
        result.printf(u"%d %s", channels, kChannels.text());
}

void FTextUtils::printFriendlyDuration(String& result, unsigned seconds, bool shorten)
{
    result.assign(u"");
    if (seconds <= kSecondsPerMinute)
        return appendSpan(result, seconds, kSecond);

    unsigned days = seconds / kSecondsPerDay;
    unsigned hours = seconds % kSecondsPerDay / kSecondsPerHour;
    // A day and some minutes read better as 24 hours and some minutes.
    if (days == 1 && hours == 0)
    {
        days = 0;
        hours = 24;
    }
    const bool withMinutes = !shorten || days == 0;
    const bool withSeconds = withMinutes && (!shorten || hours == 0);
    appendSpanUnlessZero(result, days, kDay);
    appendSpanUnlessZero(result, hours, kHour);
    if (withMinutes)
        appendSpanUnlessZero(result, seconds % kSecondsPerHour / kSecondsPerMinute, kMinute);
    if (withSeconds)
        appendSpanUnlessZero(result, seconds % kSecondsPerMinute, kSecond);
}

void FTextUtils::printInt(String& result, int64 value, UTextFormatType type)
{
    switch (type)
    {
    case kTextFormatNone:
        result.printf(u"%lld", static_cast<long long>(value));
        break;
    case kTextFormatSampleRate:
        result.printf(kSampleRate.text(), static_cast<double>(value) / 1000.0);
        break;
    case kTextFormatChannels:
        printChannels(result, static_cast<int>(value));
        break;
    case kTextFormatBitDepth:
        result.printf(value == 32 ? u"%d bit float" : u"%d bit", static_cast<int>(value));
        break;
    case kTextFormatBitRate:
        result.printf(kBitRate.text(), static_cast<int>(value / 1000));
        break;
    case kTextFormatFileSize:
        printFileSize(result, static_cast<double>(value));
        break;
    case kTextFormatDateTime:
        printDateTime(result, value);
        break;
    case kTextFormatDuration:
        printFriendlyDuration(result, static_cast<unsigned>(value), false);
        break;
    case kTextFormatHex:
        result.printf(u"%X", static_cast<unsigned>(value));
        break;
    }
}

bool FTextUtils::scanInt(const String& text, int64& value, UTextFormatType type)
{
    if (type == kTextFormatFileSize)
        return scanFileSize(text, value);
    if (type == kTextFormatDateTime)
        return scanDateTime(text, value);
    return text.scanInt64(value);
}
