#include "texts.h"

#include <gtest/gtest.h>

TEST(NumberScan, LooksForANumberFromTheOffsetOn)
{
    for (const ConstString& text : {ConstString("abc42"), ConstString(u"abc42")})
    {
        int32 value = -1;
        EXPECT_TRUE(text.scanInt32(value));
        EXPECT_EQ(value, 42);
        EXPECT_FALSE(text.scanInt32(value, 0, false));
        EXPECT_EQ(value, 42);
        EXPECT_TRUE(text.scanInt32(value, 4, false));
        EXPECT_EQ(value, 2);
        EXPECT_FALSE(text.scanInt32(value, 5));
    }
    int64 number = 0;
    EXPECT_TRUE(ConstString("-7").scanInt64(number));
    EXPECT_EQ(number, -7);
    EXPECT_TRUE(ConstString(" \n 8").scanInt64(number, 0, false));
    EXPECT_EQ(number, 8);
    for (const char* none : {"x-", "", "   ", "- -", "+"})
        EXPECT_FALSE(ConstString(none).scanInt64(number)) << none;
    EXPECT_TRUE(ConstString("- 1").scanInt64(number));
    EXPECT_EQ(number, 1);
}

TEST(NumberScan, KeepsTheLowBits)
{
    int32 value = 0;
    EXPECT_TRUE(ConstString("99999999999").scanInt32(value));
    EXPECT_EQ(value, static_cast<int32>(99999999999LL));
    uint32 positive = 0;
    EXPECT_TRUE(ConstString("4294967297").scanUInt32(positive));
    EXPECT_EQ(positive, 1u);
    uint64 large = 0;
    EXPECT_TRUE(ConstString("18446744073709551615").scanUInt64(large));
    EXPECT_EQ(large, UINT64_MAX);
    uint8 byte = 0;
    EXPECT_TRUE(ConstString("#1fF").scanHex(byte));
    EXPECT_EQ(byte, 0xFF);
    EXPECT_TRUE(ConstString("0x7e").scanHex(byte));
    EXPECT_EQ(byte, 0x7E);
}

TEST(NumberScan, TakesEitherDecimalSeparator)
{
    double value = 0;
    EXPECT_TRUE(ConstString("1,5").scanFloat(value));
    EXPECT_EQ(value, 1.5);
    EXPECT_TRUE(ConstString(u"-1,5").scanFloat(value));
    EXPECT_EQ(value, -1.5);
    EXPECT_FALSE(ConstString("x1").scanFloat(value, 0, false));
    EXPECT_TRUE(ConstString(u"tempo 120.25 bpm").scanFloat(value));
    EXPECT_EQ(value, 120.25);
    EXPECT_TRUE(ConstString("3,2,5").scanFloat(value, 2));
    EXPECT_EQ(value, 2.5) << "the first comma from the offset on is the point";
    EXPECT_FALSE(ConstString("n/a -").scanFloat(value, 4));
    EXPECT_EQ(value, 2.5);
}

TEST(NumberScan, ReadsNumbersLongerThanItsWindow)
{
    std::string text(5000, '0');
    text += "17";
    int64 value = 0;
    EXPECT_TRUE(ConstString(text.c_str()).scanInt64(value));
    EXPECT_EQ(value, 17);
    text.assign(1 << 20, '-');
    EXPECT_FALSE(ConstString(text.c_str()).scanInt64(value)) << "and ends soon where there is none";
}

TEST(NumberPrint, LeavesOneDigitBehindThePoint)
{
    struct Case
    {
        double value;
        const char* text;
    };
    for (const Case& each :
         {Case{2.5, "2.5"}, Case{3.0, "3.0"}, Case{0.125, "0.125"}, Case{1.0, "1.0"}, Case{100.0, "100.0"},
          Case{-0.5, "-0.5"}, Case{1e-7, "0.0"}, Case{10.0000001, "10.0"}})
    {
        String narrow(""), wideText(u"");
        EXPECT_EQ(shape(narrow.printFloat(each.value)), std::string("narrow:") + each.text);
        EXPECT_EQ(shape(wideText.printFloat(each.value)), std::string("wide:") + each.text);
    }
    EXPECT_EQ(shape(String("").printInt64(INT64_MIN)), "narrow:-9223372036854775808");
    EXPECT_EQ(shape(String().printInt64(0)), "wide:0");
}

TEST(NumberPrint, CountsUpTheNumberAtTheEnd)
{
    struct Case
    {
        const char* text;
        unsigned width;
        char16 separator;
        unsigned minNumber;
        const char* result;
    };
    const Case cases[] = {
        {"Take 9", 0, ' ', 0, "Take 10"},
        {"Take", 0, ' ', 2, "Take 2"},
        {"Take", 3, ' ', 2, "Take 002"},
        {"Take", 0, 0, 0, "Take1"},
        {"Take 099", 3, ' ', 0, "Take 100"},
        {"Take 9", 0, '-', 0, "Take -10"},
        {"7", 0, ' ', 0, "8"},
        {"", 2, ' ', 0, "01"},
        {"A-3", 2, '-', 9, "A-09"},
        {"x4294967296", 0, 0, 0, "x1"},
    };
    for (const Case& each : cases)
    {
        String narrow(each.text), wideText = wide(each.text);
        EXPECT_TRUE(narrow.incrementTrailingNumber(each.width, each.separator, each.minNumber));
        EXPECT_EQ(shape(narrow), std::string("narrow:") + each.result);
        EXPECT_TRUE(wideText.incrementTrailingNumber(each.width, each.separator, each.minNumber));
        EXPECT_EQ(shape(wideText), std::string("wide:") + each.result);
    }
    String text("Take 9");
    EXPECT_FALSE(text.incrementTrailingNumber(33));
    EXPECT_TRUE(text.incrementTrailingNumber(0, u'\u2009'));
    EXPECT_EQ(shape(text), "wide:Take \u2009"
                           "10");
}
