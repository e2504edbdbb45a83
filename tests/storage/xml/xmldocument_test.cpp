#include "storage/xml/xmlcomment.h"
#include "storage/xml/xmldocument.h"
#include "storage/xml/xmldocumentparser.h"
#include "storage/xml/xmlelementdata.h"
#include "xmltestsupport.h"

#include <gtest/gtest.h>

using Xml::Attribute;
using Xml::Comment;
using Xml::Document;
using Xml::Element;
using Xml::ElementData;
using Xml::Node;

namespace
{
constexpr char kIntro[] = "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"utf-8\"?>\n";

bool load(Document& document, const std::string& text)
{
    TextStream stream(text);
    return document.load(&stream);
}

/// The saved text behind the declaration.
std::string saved(Document& document, bool reformat)
{
    FMemoryStream stream;
    EXPECT_TRUE(document.save(&stream, reformat));
    const std::string text = contentOf(stream);
    EXPECT_EQ(text.substr(0, strlen(kIntro)), kIntro);
    return text.substr(strlen(kIntro));
}

std::string stringDataOf(const std::string& text)
{
    Document document;
    EXPECT_TRUE(load(document, text));
    String result;
    const bool hasText = document.getRootElement()->getStringData(result);
    EXPECT_EQ(hasText, !result.isEmpty());
    return narrow(result);
}

IPtr<Element> element(const char16* name)
{
    return adopt(new Element(name));
}

IPtr<Node> data(const char* text)
{
    return adopt<Node>(new ElementData(text, static_cast<int>(strlen(text))));
}
} // namespace

TEST(XmlDocument, LoadsATree)
{
    Document document;
    ASSERT_TRUE(load(document, "<a x=\"1\" y=\"\u00E4&amp;\"><b/>text<!-- note --><b z='2'/></a>"));
    const Element* root = document.getRootElement();
    EXPECT_EQ(narrow(root->getName()), "a");
    EXPECT_EQ(root->countAttributes(), 2);
    EXPECT_TRUE(root->getAttribute(u"y")->getValue() == u"\u00E4&");
    EXPECT_EQ(root->getAttribute(u"Y"), nullptr);
    EXPECT_EQ(root->countChildren(), 4);
    const Element* first = root->firstElement();
    EXPECT_EQ(first->getParent(), root);
    EXPECT_STREQ(root->childAt(1)->asData()->getData(), "text");
    EXPECT_EQ(narrow(FCast(Comment, root->childAt(2))->getName()), " note ");
    EXPECT_NE(first->nextElement(u"b")->getAttribute(u"z"), nullptr);
    EXPECT_EQ(root->firstElement(u"c"), nullptr);
}

TEST(XmlDocument, KeepsNoRootOfABadText)
{
    Document document(element(u"old"));
    for (const char* text : {"<a>", "", "<a></b>", "text", "<a>\xC3</a>"})
    {
        EXPECT_FALSE(load(document, text)) << text;
        EXPECT_EQ(document.getRoot(), nullptr);
    }
    EXPECT_FALSE(document.load(nullptr));
    FMemoryStream stream;
    EXPECT_FALSE(document.save(&stream, false));
    EXPECT_EQ(stream.getSize(), 0);
}

TEST(XmlDocument, IgnoresWhatFollowsTheRoot)
{
    Document document;
    ASSERT_TRUE(load(document, "<!-- before --><a/><!-- behind -->"));
    EXPECT_EQ(saved(document, false), "<a/>");
    TextStream two("<a/><b/>");
    ASSERT_TRUE(document.load(&two));
    ASSERT_TRUE(document.load(&two));
    EXPECT_EQ(saved(document, false), "<b/>");
}

// The tokenizer cuts a text at line ends and entities, and pieces of white space don't count.
TEST(XmlElement, JoinsItsTextAsItWasCut)
{
    EXPECT_EQ(stringDataOf("<a> \t one two \n</a>"), "one two");
    EXPECT_EQ(stringDataOf("<a>one\ntwo</a>"), "onetwo");
    EXPECT_EQ(stringDataOf("<a>one &amp; two<b>not</b> three</a>"), "one & two three");
    EXPECT_EQ(stringDataOf("<a>\u65E5\u672C</a>"), "\u65E5\u672C");
    EXPECT_EQ(stringDataOf("<a> \n </a>"), "");
    EXPECT_EQ(stringDataOf("<a/>"), "");
}

TEST(XmlDocument, SavesWhatItLoaded)
{
    const std::string text = "<a b=\"&lt;&quot;&gt;&amp;'\"><c/>x &amp; y<!-- < & --><d>\u65E5</d>\n</a>";
    Document document;
    ASSERT_TRUE(load(document, text));
    EXPECT_EQ(saved(document, false), text);
}

// Texts and attributes stay as they were in the file until someone asks for one.
TEST(XmlDocument, SavesTheSameWhatEverWasLookedAt)
{
    const std::string text =
        "<a x=\"1 &amp; 2\" y=\"\"><bb z=\"\u00E4\">&lt;&gt;</bb><b q=\"&quot;\" r=\"plain\"/></a>";
    Document document;
    ASSERT_TRUE(load(document, text));
    Element* root = document.getRootElement();
    Element* last = root->firstElement(u"b");
    ASSERT_TRUE(last && last == root->lastChild());
    EXPECT_EQ(last->countAttributes(), 2);
    EXPECT_EQ(saved(document, false), text);
    EXPECT_EQ(narrow(root->getAttribute(u"x")->getValue()), "1 & 2");
    EXPECT_TRUE(root->attributeAt(1)->getValue().isWideString());
    EXPECT_EQ(root->attributeAt(2), nullptr);
    EXPECT_EQ(narrow(last->getName()), "b");
    EXPECT_EQ(saved(document, false), text);

    last->setName(u"c");
    last->removeAttribute(last->getAttribute(u"q"));
    root->firstElement()->addAttribute(adopt(new Attribute(u"w", u"3")));
    static_cast<ElementData*>(root->firstElement()->firstChild())->setData("-", 1);
    EXPECT_EQ(saved(document, false),
              "<a x=\"1 &amp; 2\" y=\"\"><bb z=\"\u00E4\" w=\"3\">-&gt;</bb><c r=\"plain\"/></a>");
}

TEST(XmlDocument, LaysOutATree)
{
    Document document;
    ASSERT_TRUE(load(document, "<a><b><c/></b>\n<!--n--><d>text</d> </a>"));
    const std::string expected = "<a>\n\t<b>\n\t\t<c/></b>\n\t<!--n-->\n\t<d>text</d>\n</a>";
    EXPECT_EQ(saved(document, true), expected) << "an end tag moves only where white space was taken away";
    const std::string again = "<a>\n\t<b>\n\t\t<c/>\n\t</b>\n\t<!--n-->\n\t<d>text</d>\n</a>";
    EXPECT_EQ(saved(document, true), again);
    EXPECT_EQ(saved(document, true), again) << "layout is replaced, not heaped up";
    ASSERT_TRUE(load(document, again));
    EXPECT_EQ(saved(document, true), again);
}

TEST(XmlDocument, LeavesTextInItsPlace)
{
    Document document;
    ASSERT_TRUE(load(document, "<a>\n<b/>text</a>"));
    EXPECT_EQ(saved(document, true), "<a>\n\t<b/>text</a>");
}

TEST(XmlElement, CountsItsChildren)
{
    auto parent = element(u"p");
    auto first = element(u"a");
    auto second = data("x");
    EXPECT_TRUE(parent->addChild(second));
    EXPECT_TRUE(parent->insertChildAt(first, 0));
    EXPECT_EQ(first->getRefCount(), 2u);
    EXPECT_EQ(first->getParent(), parent);
    EXPECT_EQ(parent->childAt(1), second);
    EXPECT_EQ(second->previousSibling(), first);
    EXPECT_FALSE(parent->insertChildAt(data("y"), 3));
    EXPECT_FALSE(parent->insertChildAt(data("y"), -1));
    EXPECT_FALSE(parent->addChild(nullptr));
    EXPECT_FALSE(parent->addChild(second)) << "it stands here already";
    EXPECT_FALSE(element(u"q")->addChild(first)) << "it stands elsewhere";
    EXPECT_FALSE(parent->addChild(adopt<Node>(new Attribute(u"n", u"v"))));

    EXPECT_TRUE(parent->removeChild(first));
    EXPECT_FALSE(parent->removeChild(first));
    EXPECT_EQ(first->getRefCount(), 1u);
    EXPECT_EQ(first->getParent(), nullptr);
    EXPECT_TRUE(parent->removeChildAt(0));
    EXPECT_FALSE(parent->removeChildAt(0));
    EXPECT_EQ(parent->countChildren(), 0);
    EXPECT_TRUE(element(u"q")->addChild(first)) << "it is free again";
}

TEST(XmlElement, IsNeverItsOwnDescendant)
{
    auto outer = element(u"a");
    auto middle = element(u"b");
    auto inner = element(u"c");
    outer->addChild(middle);
    middle->addChild(inner);
    EXPECT_FALSE(inner->addChild(outer));
    EXPECT_FALSE(outer->addChild(outer));
}

TEST(XmlElement, OutlivesItsParent)
{
    auto inner = element(u"c");
    {
        auto outer = element(u"a");
        auto middle = element(u"b");
        outer->addChild(middle);
        middle->addChild(inner);
        inner->addChild(data("x"));
    }
    EXPECT_EQ(inner->getRefCount(), 1u);
    EXPECT_EQ(inner->getParent(), nullptr);
    EXPECT_EQ(inner->countChildren(), 1);
}

TEST(XmlElement, HasAttributesInTheirOrder)
{
    auto owner = element(u"a");
    auto first = adopt(new Attribute("n", "1"));
    EXPECT_TRUE(owner->addAttribute(first));
    EXPECT_TRUE(owner->addAttribute(adopt(new Attribute("n", "2"))));
    EXPECT_FALSE(owner->addAttribute(nullptr));
    EXPECT_EQ(owner->getAttribute(u"n"), first);
    EXPECT_TRUE(owner->removeAttribute(first));
    EXPECT_FALSE(owner->removeAttribute(first));
    EXPECT_EQ(narrow(owner->attributeAt(0)->getValue()), "2");
    EXPECT_EQ(owner->attributeAt(1), nullptr);
}

TEST(XmlElementData, KnowsWhatLaysOut)
{
    ElementData node(" \t\r\n", 4);
    EXPECT_TRUE(node.isFormatData());
    EXPECT_TRUE(node.setData("x", 1));
    EXPECT_FALSE(node.isFormatData());
    EXPECT_STREQ(node.getData(), "x");
    EXPECT_TRUE(node.setData("", 0));
    EXPECT_STREQ(node.getData(), "");
    EXPECT_FALSE(node.setData("x", -1));
}

TEST(XmlDocument, HandlesDepthsThatNoStackHas)
{
    constexpr int kDepth = 200000;
    auto root = element(u"a");
    Element* inner = root;
    for (int i = 0; i < kDepth; i++)
    {
        auto child = element(u"a");
        inner->addChild(child);
        inner = child;
    }
    Document document(root);
    root = nullptr;
    FMemoryStream stream;
    EXPECT_TRUE(document.save(&stream, false));
    EXPECT_EQ(stream.getSize(), static_cast<int64>(strlen(kIntro)) + 7 * kDepth + 4);
    stream.rewind();
    EXPECT_FALSE(document.load(&stream)) << "deeper than a document may be";
}

TEST(XmlDocument, BoundsTheTree)
{
    TextStream stream("<a>" + repeated("<b c='d'/>", 1000) + "</a>");
    auto parser = adopt(new Xml::DocumentParser);
    EXPECT_FALSE(parser->parse(&stream, 100000));
    stream.rewind();
    parser = adopt(new Xml::DocumentParser);
    EXPECT_TRUE(parser->parse(&stream, 10000000));
    EXPECT_EQ(parser->getRoot()->asElement()->countChildren(), 1000);
}

TEST(XmlDocument, LoadsOrRefusesEveryDamagedText)
{
    const std::string text = "<?xml version='1.0'?><a b='1'><c>text</c><!-- n --></a>";
    for (size_t i = 0; i < text.size(); i++)
    {
        Document document;
        EXPECT_FALSE(load(document, text.substr(0, i)));
        for (const char byte : {'\0', '<', '&', '\xFF'})
        {
            std::string damaged = text;
            damaged[i] = byte;
            const bool loaded = load(document, damaged);
            EXPECT_EQ(loaded, document.getRoot() != nullptr) << damaged;
        }
    }
}
