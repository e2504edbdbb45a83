#include "containers/match/cmregularexpression.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

#include <string>

TEST(CmRegularExpression, MatchesByWildcards)
{
    const struct
    {
        const char16* pattern;
        const char16* text;
        bool matches;
    } rows[] = {
        {u"a?c", u"ac", true},
        {u"a?c", u"abc", true},
        {u"a?c", u"abbc", false},
        {u"??", u"", true},
        {u"a*", u"a", true},
        {u"a*", u"abc", true},
        {u"*", u"", true},
        {u"", u"a", false},
        {u"*.wav", u"take.1.wav", true},
        {u"a*b*c", u"axbxbxc", true},
        {u"a*b*c", u"axcxb", false},
        {u"*?", u"", true},
        {u"?*b", u"aab", true},
        {u"\\*", u"*", true},
        {u"\\*", u"a", false},
        {u"\\?\\\\", u"?\\", true},
        {u"\\*\\**", u"**x", true},
        {u"a\\", u"a\\", true},
        {u"ABC", u"abc", false},
        {u"ABC", nullptr, false},
    };
    for (const auto& row : rows)
        EXPECT_EQ(CmRegularExpression(row.pattern).match(row.text), row.matches)
            << std::string(row.pattern, row.pattern + std::u16string(row.pattern).size());
}

TEST(CmRegularExpression, IgnoresCaseWhereToldTo)
{
    EXPECT_TRUE(CmRegularExpression(u"ABC", false).match(u"abc"));
    EXPECT_FALSE(CmRegularExpression(u"ABC", false).isEqual(adopt(new CmRegularExpression(u"ABC"))));
    EXPECT_TRUE(CmRegularExpression(u"ä?*", false).match(u"Äx"));
    EXPECT_FALSE(CmRegularExpression(u"ä*", true).match(u"Ä"));
}

TEST(CmRegularExpression, TwoStarsMakeItAPlainText)
{
    EXPECT_FALSE(CmRegularExpression::isValidExpression(u"a**b"));
    EXPECT_TRUE(CmRegularExpression::isValidExpression(u"a\\**b"));
    EXPECT_FALSE(CmRegularExpression::isValidExpression(u"a\\\\**b"));
    EXPECT_TRUE(CmRegularExpression::isValidExpression(u"*a*"));
    EXPECT_TRUE(CmRegularExpression(u"a**b").match(u"a**b"));
    EXPECT_FALSE(CmRegularExpression(u"a**b").match(u"ab"));
    EXPECT_TRUE(CmRegularExpression(u"A**b", false).match(u"a**B"));
}

TEST(CmRegularExpression, TriesFromTheMiddleOfThePattern)
{
    const CmRegularExpression pattern(u"ab*c");
    EXPECT_TRUE(pattern.tryString(u"bxc", 1));
    EXPECT_FALSE(pattern.tryString(u"abxc", 1));
    EXPECT_TRUE(pattern.tryString(u"", 4));
    EXPECT_FALSE(pattern.tryString(u"c", 4));
}

TEST(CmRegularExpression, ManyStarsEndSoon)
{
    std::u16string pattern, text(3000, u'a');
    for (int i = 0; i < 200; i++)
        pattern += u"*a?";
    EXPECT_TRUE(CmRegularExpression(pattern.c_str()).match(text.c_str()));
    EXPECT_FALSE(CmRegularExpression((pattern + u"b").c_str()).match(text.c_str()));
}
