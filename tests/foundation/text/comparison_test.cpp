#include "foundation/text/natcompare.h"
#include "texts.h"

#include <gtest/gtest.h>

namespace
{
int sign(int value)
{
    return (value > 0) - (value < 0);
}
} // namespace

TEST(Comparison, OrdersEmptyTexts)
{
    EXPECT_EQ(ConstString("a").compare(""), 1);
    EXPECT_EQ(ConstString().compare(u"a"), -1);
    EXPECT_EQ(ConstString(u"").compare(""), 0);
    EXPECT_EQ(ConstString("a").compare("b", 0), 0);
}

TEST(Comparison, GivesTheSameSignInEveryPairOfWidths)
{
    struct Case
    {
        const char* a;
        const char* b;
        int count;
        CompareMode mode;
        int expected;
    };
    const Case cases[] = {
        {"abc", "abd", -1, kCaseSensitive, -1}, {"abc", "abd", 2, kCaseSensitive, 0},
        {"abc", "ab", -1, kCaseSensitive, 1},   {"ab", "abc", -1, kCaseSensitive, -1},
        {"abc", "ab", 3, kCaseSensitive, 1},    {"ABC", "abc", -1, kCaseInsensitive, 0},
        {"ABC", "abc", -1, kCaseSensitive, -1}, {"ABx", "aby", 2, kCaseInsensitive, 0},
        {"B", "a", -1, kCaseInsensitive, 1},    {"same", "same", 99, kCaseInsensitive, 0},
    };
    for (const Case& each : cases)
    {
        const String wideA = wide(each.a), wideB = wide(each.b);
        const String narrowA(each.a), narrowB(each.b);
        for (const String* a : {&narrowA, &wideA})
            for (const String* b : {&narrowB, &wideB})
                EXPECT_EQ(sign(a->compare(*b, each.count, each.mode)), each.expected)
                    << each.a << " " << each.b << " " << a->isWideString() << b->isWideString();
        EXPECT_FALSE(narrowA.isWideString()) << "comparing must not convert";
    }
}

TEST(Comparison, GivesTheDifferenceOfWideCharacters)
{
    EXPECT_EQ(ConstString(u"ax").compare(u"as"), 5);
    EXPECT_EQ(ConstString(u"a").compare(u"abc"), -1);
    EXPECT_EQ(ConstString(u"\uFFFD").compare(u"\U0001F600"), 0xFFFD - 0xD83D)
        << "elements count, not characters";
    EXPECT_EQ(ConstString(u"STRASSE").compare(u"straße", kCaseInsensitive), 0);
    EXPECT_EQ(ConstString(u"ÄB").compare(u"äc", kCaseInsensitive), -1);
}

TEST(Comparison, FindsADifferenceAtEachPlaceOfEachLength)
{
    const std::u16string text = u"Item 0\U0001F600\u00E4\uFFFD\u01003x";
    for (std::size_t length = 1; length <= text.size(); length++)
    {
        const std::u16string whole = text.substr(0, length);
        EXPECT_EQ(ConstString(whole.c_str()).compare(String(whole.c_str())), 0);
        for (std::size_t place = 0; place < length; place++)
        {
            // What follows the difference would give another result, and so would a byte of it alone.
            std::u16string other = whole;
            other.back() = u'\u0001';
            other[place] = static_cast<char16>(whole[place] + 0xFF);
            EXPECT_EQ(ConstString(whole.c_str()).compare(other.c_str()), whole[place] - other[place])
                << place;
            EXPECT_EQ(ConstString(other.c_str()).compare(whole.c_str()), other[place] - whole[place])
                << place;
            const std::u16string start = whole.substr(0, place);
            EXPECT_EQ(ConstString(start.c_str()).compare(whole.c_str()), -1);
            EXPECT_GT(ConstString(whole.c_str()).compare(start.c_str()), 0);
        }
    }
}

TEST(Comparison, ComparesWhatStandsBehindAnIndex)
{
    EXPECT_EQ(ConstString("file.xml").compareAt(4, ".xml"), 0);
    EXPECT_EQ(ConstString("file.xml").compareAt(4, u".XML", 4, kCaseInsensitive), 0);
    EXPECT_EQ(ConstString("abc").compareAt(3, ""), 0);
    EXPECT_EQ(ConstString("abc").compareAt(3, "c"), -1);
    EXPECT_EQ(ConstString("abc").compareAt(2, ""), 1);
    EXPECT_EQ(ConstString("abc").compareAt(2, "x", 0), 0);
    EXPECT_EQ(ConstString(u"xabc").compareAt(1, "abd", 2), 0);
}

TEST(Comparison, FindsTheFirstDifference)
{
    EXPECT_EQ(ConstString("abc").getFirstDifferent("abc"), -1);
    EXPECT_EQ(ConstString("abc").getFirstDifferent(u"abx"), 2);
    EXPECT_EQ(ConstString("abc").getFirstDifferent("ab"), 2);
    EXPECT_EQ(ConstString(u"").getFirstDifferent(u"x"), 0);
    EXPECT_EQ(ConstString(u"Äb").getFirstDifferent(u"äc", kCaseInsensitive), 1);
}

TEST(Comparison, EqualTextsAreEqualInAnyWidth)
{
    EXPECT_TRUE(ConstString("abc") == ConstString(u"abc"));
    EXPECT_TRUE(String(u"abc") != "abd");
    EXPECT_FALSE(ConstString("a") < ConstString(u"a"));
}

TEST(NaturalComparison, ComparesRunsOfDigitsByValue)
{
    struct Case
    {
        const char* a;
        const char* b;
        bool caseSensitive;
        int expected;
    };
    const Case cases[] = {
        {"Take 9", "Take 10", true, -1}, {"a2b", "a10b", true, -1},   {"a10", "a10", true, 0},
        {"a01", "a1", true, 1},          {"a1", "a001", true, -2},    {"a01b", "a1c", true, 1},
        {"0", "00", true, -1},           {"a", "B", true, 31},        {"a", "B", false, -1},
        {"take 2", "TAKE 2", false, 0},  {"abc", "ab", true, 1},      {"", "1", true, -1},
        {"a123", "a45", true, 1},        {"a12", "a13", true, -1},    {nullptr, "", true, -1},
        {"x", nullptr, true, 1},         {nullptr, nullptr, true, 0}, {"a007x", "a7y", true, 2},
    };
    for (const Case& each : cases)
    {
        EXPECT_EQ(strnatcmp8(each.a, each.b, each.caseSensitive), each.expected) << each.a << " " << each.b;
        const String a = wide(each.a), b = wide(each.b);
        EXPECT_EQ(
            strnatcmp16(each.a ? a.text16() : nullptr, each.b ? b.text16() : nullptr, each.caseSensitive),
            each.expected);
    }
}

TEST(NaturalComparison, WorksAcrossWidths)
{
    EXPECT_LT(ConstString("Spur 9").naturalCompare(u"Spur 10"), 0);
    EXPECT_EQ(ConstString(u"ÄRGER 1").naturalCompare(u"ärger 1", kCaseInsensitive), 0);
    EXPECT_EQ(ConstString("x").naturalCompare(""), 1);
    EXPECT_EQ(ConstString("").naturalCompare(u"x"), -1);
}

TEST(Search, FindsForwardsInEveryPairOfWidths)
{
    const String narrow("one two ONE"), wideText = wide("one two ONE");
    for (const String* text : {&narrow, &wideText})
        for (const ConstString& what : {ConstString("ONE"), ConstString(u"ONE")})
        {
            EXPECT_EQ(text->findNext(0, what), 8);
            EXPECT_EQ(text->findNext(-5, what, kCaseInsensitive), 0);
            EXPECT_EQ(text->findNext(1, what, kCaseInsensitive), 8);
            EXPECT_EQ(text->findNext(9, what), -1);
            EXPECT_EQ(text->findNext(0, what, -1, kCaseSensitive, 7), -1);
            EXPECT_EQ(text->findNext(0, what, -1, kCaseSensitive, 8), 8);
            EXPECT_EQ(text->findNext(99, what), -1);
        }
    EXPECT_EQ(narrow.findNext(0, "tXX", 1), 4) << "only the first character counts";
    EXPECT_EQ(narrow.findNext(0, "t", 0), -1);
    EXPECT_EQ(narrow.findNext(0, ""), -1);
    EXPECT_EQ(ConstString().findNext(0, "x"), -1);
}

TEST(Search, FindsBackwards)
{
    const ConstString text("abcabc");
    EXPECT_EQ(text.findPrev(-1, "abc"), 3);
    EXPECT_EQ(text.findPrev(2, u"abc"), 0);
    EXPECT_EQ(text.findPrev(3, "abc"), 3);
    EXPECT_EQ(text.findPrev(99, "BC", kCaseInsensitive), 4);
    EXPECT_EQ(text.findPrev(-1, "abcabcabc"), -1);
    EXPECT_EQ(text.findPrev(-1, "abX", 2), 3);
}

TEST(Search, FindsSingleCharacters)
{
    const ConstString narrow("a\x8A.b.c"), wideText(u"aä.b.c");
    for (const ConstString& text : {narrow, wideText})
    {
        EXPECT_EQ(text.findNext(0, '.'), 2);
        EXPECT_EQ(text.findNext(3, u'.'), 4);
        EXPECT_EQ(text.findNext(0, u'ä'), 1);
        EXPECT_EQ(text.findNext(0, '\x8A'), 1);
        EXPECT_EQ(text.findNext(0, 'B', kCaseInsensitive), 3);
        EXPECT_EQ(text.findNext(0, '.', kCaseSensitive, 1), -1);
        EXPECT_EQ(text.findPrev(-1, '.'), 4);
        EXPECT_EQ(text.findPrev(3, u'.'), 2);
        EXPECT_EQ(text.countOccurences('.'), 2);
        EXPECT_EQ(text.countOccurences(u'.', 3), 1);
        EXPECT_EQ(text.countOccurences('.', 0x80000000u), 0);
        EXPECT_EQ(text.countOccurences('C', 0, kCaseInsensitive), 1);
    }
}
