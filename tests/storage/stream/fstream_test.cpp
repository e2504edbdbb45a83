#include "storage/stream/fstream.h"

#include "foundation/object/iptr.h"
#include "storage/stream/fbufferstream.h"
#include "streamfixture.h"

#include <gtest/gtest.h>

#include <vector>

namespace
{
using Lines = std::vector<std::string>;

Lines linesOf(const std::string& bytes, bool trim)
{
    FMemoryStream stream = streamOf(bytes);
    CmBuffer line;
    Lines lines;
    while (stream.readLine(line, trim))
    {
        EXPECT_EQ(line.ptr()[line.getFillSize()], 0);
        lines.emplace_back(line.ptr(), line.getFillSize());
    }
    return lines;
}
} // namespace

TEST(FStream, ReadsLines)
{
    const struct
    {
        std::string bytes;
        Lines plain, trimmed;
    } rows[] = {
        {"a\r\n\r\nb", {"a", "b"}, {"a", "b"}},
        {"\n", {""}, {""}},
        {"\r\n\nx\n", {"", "x"}, {"", "x"}},
        {"", {}, {}},
        {" a \t\n\t b c\t", {" a \t", "\t b c\t"}, {"a", "b c"}},
        {"  \n  ", {"  ", "  "}, {"", ""}},
    };
    for (const auto& row : rows)
    {
        EXPECT_EQ(linesOf(row.bytes, false), row.plain) << row.bytes;
        EXPECT_EQ(linesOf(row.bytes, true), row.trimmed) << row.bytes;
    }
}

TEST(FStream, AfterTheLastLineItSeeksToMinusOne)
{
    FMemoryStream stream = streamOf("ab");
    CmBuffer line;
    EXPECT_TRUE(stream.readLine(line, false));
    EXPECT_EQ(stream.tell(), -1);
    EXPECT_FALSE(stream.readLine(line, false));
}

TEST(FStream, CopiesPiecesWithoutLookingAtResults)
{
    FMemoryStream source = streamOf(std::string(1500, 'a')), target, plain;
    CmBuffer block(4096);
    FBufferStream into(block);
    EXPECT_TRUE(into.read(source, 1400));
    EXPECT_EQ(into.tell(), 1400);
    EXPECT_EQ(source.tell(), 1400);
    EXPECT_TRUE(source.write(target, 200));
    EXPECT_EQ(bytesOf(target), std::string(100, 'a') + std::string(100, '\0'))
        << "nobody's memory goes along";
}

TEST(FStream, CopiesWholeStreams)
{
    std::string bytes(2500, 'x');
    bytes += "end";
    FMemoryStream source = streamOf(bytes);
    source.seek(100, kSeekStart);
    FMemoryStream target;
    EXPECT_TRUE(target.copyFrom(source));
    EXPECT_EQ(bytesOf(target), bytes);
    EXPECT_TRUE(target.isStreamEqual(source));

    CountingStream failing;
    failing.failsWriting = true;
    EXPECT_FALSE(failing.copyFrom(source));
    CmBuffer block(10);
    block.setFillSize(3);
    FBufferStream rewound(block);
    FMemoryStream other;
    EXPECT_TRUE(rewound.copyTo(other));
    EXPECT_EQ(other.getSize(), 10);
}

TEST(FStream, ComparesContents)
{
    FMemoryStream stream = streamOf("abc"), same = streamOf("abc"), longer = streamOf("abcd"),
                  other = streamOf("abd");
    FMemoryStream page = streamOf(std::string(1024, 'a')), more = streamOf(std::string(1024, 'a') + "b");
    EXPECT_TRUE(stream.isStreamEqual(same));
    EXPECT_FALSE(stream.isStreamEqual(longer));
    EXPECT_FALSE(stream.isStreamEqual(other));
    EXPECT_FALSE(page.isStreamEqual(more));
}

TEST(FStream, ReportsToComponentsByResultCodes)
{
    FMemoryStream stream;
    auto view = adopt(askInterface<IBStream>(static_cast<CmObject*>(&stream)));
    ASSERT_TRUE(view);
    char bytes[] = "abc";
    int count = 77;
    EXPECT_EQ(view->write(bytes, 3, &count), 0);
    EXPECT_EQ(count, 3);
    count = 77;
    EXPECT_EQ(view->read(bytes, 3, &count), 1) << "the end is a failure";
    EXPECT_EQ(count, 77);

    int64 position = 0;
    EXPECT_EQ(view->seek(-1, 1, &position), 0);
    EXPECT_EQ(position, 2);
    EXPECT_EQ(view->seek(0, 2, nullptr), 0);
    EXPECT_EQ(view->tell(&position), 0);
    EXPECT_EQ(position, 3);
    EXPECT_EQ(view->seek(1, 99, &position), 0) << "any other mode counts from the start";
    EXPECT_EQ(position, 1);
    EXPECT_EQ(view->read(bytes, 3, nullptr), 0);
    EXPECT_EQ(view->tell(nullptr), 2);
    EXPECT_EQ(view->seek(-5, 0, &position), 1);
    EXPECT_EQ(position, -5);
    EXPECT_EQ(toFStream(view), &stream);

    FMemoryStream full(bytes, 2);
    EXPECT_EQ(static_cast<IBStream&>(full).write(bytes, 3, &count), 1);
}

TEST(FStream, Writes16BitTextAsItIs)
{
    FMemoryStream stream;
    stream.setByteOrder(1);
    EXPECT_EQ(stream.writeString16(u"ab", true), 6);
    EXPECT_EQ(stream.writeString16(u"c", false), 2);
    EXPECT_EQ(bytesOf(stream), std::string("a\0b\0\0\0c\0", 8));
}
