#include "../../foundation/text/texts.h"

#include <gtest/gtest.h>
#include <random>

namespace
{
/// The wide text of these bytes.
String decoded(const std::string& bytes, unsigned encoding)
{
    String text(bytes.c_str());
    EXPECT_TRUE(text.toWideString(encoding));
    return text;
}

std::string encoded(const char16* text, unsigned encoding)
{
    String copy(text);
    EXPECT_TRUE(copy.toMultiByte(encoding));
    return copy.text8();
}

/// Sets the process's default encoding for one test.
struct DefaultEncoding
{
    explicit DefaultEncoding(unsigned encoding) { setDefaultEncoding(encoding); }
    ~DefaultEncoding() { setDefaultEncoding(kEncodingDefault); }
};
} // namespace

TEST(Encodings, AreFoundByTheirNumbers)
{
    EXPECT_EQ(encoded(u"äÖ€", kEncodingMacRoman), "\x8A\x85\xDB");
    EXPECT_EQ(encoded(u"äÖ€", kEncodingDefault), "\x8A\x85\xDB");
    EXPECT_EQ(encoded(u"äÖ€", kEncodingWindowsLatin1), "\xE4\xD6\x80");
    EXPECT_EQ(encoded(u"ąŁ", kEncodingMacCentralEurope), "\x88\xFC");
    EXPECT_EQ(encoded(u"あｱ漢\\", kEncodingDosJapanese), "\x82\xA0\xB1\x8A\xBF\\");
    EXPECT_EQ(encoded(u"aä", 12345), "a?") << "any other number is ASCII";
    EXPECT_EQ(decoded("a\x8A", 12345), u"a ");
}

TEST(Encodings, EveryByteOfASingleByteEncodingComesBack)
{
    std::string bytes;
    for (int byte = 1; byte < 256; ++byte)
        bytes += static_cast<char>(byte);
    for (const unsigned encoding : {kEncodingMacRoman, kEncodingWindowsLatin1, kEncodingMacCentralEurope})
        EXPECT_EQ(encoded(decoded(bytes, encoding).text16(), encoding), bytes) << encoding;
    const std::string ascii = bytes.substr(0, 127);
    EXPECT_EQ(encoded(decoded(ascii, kEncodingDosJapanese).text16(), kEncodingDosJapanese), ascii)
        << "control characters too";
}

TEST(Encodings, PutALossCharacterForWhatCannotBeConverted)
{
    EXPECT_EQ(encoded(u"a\u00ADb", kEncodingMacRoman), "a?b") << "not even what shows nothing is dropped";
    EXPECT_EQ(encoded(u"\u200B\u3042", kEncodingWindowsLatin1), "??");
    EXPECT_EQ(encoded(u"\U0001F600", kEncodingMacRoman), "??") << "elements count one by one";
    EXPECT_EQ(decoded("a\xFF"
                      "b\x82",
                      kEncodingDosJapanese),
              u"a b ")
        << "no lead byte, and one without its second";
}

TEST(Encodings, TheDefaultFollowsTheProcess)
{
    const DefaultEncoding japanese(kEncodingDosJapanese);
    EXPECT_EQ(encoded(u"あ", kEncodingDefault), "\x82\xA0");
    EXPECT_EQ(ConstString("\x82\xA0x").findNext(0, u'x'), 1) << "two bytes are one character";
    EXPECT_TRUE(ConstString("\x82\xA0") == ConstString(u"あ")) << "equal at different lengths";
    EXPECT_FALSE(ConstString("\x82\xA0") == ConstString(u"あx"));
}

TEST(Utf8, RefusesIllFormedBytesOneByOne)
{
    struct Case
    {
        const char* bytes;
        const char16* text;
    };
    const Case cases[] = {
        {"a\x80z", u"a z"},            // a continuation byte alone
        {"\xC0\xAF", u"  "},           // overlong
        {"\xE0\x80\xAF", u"   "},      // overlong
        {"\xF0\x8F\xBF\xBF", u"    "}, // overlong
        {"\xED\xA0\x80", u"   "},      // half of a surrogate pair
        {"\xF4\x90\x80\x80", u"    "}, // beyond the last character
        {"\xFF\xFE", u"  "},           //
        {"\xE3\x81", u"  "},           // cut
        {"\xE3\x81"
         "a",
         u"  a"},                           // cut by another
        {"\xF0\x9F\x98", u"   "},           // cut
        {"\xE3\x81\x82\xE3", u"あ "},       //
        {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"} // the last character
    };
    for (const Case& each : cases)
        EXPECT_EQ(shape(decoded(each.bytes, kEncodingUtf8)), shape(ConstString(each.text))) << each.bytes;
}

TEST(Utf8, ReplacesSurrogatesThatStandAlone)
{
    const char16 alone[] = {u'a', 0xD800, u'b', 0xDC00, 0xD83D, 0xDE00, 0xD83D, 0};
    EXPECT_EQ(encoded(alone, kEncodingUtf8), "a?b?😀?");
}

TEST(Utf8, RoundTripsMixedTextsOfEveryLength)
{
    std::mt19937 random(4711);
    const char32_t samples[] = {U'a',     U'Z',      U'\x7F',    U'\x80',    U'\x7FF',
                                U'\x800', U'\xFFFD', U'\x10000', U'\x10FFFF'};
    for (int round = 0; round < 2000; ++round)
    {
        std::u16string text;
        while (text.size() < static_cast<std::size_t>(round % 70))
        {
            const char32_t character = samples[random() % (random() % 4 == 0 ? std::size(samples) : 2)];
            if (character >= 0x10000)
                text += static_cast<char16>(0xD7C0 + (character >> 10));
            text += static_cast<char16>(character < 0x10000 ? character : 0xDC00 + (character & 0x3FF));
        }
        String copy(text.c_str());
        ASSERT_TRUE(copy.toMultiByte(kEncodingUtf8));
        ASSERT_TRUE(copy.toWideString(kEncodingUtf8));
        ASSERT_EQ(copy, text.c_str());
    }
}
