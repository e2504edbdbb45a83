#include "containers/match/cmtokens.h"
#include "foundation/object/iptr.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace
{
using Texts = std::vector<std::u16string>;

Texts allOf(const char16* text, const char16* delimiters)
{
    CmTokens tokens(text);
    Texts result;
    for (const char16* token = tokens.next(delimiters); *token; token = tokens.next(delimiters))
        result.push_back(token);
    return result;
}
} // namespace

TEST(CmTokens, TakesATextApart)
{
    EXPECT_EQ(allOf(u"a,,b", u","), (Texts{u"a", u"b"}));
    EXPECT_EQ(allOf(u", one;two ,", u" ,;"), (Texts{u"one", u"two"}));
    EXPECT_EQ(allOf(u",,,", u","), Texts{});
    EXPECT_EQ(allOf(u"a,b", u""), (Texts{u"a,b"}));
    EXPECT_EQ(allOf(nullptr, u","), Texts{});
}

TEST(CmTokens, StaysOnTheDelimiterBehindTheToken)
{
    CmTokens tokens(u"key=some value;rest");
    EXPECT_EQ(std::u16string(tokens.next(u"=")), u"key");
    EXPECT_EQ(tokens.getLastDelimiter(), u'=');
    EXPECT_EQ(tokens.getIndex(), 3);
    EXPECT_EQ(std::u16string(tokens.next(u";")), u"=some value") << "another set of delimiters";
    EXPECT_EQ(tokens.getLastDelimiter(), u';');
    EXPECT_EQ(std::u16string(tokens.next(u";")), u"rest");
    EXPECT_EQ(tokens.getLastDelimiter(), 0);
    EXPECT_EQ(tokens.getIndex(), 19);
    for (int i = 0; i < 2; i++)
        EXPECT_EQ(std::u16string(tokens.next(u";")), u"");
    tokens.reset();
    EXPECT_EQ(std::u16string(tokens.next(u"=")), u"key");
}

TEST(CmTokens, CopiesGoOnWhereTheOriginalStands)
{
    IPtr<CmTokens> copy;
    {
        CmTokens tokens(u"a b c");
        tokens.next(u" ");
        copy = adopt(new CmTokens(tokens));
    }
    EXPECT_EQ(std::u16string(copy->next(u" ")), u"b");
    const CmTokens same(u"a b c"), later(u"b");
    EXPECT_TRUE(copy->isEqual(&same)) << "by the text alone";
    EXPECT_EQ(copy->hash(97), same.hash(97));
    EXPECT_LT(copy->compare(&later), 0);
}
