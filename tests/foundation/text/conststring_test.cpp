#include "foundation/object/fvariant.h"
#include "foundation/text/stringobject.h"
#include "texts.h"

#include <gtest/gtest.h>

namespace
{
/// Takes 8-bit text only.
struct NarrowResult : IStringResult
{
    int32 queryInterface(const char*, void** object) override
    {
        *object = nullptr;
        return kNoInterface;
    }
    uint32 addRef() override { return 1; }
    uint32 release() override { return 1; }
    void setText(const char* given) override { text = given; }

    std::string text;
};
} // namespace

TEST(ConstString, ViewsWhatItIsMadeOf)
{
    EXPECT_EQ(shape(ConstString()), "narrow:");
    EXPECT_EQ(shape(ConstString("text")), "narrow:text");
    EXPECT_EQ(shape(ConstString(u"text")), "wide:text");
    EXPECT_EQ(shape(ConstString(ConstString("offset"), 3)), "narrow:set");
    EXPECT_EQ(shape(ConstString(ConstString(u"offset"), 3)), "wide:set");
    EXPECT_EQ(shape(ConstString(ConstString("offset"), -1)), "narrow:offset");
    EXPECT_EQ(shape(ConstString(ConstString("offset"), 7)), "narrow:");

    const char* text = "no copy";
    EXPECT_EQ(ConstString(text).text8(), text);
}

TEST(ConstString, TakesTheTextOfAVariant)
{
    EXPECT_EQ(shape(ConstString(FVariant("eight"))), "narrow:eight");
    EXPECT_EQ(shape(ConstString(FVariant(u"sixteen"))), "wide:sixteen");
    EXPECT_EQ(shape(ConstString(FVariant(7))), "narrow:");

    FVariant variant;
    const ConstString text(u"borrowed");
    text.toVariant(variant);
    EXPECT_EQ(variant.getString16(), text.text16());
    EXPECT_FALSE(variant.isOwner());
}

TEST(ConstString, GivesNothingOfTheOtherWidthOrOutOfRange)
{
    const ConstString narrow("ab"), wideText(u"ab");
    EXPECT_STREQ(wideText.text8(), "");
    EXPECT_EQ(narrow.text16(), kEmptyString16);
    EXPECT_EQ(ConstString(static_cast<const char16*>(nullptr)).text16(), kEmptyString16);
    EXPECT_EQ(narrow.getChar8(1), 'b');
    EXPECT_EQ(narrow.getChar8(2), 0);
    EXPECT_EQ(narrow.getChar16(1), 0);
    EXPECT_EQ(wideText.getChar16(1), u'b');
    EXPECT_EQ(wideText.getChar8(1), 0);
}

TEST(ConstString, TestsCharactersAcrossWidths)
{
    // 0x8A is "ä" in the default encoding.
    const ConstString narrow("x\x8A"), wideText(u"xä");
    EXPECT_TRUE(narrow.testChar8(1, '\x8A'));
    EXPECT_TRUE(narrow.testChar16(1, u'ä'));
    EXPECT_TRUE(wideText.testChar8(1, '\x8A'));
    EXPECT_FALSE(wideText.testChar8(0, '\x8A'));
    EXPECT_TRUE(narrow.testChar8(2, 0)) << "behind the end stands a zero character";
    EXPECT_FALSE(narrow.testChar16(9, u'x'));
}

TEST(ConstString, FindsTheNumberAtTheEnd)
{
    EXPECT_EQ(ConstString("Take 12").getTrailingNumberIndex(), 5);
    EXPECT_EQ(ConstString(u"2024").getTrailingNumberIndex(), 0);
    EXPECT_EQ(ConstString("12 Takes").getTrailingNumberIndex(), -1);
    EXPECT_EQ(ConstString("Take 12").getTrailingNumberIndex(2), 5);
    EXPECT_EQ(ConstString("Take 12").getTrailingNumberIndex(3), -1);
    EXPECT_EQ(ConstString("Take 12").getTrailingNumberIndex(1), -1);
    EXPECT_FALSE(ConstString(u"\u0663").isDigit(0)) << "only the first 256 characters can be digits";
}

TEST(ConstString, KnowsAsciiAndTheComposedForm)
{
    const std::string longAscii(1000, 'a');
    EXPECT_TRUE(ConstString(longAscii.c_str()).isAsciiString());
    EXPECT_FALSE(ConstString((longAscii + "\x80").c_str()).isAsciiString());
    EXPECT_FALSE(ConstString(("\x80" + longAscii).c_str()).isAsciiString());
    EXPECT_FALSE(ConstString(u"a\u0100").isAsciiString());

    EXPECT_TRUE(ConstString(u"\u00E4").isNormalized(kUnicodeNormC));
    EXPECT_FALSE(ConstString(u"a\u0308").isNormalized(kUnicodeNormC));
    EXPECT_FALSE(ConstString(u"abc").isNormalized(kUnicodeNormD)) << "known of form C only";
    EXPECT_FALSE(ConstString("abc").isNormalized(kUnicodeNormC));
}

TEST(ConstString, Extracts)
{
    String part(u"before");
    EXPECT_TRUE(ConstString("abcdef").extract(part, 2, 3));
    EXPECT_EQ(shape(part), "narrow:cde");
    EXPECT_TRUE(ConstString(u"abcdef").extract(part, 4));
    EXPECT_EQ(shape(part), "wide:ef");
    EXPECT_TRUE(ConstString("abc").extract(part, 1, 99));
    EXPECT_EQ(shape(part), "narrow:bc");
    EXPECT_FALSE(ConstString("abc").extract(part, 3));
    EXPECT_EQ(shape(part), "narrow:bc");

    String itself("abcdef");
    EXPECT_TRUE(itself.extract(itself, 1, 4));
    EXPECT_EQ(shape(itself), "narrow:bcde");
    EXPECT_TRUE(itself.extract(itself, 0, 2));
    EXPECT_EQ(shape(itself), "narrow:bc");
    EXPECT_TRUE(itself.extract(itself, 1, 0));
    EXPECT_EQ(shape(itself), "narrow:");
}

TEST(ConstString, CopiesIntoBuffersOfEitherWidth)
{
    char narrow[16];
    char16 wideBuffer[16];
    EXPECT_EQ(ConstString(u"aäb").copyTo8(narrow, 1, 1), 1);
    EXPECT_STREQ(narrow, "\x8A");
    EXPECT_EQ(ConstString("a\x8A").copyTo16(wideBuffer), 2);
    EXPECT_EQ(ConstString(wideBuffer), ConstString(u"aä"));
    EXPECT_EQ(ConstString("abc").copyTo(narrow, 1), 2);
    EXPECT_STREQ(narrow, "bc");
    EXPECT_EQ(ConstString("abc").copyTo8(narrow, 3), 0);
    EXPECT_STREQ(narrow, "");
    EXPECT_EQ(ConstString(u"abc").copyTo16(wideBuffer, 5, 2), 0);
    EXPECT_EQ(wideBuffer[0], 0);
}

TEST(ConstString, HandsItsTextOverInItsWidth)
{
    StringObject target;
    ConstString(u"wide").copyTo(static_cast<IString&>(target));
    EXPECT_EQ(shape(target), "wide:wide");
    ConstString("narrow").copyTo(static_cast<IString&>(target));
    EXPECT_EQ(shape(target), "narrow:narrow");
    ConstString(u"result").copyTo(static_cast<IStringResult*>(&target));
    EXPECT_EQ(shape(target), "wide:result");
    EXPECT_EQ(target.getRefCount(), 1u);

    NarrowResult narrowOnly;
    const String source(u"a\u00E4");
    source.copyTo(&narrowOnly);
    EXPECT_EQ(narrowOnly.text, "a\x8A");
    EXPECT_TRUE(source.isWideString()) << "handing over must not convert";
}

TEST(ConstString, SortsCharactersIntoClasses)
{
    for (const char16 space : u"\x20\xA0\u2002\u200B\u202F\u205F\u3000")
        EXPECT_EQ(ConstString::isCharSpace(space), space != 0) << int{space};
    for (const char16 other : u"\t\n\u2001\u200C\u3001")
        EXPECT_FALSE(ConstString::isCharSpace(other)) << int{other};
    EXPECT_TRUE(ConstString::isCharSpace('\t'));
    EXPECT_FALSE(ConstString::isCharSpace('\xA0'));

    EXPECT_TRUE(ConstString::isCharAlpha(u'ß'));
    EXPECT_FALSE(ConstString::isCharAlpha('\x8A')) << "8-bit letters are those of the plain locale";
    EXPECT_TRUE(ConstString::isCharAlphaNum(u'7'));
    EXPECT_TRUE(ConstString::isCharUpper(u'Ä'));
    EXPECT_FALSE(ConstString::isCharLower(u'Ä'));
    EXPECT_TRUE(ConstString::isCharLower('z'));
    EXPECT_FALSE(ConstString::isCharAscii(u'\x80'));
}

TEST(ConstString, MapsTheCaseOfOneCharacter)
{
    EXPECT_EQ(ConstString::toUpper(u'ä'), u'Ä');
    EXPECT_EQ(ConstString::toLower(u'Σ'), u'σ');
    EXPECT_EQ(ConstString::toUpper(u'ß'), u'ß') << "its capital form has two characters";
    EXPECT_EQ(ConstString::toUpper(u'\xD800'), u'\xD800');
    EXPECT_EQ(ConstString::toUpper('z'), 'Z');
    EXPECT_EQ(ConstString::toLower('\x80'), '\x80');
}
