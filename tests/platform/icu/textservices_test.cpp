#include "foundation/text/itextservices.h"

#include "../../foundation/text/texts.h"

#include <cstdlib>
#include <gtest/gtest.h>
#include <map>

namespace
{
using Words = std::map<std::string, std::string>;

/// The environment's words on language and place, for one test.
class Environment
{
public:
    explicit Environment(const Words& wanted)
    {
        for (const char* name :
             {"LANGUAGE", "LC_ALL", "LC_MESSAGES", "LC_TIME", "LC_MEASUREMENT", "LANG", "TZ"})
        {
            if (const char* value = std::getenv(name))
                before[name] = value;
            set(name, wanted.count(name) ? wanted.at(name).c_str() : nullptr);
        }
    }

    ~Environment()
    {
        for (const char* name :
             {"LANGUAGE", "LC_ALL", "LC_MESSAGES", "LC_TIME", "LC_MEASUREMENT", "LANG", "TZ"})
            set(name, before.count(name) ? before[name].c_str() : nullptr);
    }

    Environment(const Environment&) = delete;

private:
    static void set(const char* name, const char* value)
    {
        if (value)
            setenv(name, value, 1);
        else
            unsetenv(name);
    }

    Words before;
};

ITextServices& services()
{
    return ITextServices::instance();
}

std::string date(const TextDate& value, TextDateStyle style)
{
    String text;
    EXPECT_TRUE(services().formatDate(value, style, text));
    return shape(text);
}

std::string time(const TextTime& value, bool withSeconds)
{
    String text;
    EXPECT_TRUE(services().formatTime(value, withSeconds, text));
    return shape(text);
}

std::string language()
{
    String text;
    services().getPreferredLanguages(text);
    return shape(text);
}
} // namespace

TEST(TextServices, WriteDatesAndTimesInTheUsersForm)
{
    const TextDate day{2026, 1, 2};
    const TextTime afternoon{15, 4, 5};
    {
        const Environment german(Words{{"LANG", "de_DE.UTF-8"}});
        EXPECT_EQ(date(day, TextDateStyle::kShort), "wide:02.01.26");
        EXPECT_EQ(date(day, TextDateStyle::kMedium), "wide:02.01.2026");
        EXPECT_EQ(date(day, TextDateStyle::kLong), "wide:2. Januar 2026");
        EXPECT_EQ(time(afternoon, false), "wide:15:04");
        EXPECT_EQ(time(afternoon, true), "wide:15:04:05");
    }
    {
        const Environment english(Words{{"LANG", "de_DE.UTF-8"}, {"LC_TIME", "en_US.UTF-8"}});
        EXPECT_EQ(date(day, TextDateStyle::kShort), "wide:1/2/26");
        EXPECT_EQ(date(day, TextDateStyle::kLong), "wide:January 2, 2026");
        EXPECT_EQ(time(afternoon, true), "wide:3:04:05 PM") << "with a plain blank";
    }
    const Environment plain(Words{{"LC_ALL", "C"}});
    EXPECT_EQ(date(day, TextDateStyle::kMedium), "wide:Jan 2, 2026");
    EXPECT_EQ(date({1500, 3, 1}, TextDateStyle::kMedium), "wide:Mar 1, 1500") << "one calendar throughout";
}

TEST(TextServices, ReadWhatTheyWrite)
{
    const TextDate day{2024, 2, 29};
    const TextTime moment{13, 5, 59};
    for (const char* locale :
         {"en_US.UTF-8", "de_DE.UTF-8", "fr_FR.UTF-8", "es_ES.UTF-8", "it_IT", "ja_JP.UTF-8", "zh_CN.UTF-8",
          "ko_KR", "hu_HU", "th_TH", "fa_IR", "en_GB", "es_MX", "C"})
    {
        const Environment environment(Words{{"LC_ALL", locale}});
        for (const auto style : {TextDateStyle::kShort, TextDateStyle::kMedium, TextDateStyle::kLong})
        {
            String text;
            TextDate read;
            ASSERT_TRUE(services().formatDate(day, style, text));
            EXPECT_TRUE(services().parseDate(text.text16(), read)) << locale << " " << shape(text);
            EXPECT_EQ(read.year * 10000 + read.month * 100 + read.day, 20240229)
                << locale << " " << shape(text);
        }
        String text;
        TextTime read;
        ASSERT_TRUE(services().formatTime(moment, true, text));
        EXPECT_TRUE(services().parseTime(text.text16(), read)) << locale << " " << shape(text);
        EXPECT_EQ(read.hour * 3600 + read.minute * 60 + read.second, 47159) << locale << " " << shape(text);
        EXPECT_TRUE(services().parseTime(u"0:00:00", read)) << locale;
        EXPECT_EQ(read.hour, 0) << locale;
    }
}

TEST(TextServices, ReadWhatPeopleType)
{
    TextDate day;
    TextTime moment;
    {
        const Environment german(Words{{"LC_ALL", "de_DE.UTF-8"}});
        EXPECT_TRUE(services().parseDate(u" 1.2.2026 ", day));
        EXPECT_EQ(day.month, 2);
        EXPECT_TRUE(services().parseTime(u"7:05", moment));
        EXPECT_EQ(moment.hour, 7);
    }
    const Environment english(Words{{"LC_ALL", "en_US.UTF-8"}});
    EXPECT_TRUE(services().parseTime(u"1:05 PM", moment));
    EXPECT_EQ(moment.hour, 13);
    EXPECT_TRUE(services().parseTime(u"1:05\u202FPM", moment));
    EXPECT_TRUE(services().parseTime(u"23:59", moment));
    EXPECT_EQ(moment.hour, 23);
    EXPECT_TRUE(services().parseDate(u"12/31/2026", day));
    EXPECT_EQ(day.day, 31);

    for (const char16* bad : {u"", u"2/30/2026", u"13/1/2026", u"tomorrow", u"1/2/2026 x", u"1/2"})
        EXPECT_FALSE(services().parseDate(bad, day)) << shape(bad);
    for (const char16* bad : {u"", u"25:00", u"7:61", u"noon", u"7:05x"})
        EXPECT_FALSE(services().parseTime(bad, moment)) << shape(bad);
    EXPECT_EQ(day.day, 31);
    EXPECT_EQ(moment.hour, 23);
}

TEST(TextServices, NameTheWantedLanguage)
{
    struct Case
    {
        Words environment;
        const char* name;
    };
    const Case cases[] = {
        {{{"LANG", "de_AT.UTF-8"}}, "wide:German"},
        {{{"LANG", "de_DE"}, {"LC_MESSAGES", "fr_FR"}}, "wide:French"},
        {{{"LANG", "de_DE"}, {"LC_MESSAGES", "fr_FR"}, {"LC_ALL", "it_IT"}}, "wide:Italian"},
        {{{"LANG", "en_US.UTF-8"}, {"LANGUAGE", "ja:en"}}, "wide:Japanese"},
        {{{"LANG", "C"}, {"LANGUAGE", "ja"}}, "wide:"},
        {{{"LANG", "pt_BR.UTF-8"}}, "wide:Brazilian Portuguese"},
        {{{"LANG", "pt_PT.UTF-8"}}, "wide:Portuguese"},
        {{{"LANG", "nb_NO.UTF-8"}}, "wide:Norwegian"},
        {{{"LANG", "fa_IR.UTF-8"}}, "wide:Farsi"},
        {{}, "wide:"},
    };
    for (const Case& each : cases)
    {
        const Environment environment(each.environment);
        EXPECT_EQ(language(), each.name);
    }
}

TEST(TextServices, KnowTheMeasurementSystem)
{
    const std::pair<const char*, int> systems[] = {
        {"en_US.UTF-8", 0}, {"de_DE.UTF-8", 1}, {"en_GB.UTF-8", -1}, {"C", -1}};
    for (const auto& [locale, system] : systems)
    {
        const Environment environment(Words{{"LC_MEASUREMENT", locale}, {"LANG", "fr_FR.UTF-8"}});
        EXPECT_EQ(services().getMeasurementSystem(), system) << locale;
    }
}

TEST(TextServices, KnowWhetherTheZoneHasDaylightSaving)
{
    const std::pair<const char*, bool> zones[] = {{"Europe/Berlin", true},
                                                  {"UTC", false},
                                                  {"Asia/Tokyo", false},
                                                  {"America/New_York", true},
                                                  {"Australia/Sydney", true}};
    for (const auto& [zone, hasDaylightSaving] : zones)
    {
        const Environment environment(Words{{"TZ", zone}});
        EXPECT_EQ(services().hasDaylightSaving(), hasDaylightSaving) << zone;
    }
}
