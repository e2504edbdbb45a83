#include "storage/xml/fxmltextformat.h"
#include "storage/xml/xmlentities.h"

#include <gtest/gtest.h>

#include <cstring>
#include <iterator>
#include <string>

TEST(XmlEntities, TablesAgreeButForTheBytesOfLatinNames)
{
    for (int i = 0; i < kEntityCount8; i++)
    {
        EXPECT_STREQ(gEntityTable8Mac[i].name, gEntityTable8Win[i].name);
        EXPECT_EQ(gEntityTable8Mac[i].encode, gEntityTable8Win[i].encode);
        EXPECT_EQ(gEntityTable8Mac[i].character, i < 34 ? gEntityTable8Win[i].character : 0) << i;
    }
    EXPECT_STREQ(gEntityTable8Win[34].name, "nbsp");
    EXPECT_STREQ(gEntityTable8Win[129].name, "yuml");
    EXPECT_EQ(gEntityTable8Win[129].character, 0xFF);
}

TEST(XmlEntities, KeepsThePlacesOfTheWindowsTable)
{
    const auto byteOf = [](const char* name)
    { return decodeXmlEntity(name, static_cast<int>(std::string(name).size()), true); };
    EXPECT_EQ(byteOf("not"), 0xAC);
    EXPECT_EQ(byteOf("reg"), 0xAE) << "there is no name for 0xAD";
    EXPECT_EQ(byteOf("frac12"), 0xBD);
    EXPECT_EQ(byteOf("half"), 0xBD);
    EXPECT_EQ(byteOf("iquest"), 0xBF) << "the first of two rows";
    EXPECT_EQ(byteOf("Agrave"), 0xC1);
    EXPECT_EQ(byteOf("Aacute"), 0xC2);
    EXPECT_EQ(byteOf("Acirc"), 0) << "missing";
    EXPECT_EQ(byteOf("Atilde"), 0xC3);
    EXPECT_EQ(byteOf("Auml"), 0xC4);
    EXPECT_EQ(byteOf("divide"), 0xF7);
}

TEST(XmlEntities, NamesTheCharactersOfAsciiInBothTables)
{
    const char* names[] = {"quot",  "amp",    "lt",     "gt",    "bsol",  "apos",   "excl",
                           "num",   "dollar", "percnt", "lpar",  "rpar",  "ast",    "plus",
                           "comma", "hyphen", "period", "sol",   "colon", "semi",   "equals",
                           "quest", "commat", "lsqb",   "rsqb",  "circ",  "horbar", "grave",
                           "lcub",  "verbar", "rcub",   "tilde", "nl",    "cr"};
    const std::string characters = "\"&<>\\'!#$%()*+,-./:;=?@[]^_`{|}~\n\r";
    ASSERT_EQ(characters.size(), std::size(names));
    for (size_t i = 0; i < characters.size(); i++)
        for (const bool windowsTable : {true, false})
            EXPECT_EQ(decodeXmlEntity(names[i], static_cast<int>(strlen(names[i])), windowsTable),
                      characters[i])
                << names[i];
}

TEST(XmlEntities, HasTheFiveNamesInBothWidths)
{
    const std::u16string names[] = {u"amp", u"lt", u"gt", u"apos", u"quot"};
    for (int i = 0; i < kEntityCountUtf8; i++)
    {
        EXPECT_EQ(gEntityTable16[i].name, names[i]);
        EXPECT_EQ(gEntityTable16[i].character, gUTF8EntityTable8[i].character);
        EXPECT_EQ(gEntityTable16[i].encode, names[i] != u"apos");
    }
}

namespace
{
std::string formatted(FXmlTextFormat& format, std::string text)
{
    text.resize(static_cast<size_t>(format.format(text.data(), static_cast<int>(text.size()))));
    return text;
}

std::string formatted(uint32 options, const std::string& text)
{
    FXmlTextFormat format(options);
    return formatted(format, text);
}
} // namespace

TEST(FXmlTextFormat, NormalizesIndentAndLineEnds)
{
    EXPECT_EQ(formatted(0, "  a b\r\n\t c\r\r\n\nd "), "a b\nc\n\n\nd ");
    EXPECT_EQ(formatted(FXmlTextFormat::kJoinLines, "a\r\n  b\nc"), "a b c");
}

TEST(FXmlTextFormat, DecodesShortReferencesOnDemand)
{
    EXPECT_EQ(formatted(0, "&lt;"), "&lt;");
    EXPECT_EQ(formatted(FXmlTextFormat::kDecodeEntities, "a&lt;b&#65;&nosuch;& &#00000000065;"),
              "a<bA&nosuch;& &#00000000065;");
}

TEST(FXmlTextFormat, FollowsATextOverItsPieces)
{
    FXmlTextFormat format(0);
    EXPECT_EQ(formatted(format, "a\r"), "a\n");
    EXPECT_EQ(formatted(format, "\n  b"), "b") << "the line end was cut in two";
    EXPECT_EQ(formatted(format, "  c"), "  c");
    EXPECT_EQ(format.format(nullptr, 0), 0);
    EXPECT_EQ(formatted(format, "  d"), "d") << "a new text";
}
