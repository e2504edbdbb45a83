#include "containers/sequence/cmarray.h"
#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmlwriter2.h"
#include "xmltestsupport.h"

#include <gtest/gtest.h>

#include <cstdio>

namespace
{
std::string encoded(const char* text, bool utf8)
{
    Buffer out;
    FXmlWriter::encodeString(out, text, utf8);
    return std::string(out.ptr(), out.getFillSize());
}

std::string encoded(const char16* text)
{
    Buffer out;
    FXmlWriter::encodeString(out, text);
    return std::string(out.ptr(), out.getFillSize());
}

/// Takes a few bytes and then no more.
class FullStream : public FMemoryStream
{
public:
    int64 writeRaw(const void* bytes, int64 count) override
    {
        return tell() + count > 10 ? 0 : FMemoryStream::writeRaw(bytes, count);
    }
};
} // namespace

TEST(FXmlWriter, EncodesText)
{
    EXPECT_EQ(encoded("a<b>&\"'$^\n\u00E4", true), "a&lt;b&gt;&amp;&quot;'$^\n\u00E4");
    EXPECT_EQ(encoded("<>&\"'$^`\n\r\t \xE4", false),
              "&lt;&gt;&amp;&quot;'&dollar;&circ;&grave;&nl;&cr;\t &#xe4;");
    EXPECT_EQ(encoded(u"<\u00E4\u65E5>&\"'\U0001F600"), "&lt;\u00E4\u65E5&gt;&amp;&quot;'\U0001F600");
    EXPECT_EQ(encoded(u""), "");
}

TEST(FXmlWriter, WritesIndentedLines)
{
    FMemoryStream stream;
    FXmlWriter writer(&stream, 0);
    FXmlAttribute attribute("b", "<");
    CmArray attributes(0, 10);
    attributes.add(&attribute);
    EXPECT_EQ(writer.writeStartTag("a", attributes, false), 0);
    EXPECT_EQ(writer.writeStartTag("c", 0, nullptr, nullptr, true), 0);
    char text[] = "one\n\ntwo\0three";
    EXPECT_EQ(writer.writeData(text, sizeof(text)), 0);
    EXPECT_EQ(writer.writeData(text, 0), 0);
    EXPECT_EQ(writer.writeComment("  note "), 0);
    EXPECT_EQ(writer.writeComment("  "), 0);
    EXPECT_EQ(writer.newLine(), 0);
    EXPECT_EQ(writer.writeEndTag("a"), 0);
    EXPECT_EQ(contentOf(stream),
              "<a b=\"<\">\r\n\t<c/>\r\n\tone\r\n\ttwo\r\n\t<!-- note -->\r\n\r\n</a>\r\n");
}

TEST(FXmlWriter, RefusesAnotherEndTag)
{
    FMemoryStream stream;
    FXmlWriter writer(&stream, 0);
    EXPECT_EQ(writer.writeEndTag("x"), 1);
    writer.writeStartTag("a", 0, nullptr, nullptr, false);
    EXPECT_EQ(writer.writeEndTag("x"), 1);
    EXPECT_EQ(contentOf(stream), "<a>\r\n");
    EXPECT_EQ(writer.writeEndTag("a"), 0);
}

TEST(FXmlWriter, TreatsAttributesByItsFlags)
{
    FMemoryStream stream;
    FXmlWriter writer(nullptr, FXmlWriter::kOmitEmptyAttributes | FXmlWriter::kEncodeValues);
    EXPECT_EQ(writer.newLine(), 1) << "no stream yet";
    ASSERT_EQ(writer.initialize(&stream), 0);
    const char* names[] = {"a", "b", "c"};
    const char* values[] = {"$", "", "x"};
    writer.writeStartTag("t", 3, names, values, true);
    EXPECT_EQ(contentOf(stream), "<t a=\"&dollar;\" c=\"x\"/>\r\n");
}

TEST(FXmlWriter, TellsThatTheStreamIsFull)
{
    FullStream stream;
    FXmlWriter writer(&stream, 0);
    EXPECT_EQ(writer.writeComment("much too long"), 1);
}

TEST(XmlWriter2, WritesADocument)
{
    FMemoryStream stream;
    XmlWriter2 writer(&stream);
    writer.writeIntro(true);
    writer.writeStartTag("a", kOpenTag);
    writer.beginStartTag("b");
    writer.appendAttribute8("n", "<'\u00E4");
    writer.appendAttribute16("w", u"\"\u65E5");
    writer.appendIntAttribute("i", -5);
    writer.appendUIntAttribute("u", ~uint64{0});
    writer.finishStartTag(kEmptyTag);
    writer.setSingleLine(true);
    writer.writeStartTag("c", kOpenTag);
    writer.writeString8("x & y");
    writer.writeString16(u"<");
    writer.writeInt(7);
    writer.writeFloat(0.25);
    writer.writeEndTag("c", true);
    writer.writeComment8("one");
    writer.writeComment16(u"<\u65E5>");
    writer.setSpaceIndent(true);
    writer.writeStartTag("d", kEmptyTag);
    writer.newLine();
    writer.writeEndTag("a", false);
    EXPECT_EQ(contentOf(stream),
              "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"utf-8\"?>\r\n<a>\r\n"
              "\t<b n=\"&lt;'\u00E4\" w=\"&quot;\u65E5\" i=\"-5\" u=\"18446744073709551615\"/>\r\n"
              "\t<c>x &amp; y&lt;70.25</c>\r\n"
              "<!-- one -->\r\n<!-- <\u65E5> -->\r\n   <d/>\r\n\r\n</a>\r\n");
    EXPECT_EQ(writer.getDepth(), 0);
}

TEST(XmlWriter2, KeepsTheSingleLineOpenOnDemand)
{
    FMemoryStream stream;
    XmlWriter2 writer(&stream);
    writer.writeIntro(false);
    writer.setSingleLine(true);
    writer.writeStartTag("a", kOpenTag);
    writer.writeEndTag("a", false);
    EXPECT_TRUE(writer.isSingleLine());
    writer.writeLine(3);
    EXPECT_EQ(contentOf(stream), "<?xml version=\"1.0\"?>\r\n<a></a>") << "an empty line is not written";
}

TEST(XmlWriter2, WritesDoublesWithFiftyDigits)
{
    for (const double value :
         {0.5, 0.1, 1e-300, -1.7976931348623157e308, 5e-324, 100.0, 1e50, 0.0, 12345678.9})
    {
        FMemoryStream stream;
        XmlWriter2 writer(&stream);
        writer.beginStartTag("a");
        writer.appendFloatAttribute("v", value);
        writer.finishStartTag(kEmptyTag);
        char expected[200];
        snprintf(expected, sizeof(expected), "<a v=\"%.50g\"/>\r\n", value);
        EXPECT_EQ(contentOf(stream), expected);
    }
}

TEST(XmlWriter2, TellsThatTheStreamIsFull)
{
    FullStream stream;
    XmlWriter2 writer(&stream);
    EXPECT_EQ(writer.writeStartTag("abc", kOpenTag), 0);
    writer.setSingleLine(true);
    EXPECT_NE(writer.writeStartTag("much too long", kOpenTag), 0);
    EXPECT_NE(writer.writeEndTag("much too long", true), 0);
    EXPECT_FALSE(writer.isSingleLine()) << "a failure doesn't stick";
    EXPECT_EQ(writer.writeString8("1"), 0);
}
