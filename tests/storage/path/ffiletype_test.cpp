#include "storage/path/stdfiletype.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fmemorystream.h"
#include "tests/storage/filefixture.h"

namespace
{
FFileType riff("audio/x-riff", "riff", "riff", 0, "RIFF File");

FFileType* identifyRiff(unsigned char* header, int length)
{
    return length >= 4 && memcmp(header, "RIFF", 4) == 0 ? &riff : nullptr;
}

FFileType* identifyAll(unsigned char*, int)
{
    static FFileType type(nullptr, "any", nullptr, 0, "Any");
    return &type;
}

TEST(FFileType, EqualByTheFirstWordInCommon)
{
    const FFileType text("text/plain", "txt", "txt", fourCharCode("TEXT"), "Text File");
    EXPECT_TRUE(text == FFileType(nullptr, "txt", nullptr, 0, nullptr));
    EXPECT_TRUE(text == FFileType("image/png", "png", "txt", 0, nullptr))
        << "a word that differs decides nothing";
    EXPECT_TRUE(text == FFileType(nullptr, "log", nullptr, fourCharCode("TEXT"), nullptr));
    EXPECT_FALSE(text == FFileType("TEXT/plain", "TXT", "Txt", 0, "Text File"))
        << "case counts, the name doesn't";
    EXPECT_FALSE(FFileType() == FFileType());
    EXPECT_FALSE(FFileType(nullptr, nullptr, nullptr, 0, "Name").isValid());
    EXPECT_TRUE(FFileType(nullptr, nullptr, nullptr, 1, nullptr).isValid());
}

TEST(FFileType, TextFilesAreKnown)
{
    FFileType* type = FFileType::getTypeByString(u"txt");
    ASSERT_EQ(type, &StdFileType::getTextFileType());
    EXPECT_EQ(utf8(type->getMimeType()), "text/plain");
    EXPECT_EQ(type->getMacType(), 0x54455854);
    EXPECT_EQ(utf8(type->getName()), "Text File");
    EXPECT_EQ(FFileType::getTypeByString(u"TXT"), nullptr);
    EXPECT_EQ(FFileType::getTypeByString(u""), nullptr);
}

TEST(FFileType, FirstRegisteredWins)
{
    FFileType first(nullptr, "twice", "twice", 0, "First");
    FFileType second(nullptr, "twice", "twice", 0, "Second");
    FFileType::registerType(&first);
    FFileType::registerType(&second);
    EXPECT_EQ(FFileType::getTypeByString(u"twice"), &first);
    FFileType::unregisterType(&first);
    FFileType::unregisterType(&second);
    EXPECT_EQ(FFileType::getTypeByString(u"twice"), nullptr);
}

TEST(FFileType, KnownByTheBeginningOfTheContent)
{
    const IPtr<FMemoryStream> stream = adopt(new FMemoryStream);
    EXPECT_EQ(FFileType::getTypeByStream(stream), nullptr);
    FFileType::registerTypeIdentifier(identifyRiff);
    FFileType::registerTypeIdentifier(identifyAll);
    EXPECT_EQ(FFileType::getTypeByStream(stream), nullptr) << "nothing to read";
    stream->writeString8("RIFFxxxx", false);
    EXPECT_EQ(FFileType::getTypeByStream(stream), &riff);
    EXPECT_EQ(stream->tell(), 0);
    stream->writeString8("LIST", false);
    EXPECT_EQ(FFileType::getTypeByStream(stream), identifyAll(nullptr, 0));
    EXPECT_EQ(FFileType::getTypeByStream(nullptr), nullptr);
}
} // namespace
