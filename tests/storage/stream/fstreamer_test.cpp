#include "streamfixture.h"

#include <gtest/gtest.h>

#include <memory>

namespace
{
std::string written(int16 byteOrder, void (*write)(FStreamer&))
{
    FMemoryStream stream;
    stream.setByteOrder(byteOrder);
    write(stream);
    return bytesOf(stream);
}

std::u16string readUtf8(FStreamer& stream, int maxChars = 100)
{
    std::u16string text(static_cast<size_t>(maxChars), u'?');
    const int length = stream.readStringUtf8(text.data(), maxChars);
    EXPECT_EQ(text[static_cast<size_t>(length)], 0);
    return text.substr(0, static_cast<size_t>(length));
}

std::string readText(FStreamer& stream, int64 size)
{
    std::string text(static_cast<size_t>(size), '?');
    const int64 length = stream.readString8(text.data(), size);
    EXPECT_EQ(text[static_cast<size_t>(length)], 0);
    return text.substr(0, static_cast<size_t>(length));
}
} // namespace

TEST(FStreamer, WritesLittleEndianOrReversed)
{
    const struct
    {
        void (*write)(FStreamer&);
        std::string plain, reversed;
    } rows[] = {
        {[](FStreamer& s) { s.writeChar8('a'); }, "a", "a"},
        {[](FStreamer& s) { s.writeUChar8(0xFE); }, "\xFE", "\xFE"},
        {[](FStreamer& s) { s.writeChar16(u'\x1234'); }, "\x34\x12", "\x12\x34"},
        {[](FStreamer& s) { s.writeInt16(-2); }, "\xFE\xFF", "\xFF\xFE"},
        {[](FStreamer& s) { s.writeInt16u(0x1234); }, "\x34\x12", "\x12\x34"},
        {[](FStreamer& s) { s.writeInt32(0x12345678); }, "\x78\x56\x34\x12", "\x12\x34\x56\x78"},
        {[](FStreamer& s) { s.writeInt32u(0x89ABCDEFu); }, "\xEF\xCD\xAB\x89", "\x89\xAB\xCD\xEF"},
        {[](FStreamer& s) { s.writeFloat(1.0f); }, std::string("\0\0\x80\x3F", 4),
         std::string("\x3F\x80\0\0", 4)},
        {[](FStreamer& s) { s.writeInt64(0x1122334455667788); }, "\x88\x77\x66\x55\x44\x33\x22\x11",
         "\x11\x22\x33\x44\x55\x66\x77\x88"},
        {[](FStreamer& s) { s.writeInt64u(0xFFEEDDCCBBAA9988u); }, "\x88\x99\xAA\xBB\xCC\xDD\xEE\xFF",
         "\xFF\xEE\xDD\xCC\xBB\xAA\x99\x88"},
        {[](FStreamer& s) { s.writeDouble(1.0); }, std::string("\0\0\0\0\0\0\xF0\x3F", 8),
         std::string("\x3F\xF0\0\0\0\0\0\0", 8)},
        {[](FStreamer& s) { s.writeBool(true); }, std::string("\1\0", 2), std::string("\0\1", 2)},
    };
    for (const auto& row : rows)
    {
        EXPECT_EQ(written(0, row.write), row.plain) << &row - rows;
        EXPECT_EQ(written(1, row.write), row.reversed) << &row - rows;
    }
}

TEST(FStreamer, ReadsBackWhatItWrote)
{
    for (int16 byteOrder : {int16{0}, int16{1}})
    {
        FMemoryStream stream;
        stream.setByteOrder(byteOrder);
        stream.writeInt32(-77);
        stream.writeDouble(0.1);
        stream.writeFloat(-2.5f);
        stream.writeInt64u(1ull << 63);
        stream.rewind();
        int32 number;
        double real;
        float half;
        uint64 wide;
        EXPECT_TRUE(stream.readInt32(number) && stream.readDouble(real) && stream.readFloat(half) &&
                    stream.readInt64u(wide));
        EXPECT_EQ(number, -77);
        EXPECT_EQ(real, 0.1);
        EXPECT_EQ(half, -2.5f);
        EXPECT_EQ(wide, 1ull << 63);
    }
}

TEST(FStreamer, AFailedReadZeroesItsTarget)
{
    FMemoryStream stream = streamOf("abc");
    int32 number = 7;
    EXPECT_FALSE(stream.readInt32(number));
    EXPECT_EQ(number, 0);
    bool flag = true;
    EXPECT_FALSE(stream.readBool(flag));
    EXPECT_FALSE(flag);
}

TEST(FStreamer, AnyNumberButZeroIsTrue)
{
    FMemoryStream stream = streamOf(std::string("\0\1\0\0", 4));
    bool first = false, second = true;
    EXPECT_TRUE(stream.readBool(first) && stream.readBool(second));
    EXPECT_TRUE(first);
    EXPECT_FALSE(second);
}

TEST(FStreamer, ARowStopsAtTheFirstFailure)
{
    FMemoryStream stream;
    const int16 numbers[] = {1, 2, 3};
    EXPECT_TRUE(stream.writeInt16Array(numbers, 3));
    stream.writeChar8('x');
    stream.rewind();
    int16 read[5] = {9, 9, 9, 9, 9};
    EXPECT_FALSE(stream.readInt16Array(read, 5));
    EXPECT_EQ(std::vector<int16>(read, read + 5), (std::vector<int16>{1, 2, 3, 0, 9}));
}

TEST(FStreamer, SkipsAndPads)
{
    FMemoryStream stream = streamOf("abc");
    EXPECT_TRUE(stream.skip(2));
    EXPECT_EQ(stream.tell(), 2);
    EXPECT_FALSE(stream.skip(2));
    EXPECT_TRUE(stream.pad(3));
    EXPECT_EQ(bytesOf(stream), std::string("abc\0\0\0", 6));
}

TEST(FStreamer, CountedTextRoundTrips)
{
    FMemoryStream stream;
    EXPECT_TRUE(stream.writeStr8("abc"));
    EXPECT_TRUE(stream.writeStr8(nullptr));
    EXPECT_TRUE(stream.writeStr8(""));
    EXPECT_EQ(bytesOf(stream), std::string("\4\0\0\0abc\0\0\0\0\0\1\0\0\0\0", 17));
    EXPECT_EQ(FStreamer::getStr8Size("abc"), 8);
    stream.rewind();
    std::unique_ptr<char[]> text(stream.readStr8());
    EXPECT_STREQ(text.get(), "abc");
    EXPECT_EQ(stream.readStr8(), nullptr);
    text.reset(stream.readStr8());
    EXPECT_STREQ(text.get(), "");
    EXPECT_EQ(stream.readStr8(), nullptr) << "the end";
}

TEST(FStreamer, DamagedCountsOfTextAreSurvived)
{
    FMemoryStream negative = streamOf("\xFF\xFF\xFF\xFF");
    EXPECT_EQ(negative.readStr8(), nullptr);
    FMemoryStream huge = streamOf("\xFF\xFF\xFF\x7F"
                                  "abc");
    std::unique_ptr<char[]> text(huge.readStr8());
    EXPECT_STREQ(text.get(), "abc");
    const std::string body(200000, 'x');
    FMemoryStream longText;
    longText.writeStr8(body.c_str());
    longText.rewind();
    text.reset(longText.readStr8());
    EXPECT_EQ(text.get(), body);
}

TEST(FStreamer, ReadsLinesAndTerminatedText)
{
    FMemoryStream stream = streamOf(std::string("one\r\ntwo\nthree\0four\rx\nend", 25));
    for (const char* expected : {"one", "two", "three", "four\rx", "end", ""})
        EXPECT_EQ(readText(stream, 20), expected);
    FMemoryStream full = streamOf("abcdef");
    EXPECT_EQ(readText(full, 4), "abc");
    EXPECT_EQ(full.tell(), 4);
}

TEST(FStreamer, Utf8TextBearsAMarkWhereItIsNotAscii)
{
    EXPECT_EQ(written(0, [](FStreamer& s) { s.writeStringUtf8(u"abc"); }), std::string("abc\0", 4));
    EXPECT_EQ(written(0, [](FStreamer& s) { s.writeStringUtf8(u"ä"); }),
              std::string("\xEF\xBB\xBF\xC3\xA4\0", 6));
    EXPECT_EQ(written(0, [](FStreamer& s) { s.writeString8("ab", false); }), "ab");
    EXPECT_EQ(written(0, [](FStreamer& s) { s.writeString8("ab", true); }), std::string("ab\0", 3));

    FMemoryStream stream;
    for (const char16* text : {u"abc", u"Größe 🎵", u"", u"z"})
        stream.writeStringUtf8(text);
    stream.rewind();
    for (const char16* text : {u"abc", u"Größe 🎵", u"", u"z", u""})
        EXPECT_EQ(readUtf8(stream), text);
}

TEST(FStreamer, TextWithoutAMarkIsInTheSystemsEncoding)
{
    FMemoryStream stream = streamOf("\x8A");
    EXPECT_EQ(readUtf8(stream), u"") << "one byte alone counts as no text";
    FMemoryStream two = streamOf("\x8A"
                                 "b");
    EXPECT_EQ(readUtf8(two), u"äb");
    FMemoryStream cut = streamOf(std::string("abcdef\0x", 8));
    EXPECT_EQ(readUtf8(cut, 4), u"abc");
    EXPECT_EQ(readFrom(cut, 5), "x");
}
