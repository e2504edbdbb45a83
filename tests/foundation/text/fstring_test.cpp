#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "foundation/text/fbase64.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/stream/fmemorystream.h"
#include "texts.h"

#include <gtest/gtest.h>

namespace
{
std::string stored(const FString& text)
{
    FMemoryStream stream;
    EXPECT_TRUE(text.store(stream));
    return std::string(stream.getData(), static_cast<std::size_t>(stream.getSize()));
}

/// The text that these bytes give, and where the stream stands thereafter.
std::string loaded(std::string bytes)
{
    FMemoryStream stream(bytes.data(), static_cast<int64>(bytes.size()));
    FString text("before");
    const bool isGood = text.load(stream);
    return (isGood ? "" : "failed:") + shape(text) + "@" + std::to_string(stream.tell());
}

std::string withLength(int32 length, const std::string& bytes)
{
    return std::string(reinterpret_cast<const char*>(&length), 4) + bytes;
}

const std::string kMarker = "\xEF\xBB\xBF";
const std::string kZero(1, '\0');
} // namespace

TEST(FString, StoresBothWidths)
{
    EXPECT_EQ(stored("abc"), withLength(4, "abc" + kZero));
    EXPECT_EQ(stored("\x8A"), withLength(2, "\x8A" + kZero)) << "bytes go out as they are";
    EXPECT_EQ(stored(u"ä"), withLength(2 + 4, "ä" + kZero + kMarker));
    EXPECT_EQ(stored(""), withLength(0, ""));
    EXPECT_EQ(stored(u""), withLength(0, ""));

    FMemoryStream stream;
    EXPECT_TRUE(FString::storeString8(stream, "abc", 2));
    EXPECT_TRUE(FString::storeString16(stream, u"ä"));
    EXPECT_TRUE(FString::storeString16(stream, nullptr));
    EXPECT_EQ(std::string(stream.getData(), static_cast<std::size_t>(stream.getSize())),
              withLength(3, "ab" + kZero) + withLength(6, "ä" + kZero + kMarker) + withLength(0, ""));
}

TEST(FString, GoesThroughStreamsOfOtherByteOrderAndArchives)
{
    FMemoryStream stream;
    stream.setByteOrder(1);
    EXPECT_TRUE(FString(u"ä").store(stream));
    const std::string bytes(stream.getData(), static_cast<std::size_t>(stream.getSize()));
    EXPECT_EQ(bytes, std::string("\0\0\0\6", 4) + "ä" + kZero + kMarker);
    stream.rewind();
    FString text;
    EXPECT_TRUE(text.load(stream));
    EXPECT_EQ(shape(text), "wide:ä");

    const auto file = adopt(new FMemoryStream);
    FNewArchive writer(file, true);
    EXPECT_TRUE(CmString(u"ä").externalize(writer));
    EXPECT_TRUE(CmString("narrow").externalize(writer));
    file->rewind();
    FNewArchive reader(file, false);
    for (const char* expected : {"wide:ä", "narrow:narrow"})
    {
        CmString restored;
        EXPECT_TRUE(restored.internalize(reader));
        EXPECT_EQ(shape(restored), expected);
    }
}

TEST(FString, LoadsEveryFormThatWasEverWritten)
{
    EXPECT_EQ(loaded(withLength(4, "abc" + kZero)), "narrow:abc@8");
    EXPECT_EQ(loaded(withLength(3, "abc")), "narrow:abc@7") << "without its zero";
    EXPECT_EQ(loaded(withLength(6, "ä" + kZero + kMarker)), "wide:ä@10");
    EXPECT_EQ(loaded(withLength(6, kMarker + "ä" + kZero)), "wide:ä@10") << "the mark in front";
    EXPECT_EQ(loaded(withLength(0, "")), "narrow:@4");
    EXPECT_EQ(loaded(withLength(-1, "abc")), "narrow:@4");
    EXPECT_EQ(loaded(withLength(3, kMarker)), "wide:@7");
    EXPECT_EQ(loaded(withLength(9, "abc")), "failed:narrow:before@7");
    EXPECT_EQ(loaded("ab"), "failed:narrow:before@2");
}

TEST(FString, SkipsWhatIsTooLong)
{
    const std::string text(50000, 'x');
    EXPECT_EQ(loaded(withLength(50000, text)), "narrow:" + text + "@50004");
    EXPECT_EQ(loaded(withLength(50001, text + "x")), "failed:narrow:before@50005");
}

TEST(FBase64, EncodesAndDecodesSevenBitText)
{
    const char* pairs[][2] = {{"f", "Zg=="},        {"fo", "Zm8="},        {"foo", "Zm9v"},
                              {"foob", "Zm9vYg=="}, {"fooba", "Zm9vYmE="}, {"foobar", "Zm9vYmFy"},
                              {"~~~?>", "fn5+Pz4="}};
    for (const auto& pair : pairs)
    {
        FString text(pair[0]);
        EXPECT_TRUE(FBase64::encode(text));
        EXPECT_EQ(shape(text), std::string("narrow:") + pair[1]);
        EXPECT_TRUE(FBase64::decode(text));
        EXPECT_EQ(shape(text), std::string("narrow:") + pair[0]);
    }
    FString wideText(u"foo");
    EXPECT_TRUE(FBase64::encode(wideText));
    EXPECT_EQ(wideText, "Zm9v");
}

TEST(FBase64, RefusesWhatIsNotItsOwn)
{
    for (const ConstString& bad : {ConstString(""), ConstString("a\x80"), ConstString(u"größe")})
    {
        FString text(bad);
        EXPECT_FALSE(FBase64::encode(text));
        EXPECT_EQ(shape(text), shape(bad));
    }
    for (const char* bad :
         {"Zg=", "Z===", "Zg=x", "=Zg=", "Zm9v=Zg=", "Z*==", "Zm9vZ", "gIA=", "Zm 9", "Zm9-"})
    {
        FString text(bad);
        EXPECT_FALSE(FBase64::decode(text)) << bad;
        EXPECT_EQ(text, bad);
    }
    FString empty("");
    EXPECT_TRUE(FBase64::decode(empty));
}
