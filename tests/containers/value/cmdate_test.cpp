#include "containers/value/cmdate.h"
#include "foundation/object/classfactory.h"
#include "foundation/object/iptr.h"
#include "foundation/text/string.h"

#include <gtest/gtest.h>

TEST(CmDate, CountsDaysByTheCalendarAndRefusesWhatItDoesNotHave)
{
    const struct
    {
        unsigned day, month, year, julian;
    } rows[] = {
        {1, 1, 1901, 2415386},   {1, 1, 2001, 2451911},  {17, 11, 1858, 2400001}, {29, 2, 2000, 2451604},
        {31, 12, 1999, 2451544}, {28, 2, 1900, 2415079}, {29, 2, 1900, 0},        {31, 4, 2012, 0},
        {0, 1, 2012, 0},         {1, 13, 2012, 0},       {1, 0, 2012, 0},
    };
    for (const auto& row : rows)
        EXPECT_EQ(CmDate::julDay(row.day, row.month, row.year), row.julian)
            << row.day << "." << row.month << "." << row.year;
    EXPECT_FALSE(CmDate(29u, 2u, 1900u).isValid());
}

TEST(CmDate, GivesBackEveryDateOfTwoThousandYears)
{
    unsigned expected = CmDate::julDay(1, 1, 1582);
    for (unsigned year = 1582; year < 3600; year++)
        for (unsigned month = 1; month <= 12; month++)
            for (unsigned day = 1; day <= CmDate::getDaysInMonth(month, year); day++, expected++)
            {
                unsigned m, d, y;
                CmDate(expected).mdy(m, d, y);
                ASSERT_TRUE(m == month && d == day && y == year) << day << "." << month << "." << year;
            }
}

TEST(CmDate, TakesDaysOfAYear)
{
    EXPECT_EQ(CmDate(0u, 0u), CmDate(1u, 1u, 1901u));
    EXPECT_EQ(CmDate(60u, 2000u), CmDate(29u, 2u, 2000u));
    EXPECT_EQ(CmDate(60u, 2001u), CmDate(1u, 3u, 2001u));

    const CmDate date(31u, 12u, 2000u);
    EXPECT_EQ(date.dayOfYear(), 366u);
    EXPECT_EQ(date.firstDayOfMonth(), 336u);
    EXPECT_TRUE(date.leap());
    EXPECT_FALSE(CmDate(1u, 1u, 1900u).leap());
}

TEST(CmDate, WeeksBeginOnMonday)
{
    const CmDate monday(1u, 1u, 2001u);
    EXPECT_EQ(monday.weekDay(), 1u);
    EXPECT_EQ(monday.previous(7u), CmDate(31u, 12u, 2000u));
    EXPECT_EQ(monday.previous(2u), CmDate(26u, 12u, 2000u));
    EXPECT_EQ(monday.previous(1u), CmDate(25u, 12u, 2000u)) << "the day itself doesn't count";
    EXPECT_EQ(monday.previous(u"sunday"), CmDate(31u, 12u, 2000u));
    EXPECT_FALSE(CmDate(5u).previous(6u).isValid()) << "before the first of all days";
    EXPECT_FALSE(monday.previous(8u).isValid());
    EXPECT_FALSE(monday.previous(u"someday").isValid());
}

TEST(CmDate, KnowsNamesInAnyCase)
{
    const CmDate date(14u, 2u, 2012u);
    EXPECT_EQ(ConstString(date.nameOfDay()), u"Tuesday");
    EXPECT_EQ(ConstString(date.nameOfMonth()), u"February");
    EXPECT_EQ(ConstString(CmDate::dayName(0)), u"");
    EXPECT_EQ(ConstString(CmDate::monthName(13)), u"");
    EXPECT_EQ(CmDate::indexOfMonth(u"dEcEmBeR"), 12u);
    EXPECT_EQ(CmDate::indexOfMonth(u"Dec"), 0u);
    EXPECT_EQ(CmDate::dayOfWeek(u"MONDAY"), 1u);
    EXPECT_EQ(CmDate(14u, u"february", 2012u), date);
    EXPECT_FALSE(CmDate(14u, u"", 2012u).isValid());
}

TEST(CmDate, IsADateToComponentsByIdentifier)
{
    auto unknown = adopt(ClassFactory::instance(true)->createObjectByID(IDate::iid));
    auto date = adopt(askInterface<IDateModifier>(unknown));
    ASSERT_TRUE(date);
    EXPECT_EQ(date->setYear(2012), 0);
    EXPECT_EQ(date->setMonth(1), 0);
    EXPECT_EQ(date->setDay(31), 0);

    int day = 0, month = 0, year = 0;
    EXPECT_EQ(date->setMonth(2), 0) << "the day is cut to the month";
    EXPECT_EQ(date->day(&day) | date->month(&month) | date->year(&year), 0);
    EXPECT_TRUE(day == 29 && month == 2 && year == 2012);

    EXPECT_EQ(date->setDay(30), 2);
    EXPECT_EQ(date->setMonth(0), 2);
    EXPECT_EQ(date->day(nullptr), 2);
    date->day(&day);
    EXPECT_EQ(day, 29) << "a refused change leaves the date";
}

TEST(CmDate, IsPutTogetherFromAnUnsetOneYearFirst)
{
    CmDate date(0u);
    EXPECT_NE(date.setMonth(3), 0) << "a month of no year";
    EXPECT_FALSE(date.isValid());
    EXPECT_EQ(date.setYear(2012) | date.setMonth(3) | date.setDay(14), 0);
    EXPECT_EQ(date, CmDate(14u, 3u, 2012u));
    for (int year : {-1, 2000000000})
        EXPECT_EQ(date.setYear(year), 2) << year;
    EXPECT_EQ(date, CmDate(14u, 3u, 2012u));
}

TEST(CmDate, ReadsWhatItPrints)
{
    const CmDate date(23u, 5u, 2012u);
    for (int style : {CmDate::kShort, CmDate::kMedium, CmDate::kLong})
    {
        String text;
        ASSERT_TRUE(date.toString(text, style));
        CmDate read(1u);
        EXPECT_TRUE(read.fromString(text.text16())) << text.text8();
        EXPECT_EQ(read, date) << text.text8();
    }
    CmDate kept(date);
    EXPECT_FALSE(kept.fromString(u"no date"));
    EXPECT_FALSE(kept.fromString(nullptr));
    EXPECT_EQ(kept, date);
    String text(u"old");
    EXPECT_FALSE(CmDate(0u).toString(text));
    EXPECT_TRUE(text.isEmpty());
}

TEST(CmDate, ComparesAndHashesByItsNumber)
{
    const CmDate early(5u), late(7u);
    EXPECT_LT(early.compare(&late), 0);
    EXPECT_GT(late.compare(&early), 0);
    EXPECT_TRUE(early.isEqual(&static_cast<const CmObject&>(CmDate(5u))));
    EXPECT_EQ(late.hash(4), 3u);
}
