#include "containers/value/cmtime.h"
#include "foundation/text/itextservices.h"
#include "foundation/text/string.h"

#include <gtest/gtest.h>

namespace
{
CmDate dateOf(const CmTime& time)
{
    return time;
}

String durationOf(unsigned seconds, bool withSeconds)
{
    String text;
    CmTime(seconds).toFriendlyDurationString(text, withSeconds);
    return text;
}
} // namespace

TEST(CmTime, JoinsDateAndTimeOfDay)
{
    const CmDate date(23u, 5u, 2012u);
    const CmTime noon(date, 12, 30, 15, false);
    EXPECT_EQ(dateOf(noon), date);
    EXPECT_EQ(noon.hourGMT(), 12u);
    EXPECT_EQ(noon.minuteGMT(), 30u);
    EXPECT_EQ(noon.secondGMT(), 15u);
    EXPECT_EQ(CmTime(date, CmTime(12, 30, 15)), noon);
    EXPECT_EQ(CmTime(CmDate(1u, 1u, 1999u), noon), CmTime(CmDate(1u, 1u, 1999u), 12, 30, 15, false));
    EXPECT_EQ(CmTime(CmTime::refDate, 0, 0, 0, false).getSeconds(), 0u);
    EXPECT_EQ(CmTime(1, 2, 3).getSeconds(), 3723u);
}

TEST(CmTime, DaylightSavingFollowsOneTableOfSundays)
{
    const struct
    {
        unsigned year;
        CmDate begin, end;
    } rows[] = {
        {2001, CmDate(25u, 3u, 2001u), CmDate(28u, 10u, 2001u)},
        {1987, CmDate(29u, 3u, 1987u), CmDate(25u, 10u, 1987u)},
        {1986, CmDate(27u, 4u, 1986u), CmDate(26u, 10u, 1986u)},
        {1975, CmDate(16u, 2u, 1975u), CmDate(26u, 10u, 1975u)},
        {1974, CmDate(30u, 12u, 1973u), CmDate(27u, 10u, 1974u)},
    };
    for (const auto& row : rows)
    {
        EXPECT_EQ(CmTime::beginDST(row.year), CmTime(row.begin, 2, 0, 0, false)) << row.year;
        EXPECT_EQ(CmTime::endDST(row.year), CmTime(row.end, 1, 0, 0, false)) << row.year;
    }
}

TEST(CmTime, LocalTimeIsAnHourAheadWhereTheZoneHasDaylightSaving)
{
    const bool has = ITextServices::instance().hasDaylightSaving();
    const CmDate summer(1u, 7u, 2012u), winter(1u, 12u, 2012u);
    EXPECT_EQ(CmTime(summer, 12, 0, 0, false).isDST(), has);
    EXPECT_EQ(CmTime(summer, 12, 0, 0, false).hour(), has ? 13u : 12u);
    EXPECT_EQ(CmTime(summer, 12, 0, 0, true).hourGMT(), has ? 11u : 12u);
    EXPECT_EQ(CmTime(summer, 12, 0, 0, true).hour(), 12u);
    EXPECT_FALSE(CmTime(winter, 12, 0, 0, true).isDST());
    EXPECT_EQ(CmTime(winter, 12, 0, 0, true).hour(), 12u);

    const unsigned begin = CmTime::beginDST(2012).getSeconds(), end = CmTime::endDST(2012).getSeconds();
    EXPECT_FALSE(CmTime(begin - 1).isDST());
    EXPECT_EQ(CmTime(begin).isDST(), has);
    EXPECT_EQ(CmTime(end - 1).isDST(), has);
    EXPECT_FALSE(CmTime(end).isDST());
}

TEST(CmTime, ReadsWhatItPrints)
{
    String text;
    ASSERT_TRUE(CmTime(17, 45, 12).toString(text, true));
    CmTime read(0u);
    EXPECT_TRUE(read.fromString(text)) << text.text8();
    EXPECT_EQ(read, CmTime(17, 45, 12)) << text.text8();

    ASSERT_TRUE(CmTime(17, 45, 12).toString(text, false));
    EXPECT_TRUE(read.fromString(text));
    EXPECT_EQ(read, CmTime(17, 45, 0));
    EXPECT_FALSE(read.fromString("noon"));
    EXPECT_EQ(read, CmTime(17, 45, 0));
}

TEST(CmTime, PrintsLengthsOfTime)
{
    EXPECT_EQ(durationOf(0, false), u"0 s");
    EXPECT_EQ(durationOf(45, false), u"45 s");
    EXPECT_EQ(durationOf(60, true), u"1 min");
    EXPECT_EQ(durationOf(3725, true), u"1 h 2 min 5 s");
    EXPECT_EQ(durationOf(3725, false), u"1 h 2 min");
    EXPECT_EQ(durationOf(86400 * 2 + 1, true), u"2 d 1 s");
    String text("takes ");
    CmTime(61u).appendFriendlyDurationString(text, true);
    EXPECT_EQ(text, "takes 1 min 1 s");
}

TEST(CmTime, ComparesAndHashesByItsSeconds)
{
    const CmTime early(5u), late(3000000000u);
    EXPECT_LT(early.compare(&late), 0);
    EXPECT_GT(late.compare(&early), 0) << "also beyond what a signed number holds";
    EXPECT_TRUE(early.isEqual(&static_cast<const CmObject&>(CmTime(5u))));
    EXPECT_EQ(early.hash(4), 1u);
}

TEST(CmTime, TheCurrentTimeHasNoDatePart)
{
    EXPECT_LT(CmTime().getSeconds(), 86400u);
    EXPECT_LT(CmDate(1u, 1u, 2024u), CmDate());
}
