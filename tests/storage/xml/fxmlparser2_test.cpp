#include "foundation/text/cmstring.h"
#include "storage/xml/fxmlparser2.h"
#include "storage/xml/xmlhandler.h"
#include "xmltestsupport.h"

#include <gtest/gtest.h>

namespace
{
class RecordingHandler : public XmlHandler
{
public:
    void startTag(INewXmlParser* parser, const char* name, const char** attributes) override
    {
        record += std::string("<") + name;
        for (; attributes[0]; attributes += 2)
            record += std::string(" ") + attributes[0] + "='" + attributes[1] + "'";
        record += ">";
        if (name == stopTag)
            parser->stop();
        if (name == suspendTag)
            parser->suspend();
    }
    void endTag(INewXmlParser*, const char* name) override { record += std::string("</") + name + ">"; }
    void charData(INewXmlParser*, const char* data, int length) override
    {
        record.append(data, static_cast<size_t>(length));
    }
    void comment(INewXmlParser*, const char* text) override { record += std::string("{") + text + "}"; }

    std::string record;
    std::string stopTag;
    std::string suspendTag;
};

std::string errorOf(FXmlParser2& parser)
{
    CmString text;
    return parser.getErrorContext(text) ? narrow(text) : "none";
}
} // namespace

TEST(FXmlParser2, TellsItsHandler)
{
    TextStream stream("<?xml version=\"1.0\"?><a b=\"&lt;\u00E4\">x<!--c--><d/>&amp;</a>");
    RecordingHandler handler;
    FXmlParser2 parser(&handler);
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(handler.record, "<a b='<\u00E4'>x{c}<d></d>&</a>");
    EXPECT_EQ(errorOf(parser), "none");
}

TEST(FXmlParser2, LeavesTheStreamBehindTheDocument)
{
    TextStream stream("junk<a/><b/>");
    stream.seek(4, kSeekStart);
    RecordingHandler handler;
    FXmlParser2 parser(&handler);
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(stream.tell(), 8);
    ASSERT_TRUE(parser.reset(nullptr));
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(handler.record, "<a></a><b></b>");
}

TEST(FXmlParser2, TellsTheReasonOfAFailure)
{
    TextStream stream("<a>\n</b>");
    FXmlParser2 parser;
    EXPECT_FALSE(parser.process(&stream));
    EXPECT_EQ(errorOf(parser), "Xml Error: mismatched tag \r\nLine: 2");
    EXPECT_EQ(parser.getCurrentLineNumber(), 2);

    for (const char* text : {"", "   ", "<a>", "<a", "\x01\x02\xFF\xFE", "<a>\xFF</a>", "<a b='1' b='2'/>"})
    {
        TextStream damaged(text);
        FXmlParser2 other;
        EXPECT_FALSE(other.process(&damaged)) << text;
        EXPECT_NE(errorOf(other), "none") << text;
    }
    EXPECT_FALSE(parser.process(nullptr));
}

TEST(FXmlParser2, TakesAFailingStreamForOneThatEnds)
{
    struct BrokenStream : TextStream
    {
        using TextStream::read;
        using TextStream::TextStream;
        int32 read(void* bytes, int count, int* done) override
        {
            return --goodReads < 0 ? kStreamFailed : TextStream::read(bytes, count, done);
        }
        int goodReads = 1;
    };
    BrokenStream whole("<a/>"), torn("<a>" + std::string(100000, ' ') + "</a>");
    FXmlParser2 parser;
    EXPECT_TRUE(parser.process(&whole));
    ASSERT_TRUE(parser.reset(nullptr));
    EXPECT_FALSE(parser.process(&torn));
    EXPECT_EQ(errorOf(parser), "Xml Error: no element found \r\nLine: 1");
}

TEST(FXmlParser2, CountsLinesFromZeroWhenStopped)
{
    TextStream stream("<a>\n<b/>\n</a>");
    RecordingHandler handler;
    handler.stopTag = "b";
    FXmlParser2 parser(&handler);
    EXPECT_FALSE(parser.process(&stream));
    EXPECT_EQ(errorOf(parser), "Xml Error: parsing aborted \r\nLine: 1");
    EXPECT_EQ(parser.getCurrentLineNumber(), 1);
}

TEST(FXmlParser2, RestsAndGoesOn)
{
    const std::string padding(100000, ' ');
    TextStream stream("<a><b/>" + padding + "<c/></a><next/>");
    RecordingHandler handler;
    handler.suspendTag = "b";
    FXmlParser2 parser(&handler);
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(handler.record, "<a><b></b>") << "the end of an empty element comes with its start";
    EXPECT_FALSE(parser.setEncoding("UTF-8"));
    EXPECT_TRUE(parser.resume(&stream));
    EXPECT_EQ(handler.record, "<a><b></b>" + padding + "<c></c></a>");
    EXPECT_EQ(stream.tell(), static_cast<int64>(padding.size()) + 15);
    EXPECT_FALSE(parser.resume(&stream)) << "nothing rests any more";
}

TEST(FXmlParser2, TakesTheEncodingThatItIsTold)
{
    TextStream stream("<a>\xE4</a>");
    RecordingHandler handler;
    FXmlParser2 parser(&handler, "ISO-8859-1");
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(handler.record, "<a>\u00E4</a>");
    EXPECT_TRUE(parser.reset(nullptr));
    EXPECT_TRUE(parser.setEncoding("UTF-8"));
    TextStream utf8("<a>\u00E4</a>");
    EXPECT_TRUE(parser.process(&utf8));
}

TEST(FXmlParser2, ReadsTokensOverManyBlocks)
{
    const std::string value(200000, 'v');
    TextStream stream("<a b='" + value + "'/>");
    RecordingHandler handler;
    FXmlParser2 parser(&handler);
    EXPECT_TRUE(parser.process(&stream));
    EXPECT_EQ(handler.record, "<a b='" + value + "'></a>");
}

TEST(FXmlParser2, RefusesWhatWouldTakeTooMuch)
{
    const auto limit = static_cast<size_t>(FXmlParser2::kMaxTokenBytes);
    TextStream longToken("<a b='" + std::string(8 * limit, 'v') + "'/>");
    FXmlParser2 first;
    EXPECT_FALSE(first.process(&longToken));
    EXPECT_EQ(errorOf(first), "Xml Error: parsing aborted \r\nLine: 0");
    EXPECT_LT(longToken.tell(), static_cast<int64>(2 * limit)) << "it stopped reading";
    EXPECT_FALSE(first.process(&longToken));

    TextStream deep(repeated("<a>", 100000));
    FXmlParser2 second;
    EXPECT_FALSE(second.process(&deep));
    EXPECT_EQ(errorOf(second), "Xml Error: parsing aborted \r\nLine: 0");

    std::string declarations = "<!DOCTYPE a [";
    for (int i = 0; i < 200000; i++)
        declarations += "<!ENTITY e" + std::to_string(i) + " 'x'>";
    TextStream longProlog(declarations + "]><a/>");
    FXmlParser2 fourth;
    EXPECT_FALSE(fourth.process(&longProlog));

    TextStream notTooDeep(repeated("<a>", FXmlParser2::kMaxDepth) + repeated("</a>", FXmlParser2::kMaxDepth));
    FXmlParser2 third;
    EXPECT_TRUE(third.process(&notTooDeep));
}

TEST(FXmlParser2, RefusesADocumentOfNothingButNewNames)
{
    // A run of distinct names that the library would have to keep, whatever the handler does.
    std::string names = "<r>";
    for (int i = 0; i < 1500000; i++)
        names += "<n" + std::to_string(i) + "/>";
    TextStream stream(names + "</r>");
    FXmlParser2 parser;
    EXPECT_FALSE(parser.process(&stream));
    EXPECT_EQ(errorOf(parser).substr(0, 24), "Xml Error: out of memory");

    EXPECT_TRUE(parser.reset(nullptr)) << "what was kept is given back";
    TextStream small("<r><a/></r>");
    EXPECT_TRUE(parser.process(&small));
}

TEST(FXmlParser2, RefusesDeclarationsThatBlowItUp)
{
    std::string text = "<!DOCTYPE r [";
    for (int i = 0; i < 1000; i++)
        text += "<!ATTLIST a a" + std::to_string(i) + " CDATA 'x'>";
    text += "]><r><a/>";
    TextStream few(text + "</r>");
    RecordingHandler handler;
    FXmlParser2 first(&handler);
    EXPECT_TRUE(first.process(&few));
    EXPECT_NE(handler.record.find("a999='x'"), std::string::npos);

    TextStream many(text + repeated("<a/>", 1000) + "</r>");
    FXmlParser2 second;
    EXPECT_FALSE(second.process(&many));
    EXPECT_EQ(errorOf(second), "Xml Error: parsing aborted \r\nLine: 0");
}

TEST(FXmlParser2, SurvivesAnEntityBomb)
{
    std::string text = "<!DOCTYPE a [<!ENTITY x0 'ha'>";
    for (int i = 1; i < 40; i++)
        text += "<!ENTITY x" + std::to_string(i) + " '&x" + std::to_string(i - 1) + ";&x" +
                std::to_string(i - 1) + ";'>";
    TextStream stream(text + "]><a>&x39;</a>");
    FXmlParser2 parser;
    EXPECT_FALSE(parser.process(&stream));
}

TEST(XmlHandler, KeepsAStackForThoseWhoBuild)
{
    struct Handler : XmlHandler
    {
        using XmlHandler::peekData;
        using XmlHandler::popData;
        using XmlHandler::pushData;
    } handler;
    CmString first("1"), second("2");
    handler.pushData(&first);
    handler.pushData(&second);
    EXPECT_EQ(handler.peekData(), &second);
    EXPECT_EQ(handler.popData(), &second);
    EXPECT_EQ(handler.popData(), &first);
    EXPECT_EQ(handler.popData(), nullptr);
    EXPECT_EQ(first.getRefCount(), 1u);
}
