#include "storage/xml/fplugxmlparser.h"
#include "xmltestsupport.h"

#include <gtest/gtest.h>

namespace
{
class Definition : public FObject, public IXmlParserDef
{
    FORWARD_FUNKNOWN(FObject)

public:
    int32 queryInterface(const char* id, void** object) override
    {
        return FObject::queryInterface(id, object);
    }
    bool startTag(const char* name, int count, const char** names, const char** values, bool isEmpty,
                  void* data) override
    {
        record += std::string("<") + name;
        for (int i = 0; i < count; i++)
            record += std::string(" ") + names[i] + "=" + values[i];
        record += isEmpty ? "/>" : ">";
        if (parser && stopReason >= 0)
            parser->stop(stopReason);
        *static_cast<int*>(data) += 1;
        return true;
    }
    bool endTag(const char* name, void*) override
    {
        record += std::string("</") + name + ">";
        return true;
    }
    void gotData(void* bytes, unsigned int count, void*) override
    {
        record.append(static_cast<char*>(bytes), count);
    }
    void gotComment(const char*, void*, bool) override {}

    std::string record;
    IXmlParser* parser = nullptr;
    int stopReason = -1;
};

class OtherStream : public FObject, public IBStream
{
    FORWARD_FUNKNOWN(FObject)

public:
    int32 queryInterface(const char*, void** object) override
    {
        *object = nullptr;
        return kNoInterface;
    }
    int32 read(void*, int, int*) override { return 1; }
    int32 write(void*, int, int*) override { return 1; }
    int32 seek(int64, int, int64*) override { return 1; }
    int32 tell(int64*) override { return 1; }
};

std::string withAttributes(int count)
{
    std::string text = "<a";
    for (int i = 0; i < count; i++)
        text += " n" + std::to_string(i) + "='1'";
    return text + "/>";
}
} // namespace

TEST(FPlugXmlParser, HandsOnWhatItReads)
{
    TextStream stream("<a b='1'>text<c/></a>");
    Definition definition;
    FPlugXmlParser parser;
    int calls = 0;
    EXPECT_EQ(parser.process(&calls), kXmlNotInitialized);
    EXPECT_EQ(parser.stop(1), kXmlNotInitialized);
    ASSERT_EQ(parser.initialize(&stream, &definition), kResultOk);
    EXPECT_EQ(parser.initialize(&stream, &definition), kXmlAlreadyInitialized);
    EXPECT_EQ(parser.process(&calls), kResultOk);
    EXPECT_EQ(definition.record, "<a b=1>text<c/></a>");
    EXPECT_EQ(calls, 1);
}

TEST(FPlugXmlParser, TakesStreamsOfTheFrameworkOnly)
{
    OtherStream stream;
    Definition definition;
    FPlugXmlParser parser;
    EXPECT_EQ(parser.initialize(&stream, &definition), kXmlInvalidStream);
    EXPECT_EQ(parser.initialize(nullptr, &definition), kXmlInvalidStream);
}

TEST(FPlugXmlParser, RefusesMoreThanFiftyAttributes)
{
    for (const int count : {50, 51})
    {
        TextStream stream(withAttributes(count));
        Definition definition;
        FPlugXmlParser parser;
        int calls = 0;
        parser.initialize(&stream, &definition);
        EXPECT_EQ(parser.process(&calls), count == 50 ? kResultOk : 2);
        EXPECT_EQ(calls, count == 50 ? 1 : 0);
    }
}

TEST(FPlugXmlParser, StopsWithTheErrorOfTheReason)
{
    for (const int reason : {1, 0, 7})
    {
        TextStream stream("<a><b/></a>");
        Definition definition;
        FPlugXmlParser parser;
        definition.parser = &parser;
        definition.stopReason = reason;
        int calls = 0;
        parser.initialize(&stream, &definition);
        EXPECT_EQ(parser.process(&calls), reason == 1 ? 2 : 1);
        EXPECT_EQ(definition.record, "<a>");
    }
}

TEST(FPlugXmlParser, PutsTheStreamBehindTheMainTag)
{
    TextStream stream("<a>x</a>binary");
    Definition definition;
    FPlugXmlParser parser;
    int calls = 0;
    parser.initialize(&stream, &definition);
    parser.stopAfterMainTag();
    EXPECT_EQ(parser.process(&calls), kResultOk);
    EXPECT_GT(stream.tell(), 8) << "the parser reads ahead";
    EXPECT_EQ(parser.repositionStream(), kResultOk);
    EXPECT_EQ(stream.tell(), 8);
}

TEST(FPlugXmlParser, KeepsSpacesOnDemand)
{
    for (const bool keeps : {true, false})
    {
        TextStream stream("<a>  x</a>");
        Definition definition;
        FPlugXmlParser parser;
        int calls = 0;
        parser.initialize(&stream, &definition);
        parser.keepSpaces(true);
        parser.keepSpaces(keeps);
        EXPECT_EQ(parser.process(&calls), kResultOk);
        EXPECT_EQ(definition.record, keeps ? "<a>  x</a>" : "<a>x</a>");
    }
}

TEST(FPlugXmlParser, IsFoundByItsInterfaces)
{
    FPlugXmlParser parser;
    IXmlParser2* view = askInterface<IXmlParser2>(static_cast<FObject*>(&parser));
    ASSERT_NE(view, nullptr);
    const char* name = "";
    EXPECT_EQ(view->getCurrentStartTag(&name), kResultOk);
    EXPECT_EQ(name, nullptr);
    view->release();
}
