#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fxmlinstance.h"
#include "tests/storage/archive/archivesamples.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <random>

namespace
{
const std::string kHeader = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r";

std::string idOf(const CmObject* object)
{
    return std::to_string(reinterpret_cast<uintptr_t>(object));
}

std::string save(const FAttributes& tree)
{
    auto stream = adopt(new FMemoryStream);
    EXPECT_TRUE(FXmlArchive(stream, true).saveAttributes("x", tree));
    return contentOf(*stream);
}

bool load(const std::string& text, FAttributes& tree)
{
    return FXmlArchive(streamOf(text), false).loadAttributes("x", tree);
}

/// The lines between the root tag's.
std::string linesOf(const FAttributes& tree)
{
    const std::string text = save(tree);
    const std::string start = kHeader + "<x>\r", end = "</x>\r";
    EXPECT_EQ(text.substr(0, start.size()), start);
    EXPECT_EQ(text.substr(text.size() - end.size()), end);
    return text.substr(start.size(), text.size() - start.size() - end.size());
}
} // namespace

TEST(FXmlArchive, WritesLinesThatEndInCr)
{
    FAttributes tree;
    tree.set("a", 1);
    EXPECT_EQ(save(tree), kHeader + "<x>\r   <int name=\"a\" value=\"1\"/>\r</x>\r");
}

TEST(FXmlArchive, WritesEachKindOfValue)
{
    FAttributes tree;
    tree.set("f", 0.5);
    tree.set("g", 0.1);
    tree.set("s", "a<b$^`\"&\r\n\xE9");
    tree.set("w", u"ä<$\"");
    auto sub = adopt(new FAttributes);
    sub->set("n$", -3);
    tree.setAttributes("sub", sub);
    EXPECT_EQ(linesOf(tree),
              "   <float name=\"f\" value=\"0.5\"/>\r"
              "   <float name=\"g\" value=\"0.1000000000000000055511151231257827021181583404541\"/>\r"
              "   <string name=\"s\" value=\"a&lt;b&dollar;&circ;&grave;&quot;&amp;&cr;&nl;&#xe9;\"/>\r"
              "   <member name=\"sub\">\r"
              "      <int name=\"n&dollar;\" value=\"-3\"/>\r"
              "   </member>\r"
              "   <string name=\"w\" value=\"\xC3\xA4&lt;$&quot;\" wide=\"true\"/>\r");
}

TEST(FXmlArchive, WritesBlocksInLinesOf32Bytes)
{
    FAttributes tree;
    const std::string bytes(40, '\xAB');
    auto sub = adopt(new FAttributes);
    tree.setAttributes("sub", sub);
    sub->setBinary("d", bytes.data(), 40);
    sub->setBinary("e", nullptr, 0);
    std::string line;
    for (int i = 0; i < 32; i++)
        line += "AB";
    EXPECT_EQ(linesOf(tree), "   <member name=\"sub\">\r"
                             "      <bin name=\"d\">\r"
                             "\t\t" +
                                 line + "\r\t\t" + line.substr(0, 16) +
                                 "\r      </bin>\r"
                                 "      <bin name=\"e\">\r      </bin>\r   </member>\r");
}

TEST(FXmlArchive, WritesQueues)
{
    FAttributes tree;
    auto node = adopt(new StoredNode(1));
    tree.queueInt("a", 5);
    tree.queueFloat("b", 1.5);
    tree.queueString16("c", u"ü&");
    auto sub = adopt(new FAttributes);
    sub->set("n", 1);
    tree.queueAttributes("d", sub);
    tree.queueObject("e", node);
    const std::string id = idOf(node);
    EXPECT_EQ(linesOf(tree),
              "   <list name=\"a\" type=\"int\">\r      <item value=\"5\"/>\r   </list>\r"
              "   <list name=\"b\" type=\"float\">\r      <item value=\"1.5\"/>\r   </list>\r"
              "   <list name=\"c\" type=\"string\">\r      <item value=\"\xC3\xBC&amp;\"/>\r   </list>\r"
              "   <list name=\"d\" type=\"list\">\r      <item>\r"
              "         <int name=\"n\" value=\"1\"/>\r      </item>\r   </list>\r"
              "   <list name=\"e\" type=\"obj\">\r      <item value=\"" +
                  id + "\"/>\r   </list>\r\r   <obj class=\"StoredNode\" ID=\"" + id +
                  "\">\r      <int name=\"Number\" value=\"1\"/>\r   </obj>\r\r");
}

TEST(FXmlArchive, WritesSharedObjectsOnceBehindTheTree)
{
    auto second = adopt(new StoredNode(2));
    auto first = adopt(new StoredNode(1, second));
    second->next = first;
    FAttributes tree;
    tree.setObject("a", first);
    tree.setObject("b", first);
    const std::string id1 = idOf(first), id2 = idOf(second);
    EXPECT_EQ(linesOf(tree), "   <obj name=\"a\" ID=\"" + id1 + "\"/>\r   <obj name=\"b\" ID=\"" + id1 +
                                 "\"/>\r\r   <obj class=\"StoredNode\" ID=\"" + id1 +
                                 "\">\r      <obj name=\"Next\" ID=\"" + id2 +
                                 "\"/>\r      <int name=\"Number\" value=\"1\"/>\r   </obj>\r"
                                 "\r   <obj class=\"StoredNode\" ID=\"" +
                                 id2 + "\">\r      <obj name=\"Next\" ID=\"" + id1 +
                                 "\"/>\r      <int name=\"Number\" value=\"2\"/>\r   </obj>\r\r");
    second->next = nullptr;
}

TEST(FXmlArchive, WritesRootsBeforeTheObjects)
{
    auto shared = adopt(new StoredNode(2));
    auto local = adopt(new StoredNode(1, shared));
    auto stream = adopt(new FMemoryStream);
    FXmlArchive archive(stream, true);
    archive.addRoot("lo<cal", local);
    archive.addGlobalRoot("global", shared);
    ASSERT_TRUE(archive.save("doc"));
    const std::string id = idOf(shared);
    EXPECT_EQ(contentOf(*stream), kHeader +
                                      "<doc>\r   <rootObjects>\r"
                                      "      <root name=\"global\" ID=\"" +
                                      id +
                                      "\"/>\r      <root name=\"lo&lt;cal\">\r"
                                      "         <obj name=\"Next\" ID=\"" +
                                      id +
                                      "\"/>\r         <int name=\"Number\" value=\"1\"/>\r"
                                      "      </root>\r   </rootObjects>\r"
                                      "\r   <obj class=\"StoredNode\" name=\"global\" ID=\"" +
                                      id +
                                      "\">\r      <int name=\"Number\" value=\"2\"/>\r   </obj>\r\r</doc>\r");

    stream->rewind();
    FXmlArchive reader(stream, false);
    ASSERT_TRUE(reader.load("doc"));
    auto* tree = FCast(FAttributes, reader.getRoot("lo<cal", "FAttributes"));
    ASSERT_TRUE(tree);
    EXPECT_EQ(tree->getInt("Number"), 1);
    auto* root = FCast(StoredNode, reader.getRoot("lo<cal", "StoredNode"));
    ASSERT_TRUE(root);
    EXPECT_EQ(reader.getRoot("lo<cal", "StoredNode"), root) << "made once";
    EXPECT_EQ(reader.getGlobalRoot("global", "StoredNode"), root->next.get());
    EXPECT_EQ(reader.getRoot("missing", nullptr), nullptr);
}

TEST(FXmlArchive, EveryKindComesBackAndIsSavedAgainAsItWas)
{
    const int before = StoredNode::alive;
    {
        FAttributes read, again, made;
        ASSERT_TRUE(load(save(*makeSampleTree()), read));
        ASSERT_TRUE(load(save(read), again)) << "placeholders are saved with their stored trees";
        EXPECT_EQ(describeSample(read), kWholeSample);
        EXPECT_EQ(describeSample(again), kWholeSample);
        ASSERT_TRUE(load(save(read), made)) << "and those that were made by what they store";
        EXPECT_EQ(describeSample(made), kWholeSample);
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FXmlArchive, EveryCharacterComesBackInKeysAndTexts)
{
    FAttributes tree;
    for (int c = 1; c < 256; c++)
        tree.set((std::string("k") + static_cast<char>(c)).c_str(),
                 std::string(2, static_cast<char>(c)).c_str());
    std::u16string wide;
    for (char16 c = 1; c < 0x800; c++)
    {
        wide = {c, c, u'-', c};
        tree.set(("w" + std::to_string(c)).c_str(), wide.c_str());
        tree.queueString16("q", wide.c_str());
    }
    tree.set("x", u"\U0001F3B5\u3042\uFFFD\uFEFF");
    FAttributes read;
    ASSERT_TRUE(load(save(tree), read));
    ASSERT_EQ(read.total(), tree.total());
    for (int i = 0; i < tree.total(); i++)
    {
        FString expected, text;
        ASSERT_STREQ(read.entryAt(i)->getKey(), tree.entryAt(i)->getKey());
        const bool isText = tree.entryAt(i)->getString(expected);
        ASSERT_EQ(read.entryAt(i)->getString(text), isText);
        EXPECT_EQ(text.isWideString(), expected.isWideString()) << tree.entryAt(i)->getKey();
        EXPECT_EQ(text, expected) << tree.entryAt(i)->getKey();
    }
    for (FString expected, text; tree.unqueueString("q", expected);)
        EXPECT_TRUE(read.unqueueString("q", text) && text == expected);
}

TEST(FXmlArchive, FloatsAreWrittenAsByPrintfAndComeBackBitForBit)
{
    std::mt19937_64 random(7);
    std::vector<double> numbers = {0.0,    -0.0,          1.0,      1e22,      1e23,
                                   5e-324, 123456789.125, INFINITY, -INFINITY, 1.7976931348623157e308};
    while (numbers.size() < 2000)
    {
        const uint64 bits = random();
        double number = 0;
        memcpy(&number, &bits, sizeof(number));
        if (!std::isnan(number))
            numbers.push_back(number);
    }
    FAttributes tree;
    for (const double number : numbers)
        tree.queueFloat("q", number);
    const std::string text = save(tree);
    FAttributes read;
    ASSERT_TRUE(load(text, read));
    size_t position = 0;
    for (const double number : numbers)
    {
        char expected[1100];
        snprintf(expected, sizeof(expected), "<item value=\"%.50g\"/>", number);
        position = text.find(expected, position);
        ASSERT_NE(position, std::string::npos) << expected;
        double back = 0;
        ASSERT_TRUE(read.unqueueFloat("q", back));
        EXPECT_EQ(memcmp(&back, &number, sizeof(number)), 0) << expected;
    }
}

TEST(FXmlArchive, CirclesComeBackAndNeverLeak)
{
    const int before = StoredNode::alive;
    const std::string text =
        kHeader + "<x><obj name='a' ID='1'/><obj class='StoredNode' ID='1'><int name='Number' value='1'/>"
                  "<obj name='Next' ID='2'/></obj><obj class='StoredNode' ID='2'>"
                  "<int name='Number' value='2'/><obj name='Next' ID='1'/></obj></x>";
    FAttributes unused;
    EXPECT_TRUE(load(text, unused)) << "the leak check of the sanitizer sees what would be kept";
    {
        FAttributes tree;
        ASSERT_TRUE(load(text, tree));
        auto* first = FCast(StoredNode, tree.getObject("a", "StoredNode"));
        ASSERT_TRUE(first && first->nextNode());
        EXPECT_EQ(first->nextNode()->nextNode(), first);
        first->nextNode()->next = nullptr;
    }
    EXPECT_EQ(StoredNode::alive, before);
}

TEST(FXmlArchive, LongChainsOfObjectsAreSavedReadAndReleased)
{
    constexpr int length = 20000;
    std::string text;
    {
        std::vector<IPtr<StoredNode>> chain;
        for (int i = 0; i < length; i++)
            chain.push_back(adopt(new StoredNode(i, i ? chain.back().get() : nullptr)));
        FAttributes tree;
        tree.setObject("a", chain.back());
        text = save(tree);
        for (auto& node : chain)
            node->next = nullptr;
    }
    FAttributes tree;
    ASSERT_TRUE(load(text, tree));
    EXPECT_EQ(tree.getObjectAttributes("a")->getInt("Number"), length - 1);
    int made = 0;
    for (auto* node = FCast(StoredNode, tree.getObject("a", "StoredNode")); node; node = node->nextNode())
        made++;
    EXPECT_EQ(made, FArchive::kMaxDepth) << "deeper ones are not made, rather than exhaust the stack";
}

TEST(FXmlArchive, ReferencesToNothingAreNoError)
{
    FAttributes tree;
    ASSERT_TRUE(load("<x><obj name='a' ID='77'/><int name='n' value='1'/></x>", tree));
    EXPECT_EQ(tree.getObject("a", nullptr), nullptr);
    EXPECT_EQ(tree.getInt("n"), 1);
    FAttributes again;
    EXPECT_TRUE(load(save(tree), again));
}

TEST(FXmlArchive, TakesOnlyWhatItWrites)
{
    for (const char* text : {"",
                             "<y></y>",
                             "<x>",
                             "<x><int name='a' value='1'/>",
                             "<x><unknown/></x>",
                             "<x><int value='1'/></x>",
                             "<x><int name='a'/></x>",
                             "<x><int name='a' value='x'/></x>",
                             "<x><float name='a' value=''/></x>",
                             "<x><string name='a'/></x>",
                             "<x><item value='1'/></x>",
                             "<x><rootObjects/></x>",
                             "<x><root name='a'/></x>",
                             "<x><list name='a' type='nonsense'/></x>",
                             "<x><list name='a' type='int'><int name='b' value='1'/></list></x>",
                             "<x><list name='a' type='int'><item value='x'/></list></x>",
                             "<x><bin name='a'>0G</bin></x>",
                             "<x><bin name='a'>012</bin></x>",
                             "<x><obj name='a'/></x>",
                             "<x><obj class='StoredNode'/></x>",
                             "<x><member name='a'><obj class='StoredNode' ID='1'/></member></x>",
                             "<x><member/></x>",
                             "<x></x><x></x>",
                             "<x><int name='a' value='1'><int name='b' value='1'/></int></x>",
                             "<x></y>"})
    {
        FAttributes tree;
        EXPECT_FALSE(load(text, tree)) << text;
    }
    for (const char* text : {"<x/>", "<x></x>", "<x><int name='a' value='1'></int></x>",
                             "<x><member name='a'/><list name='q' type='obj'/><bin name='b'/></x>",
                             "<!-- c --><x>\n\t text </x>\n"})
    {
        FAttributes tree;
        EXPECT_TRUE(load(text, tree)) << text;
    }
}

TEST(FXmlArchive, AnErrorLeavesWhatWasReadBefore)
{
    FAttributes tree;
    EXPECT_FALSE(load(
        "<x><int name='a' value='1'/><member name='m'><int name='b' value='2'/><bad/></member></x>", tree));
    EXPECT_EQ(tree.getInt("a"), 1);
    EXPECT_EQ(tree.getAttributes("m")->getInt("b"), 2);
}

TEST(FXmlArchive, DecodesNamedCharactersByTheTableAskedFor)
{
    const std::string text =
        "<x><rootObjects><root name='r'><string name='s' value='&eacute;'/></root></rootObjects></x>";
    FXmlArchive mac(streamOf(text), false), windows(streamOf(text), false);
    ASSERT_TRUE(mac.load("x") && windows.load("x", nullptr, true));
    EXPECT_STREQ(FCast(FAttributes, mac.getRoot("r", "FAttributes"))->getString8("s"), "&eacute;");
    EXPECT_STREQ(FCast(FAttributes, windows.getRoot("r", "FAttributes"))->getString8("s"), "\xE9");
}

TEST(FXmlArchive, WhatCouldNotBeReadAgainIsNotSaved)
{
    FAttributes tree, read;
    const auto isSaved = [&]
    { return FXmlArchive(adopt(new FMemoryStream), true).saveAttributes("x", tree); };
    tree.set("s", std::string(2047, 'a').c_str());
    EXPECT_TRUE(load(save(tree), read));
    tree.set("s", std::string(2048, 'a').c_str());
    EXPECT_FALSE(isSaved());
    tree.set("s", std::u16string(1000, u'&').c_str());
    EXPECT_FALSE(isSaved()) << "entities count";
}

TEST(FXmlArchive, ObjectsThatRefuseToStoreFailTheSaving)
{
    auto refusing = adopt(new StoredNode(1));
    refusing->refusesToStore = true;
    FAttributes tree;
    tree.setObject("a", refusing);
    EXPECT_FALSE(FXmlArchive(adopt(new FMemoryStream), true).saveAttributes("x", tree));
    FXmlArchive archive(adopt(new FMemoryStream), true);
    archive.addRoot("r", refusing);
    EXPECT_FALSE(archive.save("x"));
    EXPECT_FALSE(FXmlArchive(adopt(new FMemoryStream), false).save("x")) << "an archive for reading";
}

TEST(FXmlArchive, DepthIsLimitedAlikeInWritingAndReading)
{
    const auto nested = [](int depth)
    {
        auto tree = adopt(new FAttributes);
        for (int i = 1; i < depth; i++)
        {
            auto outer = adopt(new FAttributes);
            outer->setAttributes("m", tree);
            tree = outer;
        }
        return tree;
    };
    FAttributes read;
    EXPECT_TRUE(load(save(*nested(FArchive::kMaxDepth)), read));
    EXPECT_FALSE(
        FXmlArchive(adopt(new FMemoryStream), true).saveAttributes("x", *nested(FArchive::kMaxDepth + 1)));
    std::string text = "<x>";
    for (int i = 0; i < 100000; i++)
        text += "<member name='m'>";
    EXPECT_FALSE(load(text, read));
}

TEST(FXmlArchive, AFullDiskFailsTheSaving)
{
    const auto tree = makeSampleTree();
    const auto size = static_cast<int64>(save(*tree).size());
    for (int64 room = 0; room < size; room++)
        EXPECT_FALSE(FXmlArchive(adopt(new FullStream(room)), true).saveAttributes("x", *tree)) << room;
    EXPECT_TRUE(FXmlArchive(adopt(new FullStream(size)), true).saveAttributes("x", *tree));
}

TEST(FXmlArchive, DamagedBytesFailOrReadAndNeverMore)
{
    const std::string whole = save(*makeSampleTree());
    for (size_t i = 0; i < whole.size(); i++)
    {
        FAttributes cut;
        EXPECT_EQ(load(whole.substr(0, i), cut), i == whole.size() - 1) << "cut at " << i;
        for (const char value : {'\0', '<', '>', '"', '\xFF'})
        {
            std::string bytes = whole;
            bytes[i] = value;
            FAttributes damaged;
            if (load(bytes, damaged))
                describeSample(damaged);
        }
    }
}
