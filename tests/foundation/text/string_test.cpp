#include "foundation/object/fvariant.h"
#include "texts.h"

#include <gtest/gtest.h>

TEST(String, StartsWideAndTakesTheWidthOfItsFirstText)
{
    String text;
    EXPECT_TRUE(text.isWideString());
    EXPECT_EQ(shape(String(text).append("x")), "narrow:x");
    EXPECT_EQ(shape(String("").append(u"x")), "wide:x");
    EXPECT_EQ(shape(text.assign("x")), "narrow:x");
    EXPECT_EQ(shape(text.assign(u"")), "wide:");
}

TEST(String, AssignsWholeAndPartTexts)
{
    String text;
    EXPECT_EQ(shape(text.assign("abcdef", 3)), "narrow:abc");
    EXPECT_EQ(shape(text.assign(u"abc", 99)), "wide:abc") << "the terminator limits the count";
    const char unterminated[] = {'x', 'y', 'z'};
    EXPECT_EQ(shape(text.assign(unterminated, 3, false)), "narrow:xyz");
    EXPECT_EQ(shape(text.assign("new", -1, false)), "narrow:xyz")
        << "without an end there is nothing to take";
    EXPECT_EQ(shape(text.assign('-', 3)), "narrow:---");
    EXPECT_EQ(shape(text.assign(u'-', 2)), "wide:--");
    EXPECT_EQ(shape(text.assign(ConstString("abc"), 2)), "narrow:ab");
    EXPECT_EQ(shape(text.assign(static_cast<const char16*>(nullptr))), "wide:");
}

TEST(String, IsFilledAgainInItsBlock)
{
    String text(u"wide");
    EXPECT_EQ(shape(text.refill("abcdefghijklmnopqrstuvwxyz!", 26)), "narrow:abcdefghijklmnopqrstuvwxyz");
    const void* block = text.text();
    EXPECT_EQ(shape(text.refill("abc", 2)), "narrow:ab");
    EXPECT_EQ(shape(text.refill("ABCDEFGHIJKLMNOPQRSTUVWXYZ", 26)), "narrow:ABCDEFGHIJKLMNOPQRSTUVWXYZ");
    EXPECT_EQ(text.text(), block);
    EXPECT_EQ(shape(text.append("+")), "narrow:ABCDEFGHIJKLMNOPQRSTUVWXYZ+");
    EXPECT_EQ(shape(text.refill("", 0)), "narrow:");
    EXPECT_EQ(text.text(), nullptr);
}

TEST(String, SurvivesBeingItsOwnSource)
{
    String text("abcdef");
    text.assign(text.text8(), 2);
    EXPECT_EQ(shape(text), "narrow:abcdef") << "its own buffer is nothing new";
    text.assign(text.text8() + 2);
    EXPECT_EQ(shape(text), "narrow:cdef");
    text.append(text);
    EXPECT_EQ(shape(text), "narrow:cdefcdef");
    text.insertAt(1, text.text8() + 6, 2);
    EXPECT_EQ(shape(text), "narrow:cefdefcdef");
    text.replace(0, 3, text);
    EXPECT_EQ(shape(text), "narrow:cefdefcdefdefcdef");
    const String& itself = text;
    text = itself;
    EXPECT_EQ(text.length(), 17u);
}

TEST(String, OnlyGrowsWideByMixing)
{
    String text("ab");
    EXPECT_EQ(shape(text.append("c")), "narrow:abc");
    EXPECT_EQ(shape(text.append(u"ä")), "wide:abcä");
    EXPECT_EQ(shape(text.append("\x8A!")), "wide:abcää!") << "bytes are widened by the default encoding";
    EXPECT_EQ(shape(text.append('\x8A', 2)), "wide:abcää!ää");
    EXPECT_EQ(shape(String("a").append(u'b', 3)), "wide:abbb");
    EXPECT_EQ(shape(String("ab").append("cdef", 2)), "narrow:abcd");
    EXPECT_EQ(shape(String("ab").append(static_cast<const char*>(nullptr))), "narrow:ab");
    String own("abc");
    EXPECT_EQ(shape(own.append(own.text8() + 1).append(own.text8() + 3, 1)), "narrow:abcbcb");
}

TEST(String, InsertsAndReplaces)
{
    EXPECT_EQ(shape(String("ad").insertAt(1, "bcX", 2)), "narrow:abcd");
    EXPECT_EQ(shape(String("ad").insertAt(1, u"b")), "wide:abd");
    EXPECT_EQ(shape(String("ad").insertAt(2, 'e')), "narrow:ade");
    EXPECT_EQ(shape(String("ad").insertAt(3, "x")), "narrow:ad");

    EXPECT_EQ(shape(String("abcdef").replace(1, 2, "XYZ")), "narrow:aXYZdef");
    EXPECT_EQ(shape(String("abcdef").replace(1, 4, "X")), "narrow:aXf");
    EXPECT_EQ(shape(String("abcdef").replace(4, -1, "XYZ", 2)), "narrow:abcdXY");
    EXPECT_EQ(shape(String("abcdef").replace(4, 99, "")), "narrow:abcd");
    EXPECT_EQ(shape(String("abc").replace(1, 1, u"ä")), "wide:aäc");
    EXPECT_EQ(shape(String(u"abc").replace(1, 1, "\x8A")), "wide:aäc");
    EXPECT_EQ(shape(String("abc").replace(1, 0, "X")), "narrow:abc");
    EXPECT_EQ(shape(String("abc").replace(4, 1, "X")), "narrow:abc");
    EXPECT_EQ(shape(String("abc").replace(3, 1, "X")), "narrow:abcX");
    EXPECT_EQ(shape(String("abc").replace(0, 1, static_cast<const char*>(nullptr))), "narrow:abc");
    String shorter("abcdef");
    shorter.replace(0, 5, "x").append("yz").insertAt(0, "12345678");
    EXPECT_EQ(shape(shorter), "narrow:12345678xfyz");
}

TEST(String, ReplacesOccurrences)
{
    String text("aXbXc");
    EXPECT_EQ(text.replace("X", "X--", true), 2);
    EXPECT_EQ(shape(text), "narrow:aX--bX--c") << "what was put in is not searched again";
    EXPECT_EQ(text.replace("--", "", false), 1);
    EXPECT_EQ(shape(text), "narrow:aXbX--c");
    EXPECT_EQ(text.replace("q", "r", true), 0);
    EXPECT_EQ(text.replace(static_cast<const char*>(nullptr), "r", true), 0);
    EXPECT_EQ(text.replace("", "r", true), 0);
    EXPECT_EQ(text.replace(u"X", u"ä", true), 2);
    EXPECT_EQ(shape(text), "wide:aäbä--c");
    EXPECT_EQ(text.replace("\x8A", "ae", true), 2);
    EXPECT_EQ(shape(text), "wide:aaebae--c");
    String all("aaaa");
    EXPECT_EQ(all.replace("aa", "", true), 2);
    EXPECT_TRUE(all.isEmpty());
}

TEST(String, RemovesTextsAndCharacters)
{
    EXPECT_EQ(shape(String("abcdef").remove(1, 2)), "narrow:adef");
    EXPECT_EQ(shape(String(u"abcdef").remove(3)), "wide:abc");
    EXPECT_EQ(shape(String("abc").remove(3)), "narrow:abc");
    EXPECT_EQ(shape(String("abc").remove(0, 0)), "narrow:abc");
    EXPECT_EQ(shape(String("abc").remove()), "narrow:");

    String text("a-b--c");
    EXPECT_TRUE(text.removeSubString(u"--"));
    EXPECT_TRUE(text.removeSubString("-"));
    EXPECT_FALSE(text.removeSubString("-"));
    EXPECT_EQ(text, "abc");

    String marks("a1 b2\t");
    EXPECT_TRUE(marks.removeChars(kGroupSpace));
    EXPECT_EQ(shape(marks), "narrow:a1b2");
    EXPECT_TRUE(marks.removeChars(kGroupNotAlpha));
    EXPECT_EQ(shape(marks), "narrow:ab");
    String lines(u"a\tb\n c");
    EXPECT_TRUE(lines.removeChars(kGroupSpace)) << "here a 16-bit tab counts as space";
    EXPECT_EQ(shape(lines), "wide:abc");

    String sets(u"aäb.c");
    EXPECT_TRUE(sets.removeChars8("\x8A."));
    EXPECT_TRUE(sets.replaceChars16(u"bc", u'ö'));
    EXPECT_EQ(shape(sets), "wide:aöö");
    EXPECT_FALSE(sets.replaceChars8("xyz", '-'));
    String zero("ab/cd");
    EXPECT_TRUE(zero.replaceChars8("/", 0));
    EXPECT_EQ(zero.length(), 2u);
}

TEST(String, TrimsByGroup)
{
    String marks("--a-b--");
    EXPECT_TRUE(marks.trim(kGroupNotAlphaNum));
    EXPECT_EQ(shape(marks), "narrow:a-b");
    EXPECT_FALSE(marks.trim(kGroupNotAlphaNum));
    String blanks(u" \t\r\nx y\n");
    EXPECT_TRUE(blanks.trim());
    EXPECT_EQ(shape(blanks), "wide:x y");
    String none("   ");
    EXPECT_TRUE(none.trim());
    EXPECT_TRUE(none.isEmpty());
    String digits("12ab34");
    EXPECT_TRUE(digits.trim(kGroupNotAlpha));
    EXPECT_EQ(shape(digits), "narrow:ab");
}

TEST(String, SetsCharactersAndGrows)
{
    String text("ab");
    EXPECT_TRUE(text.setChar8(5, 'x'));
    EXPECT_EQ(shape(text), "narrow:ab   x");
    EXPECT_TRUE(text.setChar8(1, 0));
    EXPECT_EQ(shape(text), "narrow:a");
    EXPECT_TRUE(text.setChar16(1, u'ä'));
    EXPECT_EQ(shape(text), "wide:aä");
    EXPECT_TRUE(text.setChar8(2, '\x8A'));
    EXPECT_EQ(shape(text), "wide:aää");
    EXPECT_FALSE(text.setChar8(0x7FFFFFFF, 'x'));
    EXPECT_EQ(shape(text), "wide:aää");
}

TEST(String, ResizesWithoutTouchingTheLength)
{
    String text("ab");
    ASSERT_TRUE(text.resize(6, false, true));
    EXPECT_EQ(text.length(), 2u);
    text.updateLength();
    EXPECT_EQ(shape(text), "narrow:ab    ");
    EXPECT_FALSE(text.resize(0x40000000, false));
    EXPECT_EQ(shape(text), "narrow:ab    ");
    EXPECT_TRUE(text.resize(0, true));
    EXPECT_EQ(shape(text), "wide:");
}

TEST(String, ConvertsInPlaceWhenRead)
{
    const String text(u"aä\u3042");
    EXPECT_STREQ(text.text8(), "a\x8A?") << "what the default encoding lacks is lost";
    EXPECT_FALSE(text.isWideString());
    EXPECT_EQ(ConstString(text.text16()), ConstString(u"aä?"));
    EXPECT_TRUE(text.isWideString());
    EXPECT_EQ(text.getChar8(1), '\x8A');
    EXPECT_FALSE(text.isWideString());
    EXPECT_EQ(text.getChar16(1), u'ä');
    EXPECT_TRUE(text.isWideString());
}

TEST(String, ConvertsBetweenEncodings)
{
    String text("a\x8A");
    EXPECT_TRUE(text.toMultiByte(kEncodingUtf8));
    EXPECT_STREQ(text.text8(), "aä") << "a narrow text is taken as one of the default encoding";
    EXPECT_TRUE(text.toWideString(kEncodingUtf8));
    EXPECT_EQ(shape(text), "wide:aä");
    EXPECT_TRUE(text.toMultiByte(kEncodingWindowsLatin1));
    EXPECT_STREQ(text.text8(), "a\xE4");
    String empty("");
    EXPECT_TRUE(empty.toWideString());
    EXPECT_TRUE(empty.isWideString());
    EXPECT_TRUE(empty.toMultiByte(kEncodingUtf8));
    EXPECT_FALSE(empty.isWideString());
}

TEST(String, ConvertsLongTextsToUtf8)
{
    // Blocks are converted at once, so a character that isn't plain may stand anywhere in one.
    for (const unsigned length : {1u, 15u, 16u, 17u, 127u, 128u, 129u, 300u, 400u})
        for (unsigned place = 0; place < length; place++)
        {
            std::u16string wide(length, u'x');
            wide[place] = u'\u3042';
            std::string expected(length, 'x');
            expected.replace(place, 1, "\u3042");
            String text(wide.c_str());
            EXPECT_TRUE(text.toMultiByte(kEncodingUtf8));
            ASSERT_EQ(text.text8(), expected) << length << ", " << place;
        }
    String plain(std::u16string(1000, u'x').c_str());
    EXPECT_TRUE(plain.toMultiByte(kEncodingUtf8));
    EXPECT_EQ(plain.text8(), std::string(1000, 'x'));
}

TEST(String, GrowsByOneCharacterAtATime)
{
    String narrow, wide, mixed("a");
    std::string expected;
    std::u16string expectedWide;
    for (char character = 'a'; character <= 'z'; character++)
    {
        narrow.append(character).append('\0');
        wide.append(static_cast<char16>(character)).append(u'\0');
        if (character > 'a')
            mixed.append(static_cast<char16>(character)).append('\x8A');
        expected += character;
        expectedWide += static_cast<char16>(character);
        ASSERT_EQ(shape(narrow), "narrow:" + expected) << "a zero adds nothing";
        ASSERT_EQ(wide.text16(), expectedWide);
    }
    EXPECT_EQ(mixed.length(), 51u);
    EXPECT_EQ(mixed.getChar16(1), u'b');
    EXPECT_EQ(mixed.getChar16(50), u'\u00e4') << "bytes are widened by the default encoding";
}

TEST(String, ConvertsPairsAndHalvesOfThemAtEveryPlace)
{
    const std::pair<std::u16string, std::string> pieces[] = {{u"\u00e9", "\u00e9"},
                                                             {u"\U0001D11E", "\U0001D11E"},
                                                             {u"\xD800", "?"},
                                                             {u"\xDC00\u20ac", "?\u20ac"},
                                                             {u"\xDBFF\xD834\xDD1E", "?\U0001D11E"}};
    for (const auto& [wide, bytes] : pieces)
        for (unsigned before = 0; before <= 40; before++)
            for (unsigned behind = 0; behind <= 40; behind++)
            {
                const std::u16string source =
                    std::u16string(before, u'a') + wide + std::u16string(behind, u'b');
                String text(source.c_str());
                EXPECT_TRUE(text.toMultiByte(kEncodingUtf8));
                ASSERT_EQ(text.text8(), std::string(before, 'a') + bytes + std::string(behind, 'b'))
                    << before << ", " << behind;
            }
}

TEST(String, ChangesCaseAndForm)
{
    String narrow("aB\x8A");
    narrow.toUpper();
    EXPECT_STREQ(narrow.text8(), "AB\x8A");
    String wideText(u"straße ÄÖ");
    wideText.toUpper();
    EXPECT_EQ(shape(wideText), "wide:STRAßE ÄÖ");
    wideText.toLower(7u);
    wideText.toLower(99u);
    EXPECT_EQ(shape(wideText), "wide:STRAßE äÖ");

    String composed(u"a\u0308\uFB01");
    EXPECT_TRUE(composed.normalize(kUnicodeNormC));
    EXPECT_EQ(composed, u"\u00E4\uFB01");
    EXPECT_TRUE(composed.normalize(kUnicodeNormKD));
    EXPECT_EQ(composed, u"a\u0308fi");
    EXPECT_TRUE(composed.normalize(kUnicodeNormKC));
    EXPECT_TRUE(composed.normalize(kUnicodeNormD));
    EXPECT_EQ(composed, u"a\u0308fi");
    EXPECT_FALSE(narrow.normalize(kUnicodeNormC));
    EXPECT_TRUE(String().normalize(kUnicodeNormC));
}

TEST(String, HandsItsBufferOver)
{
    String from(u"text"), to("old");
    const void* buffer = from.text();
    to.take(from);
    EXPECT_EQ(to.text(), buffer);
    EXPECT_EQ(shape(to), "wide:text");
    EXPECT_TRUE(from.isEmpty());

    from.swapContent(to);
    EXPECT_EQ(shape(from), "wide:text");
    void* given = from.pass();
    EXPECT_EQ(given, buffer);
    EXPECT_TRUE(from.isEmpty());
    to.take(given, true);
    EXPECT_EQ(to.length(), 4u);
    to.take(to);
    EXPECT_EQ(shape(to), "wide:text");

    const String moved(std::move(to));
    EXPECT_EQ(moved.text(), buffer);
}

TEST(String, LeavesTheReservedBitAsItWas)
{
    struct Marked : String
    {
        Marked() { reserved = 1; }
        bool isMarked() const { return reserved != 0; }
    };
    Marked text;
    String other(u"other");
    text.assign("narrow").append(u"wide").toMultiByte(kEncodingUtf8);
    text.swapContent(other);
    text.take(other);
    static_cast<String&>(text) = String("moved");
    text.printf(u"%d", 1).resize(0, false);
    free(text.pass());
    EXPECT_TRUE(text.isMarked());
    EXPECT_EQ(shape(other), "narrow:");

    struct MarkedView : ConstString
    {
        MarkedView() { reserved = 1; }
        bool isMarked() const { return reserved != 0; }
    };
    MarkedView view;
    static_cast<ConstString&>(view) = ConstString(u"view");
    EXPECT_TRUE(view.isMarked());
}

TEST(String, ComesFromAndGoesIntoVariants)
{
    String text;
    EXPECT_TRUE(text.fromVariant(FVariant(-42)));
    EXPECT_EQ(text, "-42");
    EXPECT_TRUE(text.fromVariant(FVariant(2.5)));
    EXPECT_EQ(text, "2.5");
    EXPECT_TRUE(text.fromVariant(FVariant(u"wide")));
    EXPECT_EQ(shape(text), "wide:wide");
    EXPECT_FALSE(text.fromVariant(FVariant()));
    EXPECT_TRUE(text.isEmpty());

    FVariant variant;
    text.assign("passed");
    const void* buffer = text.text();
    text.passToVariant(variant);
    EXPECT_EQ(variant.getString8(), buffer);
    EXPECT_TRUE(variant.isOwner());
    EXPECT_TRUE(text.isEmpty());
    text.passToVariant(variant);
    EXPECT_FALSE(variant.isOwner()) << "the empty text belongs to nobody";
}

TEST(String, SpeaksPascal)
{
    unsigned char pascal[256];
    String(u"aä").toPascalString(pascal);
    EXPECT_EQ(pascal[0], 2);
    EXPECT_EQ(pascal[2], 0x8A);
    EXPECT_EQ(shape(String().fromPascalString(pascal)), "narrow:aä");
    String longText;
    longText.assign('x', 300).toPascalString(pascal);
    EXPECT_EQ(pascal[0], 255);
    EXPECT_EQ(pascal[255], 'x');
    EXPECT_EQ(longText.fromPascalString(pascal).length(), 255u);
}
