#include "containers/match/fstringmatcher.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace
{
using Infos = StringMatchInfos;

class Description : public FObject, public IObjectDescription
{
    DECLARE_TYPE(Description, FObject)
    FORWARD_FUNKNOWN(FObject)

    explicit Description(const char16* itsText) : text(itsText) { alive++; }
    ~Description() override { alive--; }
    const char16* getDescription() override { return text; }
    int32 queryInterface(const char* interfaceID, void** object) override
    {
        return FObject::queryInterface(interfaceID, object);
    }

    inline static int alive = 0;

private:
    const char16* text;
};

class Descriptions : public FObject, public IObjectDescriptionList
{
    DECLARE_TYPE(Descriptions, FObject)
    FORWARD_FUNKNOWN(FObject)

    explicit Descriptions(std::initializer_list<const char16*> texts)
    {
        for (const char16* text : texts)
            items.push_back(text ? adopt(new Description(text)) : nullptr);
    }
    int countItems() override { return static_cast<int>(items.size()); }
    IObjectDescription* getObjectDescription(int index) override { return items[static_cast<size_t>(index)]; }
    int32 queryInterface(const char* interfaceID, void** object) override
    {
        return FObject::queryInterface(interfaceID, object);
    }

private:
    std::vector<IPtr<Description>> items;
};

/// The bits as a row of characters: "..xx".
std::string bitsOf(const BitSet& bits)
{
    std::string row;
    for (unsigned i = 0; i < bits.getSize(); i++)
        row += bits.getBit(i) ? 'x' : '.';
    return row;
}

/// "kind distance bits", or "none".
std::string match(const char16* pattern, const char16* candidate)
{
    FStringMatcher matcher(pattern);
    Infos infos;
    const bool isFound = matcher.isMatch(candidate, &infos);
    EXPECT_EQ(matcher.isMatch(candidate, nullptr), isFound);
    if (!isFound)
        return "none";
    return std::to_string(infos.kind) + " " + std::to_string(infos.distance) + " " +
           bitsOf(infos.matchedCharacters);
}
} // namespace

TEST(FStringMatcher, TellsHowACandidateMatches)
{
    EXPECT_EQ(match(u"tune", u"Tune"), "0 0 xxxx");
    EXPECT_EQ(match(u"tune", u"My Tune Copy"), "1 0 ...xxxx.....");
    EXPECT_EQ(match(u"ÄRA", u"Ära"), "0 0 xxx");
    EXPECT_EQ(match(u"tune", u"ton"), "none");
    EXPECT_EQ(match(u"tune", u"TONE"), "2 1 x.xx");
    EXPECT_EQ(match(u"tune", u"tne"), "2 1 xxx");
    EXPECT_EQ(match(u"tune", u"tunge"), "2 1 xxx.x");
    EXPECT_EQ(match(u"reverb", u"revreb"), "2 2 xxx.xx") << "two letters that changed places";
    EXPECT_EQ(match(u"reverb", u"reaverp"), "2 2 xx.xxx.");
    EXPECT_EQ(match(u"tune", u""), "none");
    EXPECT_EQ(match(u"tune", nullptr), "none");
    EXPECT_EQ(match(u"", u"any"), "1 0 ...");
    EXPECT_EQ(match(u"", u""), "none");
    Infos infos;
    infos.kind = 7;
    EXPECT_FALSE(FStringMatcher(u"tune").isMatch(u"other", &infos));
    EXPECT_EQ(infos.kind, 7) << "left alone by a miss";
}

TEST(FStringMatcher, ForgivesAThirdOfTheSearchTextAndAlwaysOneCharacter)
{
    EXPECT_EQ(match(u"abcde", u"abcdx"), "2 1 xxxx.");
    EXPECT_EQ(match(u"abcde", u"abcxy"), "none") << "a third of five is one";
    EXPECT_EQ(match(u"abcdef", u"abcdxy"), "2 2 xxxx..");
    EXPECT_EQ(match(u"abcdef", u"abcxyz"), "none");
    EXPECT_EQ(match(u"ab", u"xb"), "2 1 .x");
    EXPECT_EQ(match(u"abcdef", u"abcdxefyz"), "none") << "too long already";
}

TEST(FStringMatcher, FiltersTheBestFirst)
{
    {
        FStringMatcher matcher("attack");
        Descriptions candidates{u"atakc",       u"Release", nullptr,  u"Attick",
                                u"Attack Time", u"attakc",  u"Attack"};
        auto view = adopt(askInterface<IStringMatcher>(static_cast<IStringMatcher*>(&matcher)));
        auto found = adopt(view->filterCandidates(&candidates));
        std::vector<std::u16string> texts;
        for (int i = 0; i < found->countItems(); i++)
            texts.push_back(found->getObjectDescription(i)->getDescription());
        EXPECT_EQ(texts, (std::vector<std::u16string>{u"Attack Time", u"Attack", u"Attick", u"attakc"}));
        EXPECT_EQ(found->getMatchInfos(2)->distance, 1);
        EXPECT_EQ(found->getMatchInfos(4), nullptr);
        EXPECT_EQ(found->getObjectDescription(-1), nullptr);
        EXPECT_EQ(adopt(matcher.filterCandidates(nullptr))->countItems(), 0);
    }
    EXPECT_EQ(Description::alive, 0) << "the list gives back what it holds";
}

TEST(FStringMatcher, LooksForLongTextsWithoutSimilarity)
{
    const std::u16string pattern(FStringMatcher::kMaxSimilarLength + 1, u'a');
    EXPECT_EQ(match(pattern.c_str(), (pattern.substr(1) + u"b").c_str()), "none");
    EXPECT_EQ(match(pattern.c_str(), (u"b" + pattern).c_str()).substr(0, 5), "1 0 .");
}
