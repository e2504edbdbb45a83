#include "xmltestsupport.h"

#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

TEST(FXmlParser, TellsElementsAttributesAndText)
{
    EXPECT_EQ(told("<?xml version=\"1.0\"?>\r\n<a>\n\t<b c=\"1\" d = '2'/>\n</a>\n"),
              "<a><b c='1' d='2'/></a>");
    EXPECT_EQ(told("<a>some text</a>"), "<a>[some text]</a>");
    EXPECT_EQ(told("<a\n b='1'\r\n\tc='x \"y\"' ><d /></a >"), "<a b='1' c='x \"y\"'><d/>!1")
        << "no blank in an end tag";
    EXPECT_EQ(told("<a/><b></b>"), "<a/><b></b>") << "a sequence of elements";
    EXPECT_EQ(told(""), "");
}

// Data ends only at what may be the end of the innermost element, and only its beginning is compared.
TEST(FXmlParser, TakesTagsBehindTextForText)
{
    EXPECT_EQ(told("<a>x<b/>y</a>"), "<a>[x<b/>y]</a>");
    EXPECT_EQ(told("<a>x<!-- c --></b></a>"), "<a>[x<!-- c --></b>]</a>");
    EXPECT_EQ(told("<a>x</ab>"), "<a>[x]</a>");
    EXPECT_EQ(told("<a><b/>x</a>"), "<a><b/>[x]</a>");
    EXPECT_EQ(told("x<a/>", 0, false), "[x]<a/>") << "outside of all any '<' ends it";
}

TEST(FXmlParser, GivesLongTextInPieces)
{
    const std::string text(10000, 'x');
    TextStream stream("<a>" + text + "<b/></a>");
    RecordingParser parser(stream);
    ASSERT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.record, "<a>[" + text + "]<b/></a>") << "behind the first piece a tag ends the text";
    EXPECT_EQ(parser.pieces, 4);
}

TEST(FXmlParser, FindsFaults)
{
    EXPECT_EQ(told("<a></b>"), "<a>!1");
    EXPECT_EQ(told("</a>"), "!1");
    EXPECT_EQ(told("<a>x"), "<a>[x]!3");
    EXPECT_EQ(told("<a><b/>"), "<a><b/>!3");
    EXPECT_EQ(told("<a b=1>"), "!1");
    EXPECT_EQ(told("<a b='1>"), "!1");
    EXPECT_EQ(told("<a b='1'"), "!1");
    EXPECT_EQ(told("<a / >"), "!1");
    EXPECT_EQ(told("<!x>"), "!1");
    EXPECT_EQ(told("<!-x-->"), "!1");
    EXPECT_EQ(told("<!-- x"), "!3");
    EXPECT_EQ(told("<![CDATA[ x"), "!3");
}

TEST(FXmlParser, ReportsErrorsInWords)
{
    TextStream stream("<a>\n\n<b x='\n'>\n</c>");
    RecordingParser parser(stream);
    EXPECT_EQ(narrow(parser.errorMessage()), "");
    EXPECT_FALSE(parser.process(nullptr));
    EXPECT_EQ(narrow(parser.errorMessage()), "Xml data malformed!");
    FString context;
    parser.getErrorContext(context);
    EXPECT_EQ(narrow(context), "Line 5");
    EXPECT_STREQ(parser.getCurrentStartTag(), "a");
}

TEST(FXmlParser, CountsLinesAlikeInAllItReads)
{
    const struct
    {
        const char* text;
        int line;
    } cases[] = {
        {"<a>\r\n\n\r\n</a>", 4},
        {"<a b=\r\n\r\n'1'/>", 3},
        {"<a b='\r\n'\r\n/>", 3},
        {"<a>x\r\ny\n\r</a>", 3},
        {"<!-- \r\n\r\n --><a/>", 3},
        {"<!DOCTYPE a [\r\n\r\n]><a/>", 3},
        {"<!DOCTYPE a '\r\n\r\n'><a/>", 3},
        {"<![CDATA[ \r\n\r\n ]]><a/>", 3},
        {"<a>x\r<b>\n</a>", 3},
    };
    for (const auto& [text, line] : cases)
        for (const bool buffered : {true, false})
        {
            TextStream stream(text);
            RecordingParser parser(stream, buffered);
            EXPECT_TRUE(parser.process(nullptr)) << text;
            EXPECT_EQ(parser.getLine(), line) << text;
        }
    // The pair of line ends is cut by the limit of a piece.
    TextStream stream("<a>" + std::string(2 * FXmlParser::kMaxToken - 1, 'x') + "\r\n</a>");
    RecordingParser parser(stream);
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.getLine(), 2);
}

TEST(FXmlParser, StopsWhereAHandlerRefuses)
{
    for (const std::string refused : {"b", "/b"})
    {
        TextStream stream("<a><b></b><c/></a>");
        RecordingParser parser(stream);
        parser.refusedTag = refused;
        EXPECT_FALSE(parser.process(nullptr));
        EXPECT_EQ(parser.getError(), FXmlParser::kErrorUnexpectedTag);
        EXPECT_EQ(parser.record, refused == "b" ? "<a><b>" : "<a><b></b>");
    }
}

TEST(FXmlParser, KeepsTheErrorOfARefusingHandler)
{
    struct Parser : RecordingParser
    {
        using RecordingParser::RecordingParser;
        bool startTag(const char*, CmContainer&, bool, void*) override
        {
            error = wanted;
            return false;
        }
        int32 wanted = 0;
    };
    const char* messages[] = {"Unexpected tag or invalid attributes!", "Xml data malformed!",
                              "Unexpected tag or invalid attributes!", "Unexpected end of file!",
                              "Not enough actual attributes in tag!",  "Unexpected Tag!"};
    for (int32 code = 0; code <= FXmlParser::kErrorOtherTagExpected; code++)
    {
        TextStream stream("<a/>");
        Parser parser(stream);
        parser.wanted = code;
        EXPECT_FALSE(parser.process(nullptr));
        EXPECT_EQ(parser.getError(), code ? code : 2);
        EXPECT_EQ(narrow(parser.errorMessage()), messages[code]);
    }
}

TEST(FXmlParser, DecodesEntitiesInValues)
{
    EXPECT_EQ(told("<a b='&lt;&amp;&quot;&apos;&gt;'/>"), "<a b='<&\"'>'/>");
    EXPECT_EQ(told("<a b='&nosuch;&#65;&#x41;&#0;&#x;&#6x;&;'/>"), "<a b='&nosuch;AA&#0;&#x;&#6x;&;'/>");
    EXPECT_EQ(told("<a b='x & y; &dollar;&nl;'/>"), "<a b='x & y; $\n'/>");
    EXPECT_EQ(told("<a b='& &lt;'/>"), "<a b='& <'/>");
    EXPECT_EQ(told("<a b='&#321;'/>"), "<a b='A'/>") << "only the low 8 bits count";
}

TEST(FXmlParser, DecodesLatinNamesByTheWindowsTableOnly)
{
    char mac[] = "&eacute;&Agrave;&iquest;";
    bool sawHighBit = false;
    FXmlParser::removeEntities(mac, &sawHighBit, false);
    EXPECT_STREQ(mac, "&eacute;&Agrave;&iquest;");
    EXPECT_FALSE(sawHighBit);

    char windows[] = "&eacute;&Agrave;&iquest;&Auml;&half;";
    FXmlParser::removeEntities(windows, &sawHighBit, true);
    EXPECT_STREQ(windows, "\xE9\xC1\xBF\xC4\xBD");
    EXPECT_TRUE(sawHighBit);
}

TEST(FXmlParser, WidensValuesByTheEncodingOfTheFile)
{
    const std::string text = "<?xml version='1.0' encoding=\"utf-8\"?><a b='&#xc3;&#xa4;' c='x'/>";
    TextStream stream(text);
    struct Parser : RecordingParser
    {
        using RecordingParser::RecordingParser;
        bool startTag(const char*, CmContainer& attributes, bool, void*) override
        {
            const auto* value = FCast(FXmlAttribute, attributes.at(0));
            EXPECT_TRUE(value->value.isWideString());
            EXPECT_TRUE(value->value == u"\u00E4");
            EXPECT_FALSE(FCast(FXmlAttribute, attributes.at(1))->value.isWideString());
            return true;
        }
    } parser(stream);
    parser.setFlags(FXmlParser::kWidenValues);
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.getCodePage(), 65001u);
}

TEST(FXmlParser, KnowsTheEncodingInLowerCaseOnly)
{
    TextStream stream("<?xml encoding=\"UTF-8\"?><a/>");
    RecordingParser parser(stream);
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.getCodePage(), 0u);
}

TEST(FXmlParser, HandlesCommentsByItsFlags)
{
    const std::string text = "<a><!-- one <!-- two --> three --><b/></a>";
    EXPECT_EQ(told(text), "<a><b/></a>");
    EXPECT_EQ(told(text, FXmlParser::kReportComments), "<a>{ one <!-- two --> three }<b/></a>");
    EXPECT_EQ(told("<!-- one <!-- two -->", FXmlParser::kReportComments | FXmlParser::kSplitComments),
              "{ one | two }");
    EXPECT_EQ(told("<!--a--->", FXmlParser::kReportComments), "{a-}");
    const std::string longText(5000, 'x');
    EXPECT_EQ(told("<!--" + longText + "-->", FXmlParser::kReportComments),
              "{" + longText.substr(0, 4096) + "|" + longText.substr(4096) + "}");
}

TEST(FXmlParser, PassesOverCDataAndDocType)
{
    EXPECT_EQ(told("<!DOCTYPE a [ <!ENTITY x \"a>b\"> <!-- don't > --> ]><a/>"), "<a/>");
    EXPECT_EQ(told("<a><![CDATA[ </a> ]] > ]]></a>"), "<a></a>");
    EXPECT_EQ(told("<!DOCTYPE a"), "!3");
}

TEST(FXmlParser, KeepsSpacesOnDemand)
{
    EXPECT_EQ(told("<a> \t x</a>"), "<a>[x]</a>");
    EXPECT_EQ(told("<a b='1' > \t x</a>", FXmlParser::kKeepSpaces), "<a b='1'>[ \t x]</a>");
}

TEST(FXmlParser, ProtectsQuotesOnDemand)
{
    EXPECT_EQ(told("<a b=\"x\\\"y\" c='\\z'/>", FXmlParser::kBackslashProtects), "<a b='x\\\"y' c='\\z'/>");
    EXPECT_EQ(told("<a b=\"x\\\" c='1'/>"), "<a b='x\\' c='1'/>");
}

// A parser whose handler reads or skips the element that it is told of.
class NestingParser : public RecordingParser
{
public:
    using RecordingParser::RecordingParser;
    bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data) override
    {
        RecordingParser::startTag(name, attributes, isEmpty, data);
        if (name == nestedTag)
        {
            EXPECT_TRUE(process(data));
            record += "*";
        }
        return name != skippedTag || skip();
    }
    std::string nestedTag;
    std::string skippedTag;
};

TEST(FXmlParser, ReadsOneElementInANestedCall)
{
    TextStream stream("<a><b><b2/><b3>x</b3></b><c><c2/><c3>y</c3></c><d/></a>");
    NestingParser parser(stream);
    parser.nestedTag = "b";
    parser.skippedTag = "c";
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.record, "<a><b><b2/><b3>[x]</b3></b>*<c><d/></a>");
}

TEST(FXmlParser, StopsAfterTheMainTagWithoutReadingOn)
{
    for (const std::string main : {"<a><b/></a>", "<a/>"})
    {
        TextStream stream(main + "<c/>rest");
        RecordingParser parser(stream, false);
        parser.setFlags(FXmlParser::kStopAfterMainTag);
        EXPECT_TRUE(parser.process(nullptr));
        EXPECT_EQ(parser.record, main);
        EXPECT_EQ(stream.tell(), static_cast<int64>(main.size())) << "nothing was read ahead";
        EXPECT_EQ(parser.getStreamPosition(), stream.tell());
    }
}

TEST(FXmlParser, StopsOnRequest)
{
    struct Parser : RecordingParser
    {
        using RecordingParser::RecordingParser;
        bool endTag(const char*, void*) override
        {
            stop();
            return true;
        }
    };
    TextStream stream("<a><b></b><c></c></a>");
    Parser parser(stream);
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.record, "<a><b>");
    EXPECT_EQ(parser.getStreamPosition(), 10);
}

TEST(FXmlParser, ReadsTheSameWithAndWithoutBuffer)
{
    std::string text = "<?xml version=\"1.0\"?><r>";
    for (int i = 0; i < 400; i++)
        text += "<e n='" + std::to_string(i) + "'>text </ </r not yet<x/></e>\r\n<!-- - -- -->";
    text += "</r>";
    EXPECT_EQ(told(text), told(text, 0, false));
}

TEST(FXmlParser, ReadsTagsThatAnyBlockCuts)
{
    const std::string tags = "<some b=\"it's\" c='&lt;\\' longer='" + std::string(30, 'v') +
                             "'\r\n\t d = \"x\ty\" e=\"\"><z/></some>";
    const std::string result =
        "<some b='it's' c='<\\' longer='" + std::string(30, 'v') + "' d='x\ty' e=''><z/></some>";
    for (size_t before = 2048 - tags.size(); before <= 2048; before++)
        EXPECT_EQ(told(std::string(before, ' ') + tags), result) << before;
}

TEST(FXmlParser, ReadsNoMoreThanATagNeeds)
{
    struct ShortStream : TextStream
    {
        using TextStream::TextStream;
        int64 readRaw(void* target, int64 count) override
        {
            return TextStream::readRaw(target, std::min<int64>(count, 8));
        }
    };
    ShortStream trickle("<a b=1 x='this is not asked for'>");
    RecordingParser patient(trickle);
    EXPECT_FALSE(patient.process(nullptr));
    EXPECT_EQ(trickle.tell(), 8) << "the first eight bytes tell the fault";

    TextStream endless("<a " + std::string(100000, 'b'));
    RecordingParser parser(endless);
    EXPECT_FALSE(parser.process(nullptr));
    EXPECT_LE(endless.tell(), 3 * 2048);
}

TEST(FXmlParser, PutsBytesBack)
{
    for (bool buffered : {true, false})
    {
        TextStream stream("abc");
        RecordingParser parser(stream, buffered);
        char c = 0;
        ASSERT_TRUE(parser.peekChar(c));
        EXPECT_EQ(c, 'a');
        EXPECT_EQ(parser.getStreamPosition(), 0);
        ASSERT_TRUE(parser.nextChar(c) && parser.nextChar(c));
        EXPECT_EQ(c, 'b');
        for (const char* back = "zyx"; *back; back++)
            parser.ungetChar(*back);
        std::string rest;
        while (parser.nextChar(c))
            rest += c;
        EXPECT_EQ(rest, "xyzc");
        EXPECT_FALSE(parser.peekChar(c));
    }
}

TEST(FXmlParser, BoundsNamesValuesAndTokens)
{
    const std::string name47(47, 'n'), value2047(2047, 'v');
    EXPECT_EQ(told("<a " + name47 + "='" + value2047 + "'/>"), "<a " + name47 + "='" + value2047 + "'/>");
    EXPECT_EQ(told("<a n" + name47 + "='1'/>"), "!1");
    EXPECT_EQ(told("<a n='v" + value2047 + "'/>"), "!1");
    EXPECT_EQ(told("<" + std::string(4095, 'a') + "/>"), "<" + std::string(4095, 'a') + "/>");
    EXPECT_EQ(told("<" + std::string(5000, 'a') + "/>"), "!1");
    EXPECT_EQ(told("<a " + std::string(100000, 'b')), "!1");
}

TEST(FXmlParser, RefusesDepthsBeyondItsLimit)
{
    const int limit = FXmlParser::kMaxDepth;
    TextStream deep(repeated("<a>", limit) + repeated("</a>", limit));
    RecordingParser good(deep);
    EXPECT_TRUE(good.process(nullptr));

    TextStream deeper(repeated("<a>", 100000));
    RecordingParser bad(deeper);
    EXPECT_FALSE(bad.process(nullptr));
    EXPECT_EQ(bad.getError(), FXmlParser::kErrorMalformed);
}

// Whatever the bytes are: an end, and no byte read out of place.
TEST(FXmlParser, SurvivesDamagedText)
{
    const std::string text =
        "<?xml version=\"1.0\"?><!DOCTYPE a [<!ENTITY b 'c'>]><a b='&lt;x;' c=\"&#x41;\">te<xt"
        "<!-- c --><![CDATA[ d ]]></a>";
    for (size_t cut = 0; cut < text.size(); cut++)
    {
        told(text.substr(0, cut), 127);
        for (const char byte : {'\0', '<', '>', '"', '&', '\xFF', '/', '-', ']'})
        {
            std::string damaged = text;
            damaged[cut] = byte;
            EXPECT_EQ(told(damaged, cut % 128), told(damaged, cut % 128, false)) << damaged;
        }
    }
}

TEST(FXmlParser, KeepsAttributeObjectsForReuse)
{
    struct Parser : RecordingParser
    {
        using RecordingParser::RecordingParser;
        bool startTag(const char*, CmContainer& attributes, bool, void*) override
        {
            EXPECT_TRUE(!seen || attributes.containsAbs(seen));
            seen = attributes.at(0);
            return true;
        }
        CmObject* seen = nullptr;
    };
    TextStream stream("<a b='1'><c d='2'/><e f='3'/></a>");
    Parser parser(stream);
    EXPECT_TRUE(parser.process(nullptr));
}

TEST(FXmlParser, LeavesNamesThatAHandlerKeeps)
{
    struct Parser : RecordingParser
    {
        using RecordingParser::RecordingParser;
        bool startTag(const char*, CmContainer&, bool, void*) override
        {
            kept.emplace_back(static_cast<CmString*>(tagStack.peek()));
            return true;
        }
        std::vector<IPtr<CmString>> kept;
    };
    TextStream stream("<a><b></b><c></c></a><d></d>");
    Parser parser(stream);
    EXPECT_TRUE(parser.process(nullptr));
    std::string names;
    for (const IPtr<CmString>& name : parser.kept)
        names += narrow(*name);
    EXPECT_EQ(names, "abcd");
}

TEST(FXmlParser, BeginsAnewWithAnotherStream)
{
    TextStream first("<a><b></c>"), second("<d/>");
    RecordingParser parser(first);
    EXPECT_FALSE(parser.process(nullptr));
    parser.setStream(&second);
    EXPECT_EQ(parser.getLine(), 1);
    EXPECT_EQ(parser.getCurrentStartTag(), nullptr);
    EXPECT_TRUE(parser.process(nullptr));
    EXPECT_EQ(parser.record, "<a><b><d/>");
}
