#include "services/localisation/ftextutils.h"

#include "../../foundation/text/texts.h"
#include "containers/value/cmtime.h"

#include <gtest/gtest.h>
#include <limits>

TEST(FTextUtils, NamesCopies)
{
    String name("Tune");
    for (const char* expected : {"Tune Copy", "Tune Copy 2", "Tune Copy 3"})
    {
        FTextUtils::makeCopyString(name);
        EXPECT_EQ(name, expected);
    }
}

TEST(FTextUtils, PrintsFileSizes)
{
    const std::pair<double, const char*> sizes[] = {
        {0, "0 bytes"},          {1024, "1024 bytes"},          {1025, "1.00 KB"},   {1536, "1.50 KB"},
        {1048576, "1024.00 KB"}, {5.0 * 1073741824, "5.00 GB"}, {2e15, "1818.99 TB"}};
    for (const auto& [bytes, expected] : sizes)
    {
        String text;
        FTextUtils::printFileSize(text, bytes);
        EXPECT_EQ(text, expected);
    }
    String text;
    FTextUtils::printFileSize(text, std::numeric_limits<double>::quiet_NaN());
    EXPECT_EQ(text, "0 bytes");
}

TEST(FTextUtils, ScansFileSizes)
{
    const std::pair<const char*, int64> sizes[] = {{"1.5 KB", 1536},
                                                   {"1,5 kb", 1536},
                                                   {"2 mb", 2097152},
                                                   {"1 GB", 1073741824},
                                                   {"700", 700},
                                                   {"0.7", 1},
                                                   {"1e300", 9200000000000000000}};
    for (const auto& [text, expected] : sizes)
    {
        int64 bytes = -1;
        EXPECT_TRUE(FTextUtils::scanFileSize(String(text), bytes)) << text;
        EXPECT_EQ(bytes, expected) << text;
    }
    int64 bytes = -1;
    EXPECT_FALSE(FTextUtils::scanFileSize(String("KB"), bytes));
    EXPECT_EQ(bytes, -1);
}

TEST(FTextUtils, PrintsSpansOfTime)
{
    struct Case
    {
        unsigned seconds;
        bool shorten;
        const char* text;
    };
    const Case cases[] = {{0, false, "0 seconds"},
                          {1, false, "1 second"},
                          {60, false, "60 seconds"},
                          {61, false, "1 minute 1 second"},
                          {120, false, "2 minutes"},
                          {3661, true, "1 hour 1 minute"},
                          {3661, false, "1 hour 1 minute 1 second"},
                          {90000, false, "1 day 1 hour"},
                          {87000, false, "24 hours 10 minutes"},
                          {86400, false, "24 hours"},
                          {86401, true, "24 hours"},
                          {172800, false, "2 days"},
                          {176521, true, "2 days 1 hour"},
                          {176521, false, "2 days 1 hour 2 minutes 1 second"},
                          {605, true, "10 minutes 5 seconds"}};
    for (const Case& each : cases)
    {
        String text("before");
        FTextUtils::printFriendlyDuration(text, each.seconds, each.shorten);
        EXPECT_EQ(text, each.text) << each.seconds;
    }
}

TEST(FTextUtils, PrintsNumbersByTheirMeaning)
{
    struct Case
    {
        int type;
        int64 value;
        const char* text;
    };
    const Case cases[] = {{-1, -12345678901, "-12345678901"},
                          {0, 44100, "44.1 kHz"},
                          {1, 1, "Mono"},
                          {1, 2, "Stereo"},
                          {1, 6, "6 Channels"},
                          {2, 24, "24 bit"},
                          {2, 32, "32 bit float"},
                          {3, 320000, "320 kbps"},
                          {4, 1536, "1.50 KB"},
                          {6, 61, "1 minute 1 second"},
                          {7, 48879, "BEEF"},
                          {99, 5, "before"}};
    for (const Case& each : cases)
    {
        String text("before");
        FTextUtils::printInt(text, each.value, UTextFormatType(each.type));
        EXPECT_EQ(text, each.text) << each.type;
    }
    int64 value = 0;
    EXPECT_TRUE(FTextUtils::scanInt(String("1 KB"), value, kTextFormatFileSize));
    EXPECT_EQ(value, 1024);
    EXPECT_TRUE(FTextUtils::scanInt(String("1 KB"), value, kTextFormatNone));
    EXPECT_EQ(value, 1);
}

TEST(FTextUtils, DatesAndTimesComeBack)
{
    const CmTime moment(CmDate(15u, 6u, 2024u), 13, 5, 59, true);
    String text;
    int64 seconds = 0;
    FTextUtils::printInt(text, moment.getSeconds(), kTextFormatDateTime);
    EXPECT_TRUE(FTextUtils::scanInt(text, seconds, kTextFormatDateTime)) << shape(text);
    EXPECT_EQ(seconds, moment.getSeconds()) << shape(text);

    String day;
    CmDate(moment).toString(day);
    EXPECT_TRUE(FTextUtils::scanDateTime(day, seconds));
    EXPECT_EQ(seconds, CmTime(CmDate(15u, 6u, 2024u), CmTime(0u)).getSeconds())
        << "without a time it is midnight";
    EXPECT_FALSE(FTextUtils::scanDateTime(String("never"), seconds));
}
