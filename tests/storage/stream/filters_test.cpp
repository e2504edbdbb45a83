#include "containers/value/cmbufferpool.h"
#include "foundation/object/iptr.h"
#include "storage/stream/fblockstreamreader.h"
#include "storage/stream/fbufferedstream.h"
#include "storage/stream/fbufferstream.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/ffilestream.h"
#include "storage/stream/fstreamproxy.h"
#include "streamfixture.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <limits>
#include <random>
#include <unistd.h>

namespace
{
/// A file of its own without a name.
IPtr<FFileStream> temporaryFile()
{
    char name[] = "/tmp/filterstestXXXXXX";
    const int descriptor = mkstemp(name);
    unlink(name);
    auto file = adopt(new FFileStream(kFileReadWrite));
    EXPECT_TRUE(file->attach(descriptor, "wb+", 0));
    return file;
}

/// Does the same random things to a stream and to a plain memory stream; both must tell the same.
void expectToActAlike(FStream& stream, FMemoryStream& model, unsigned seed)
{
    std::mt19937 random(seed);
    for (int step = 0; step < 2000; step++)
    {
        const auto amount = static_cast<int64>(random() % 40);
        switch (random() % 4)
        {
        case 0:
        {
            const int64 position = static_cast<int64>(random()) % (model.getSize() + 1);
            ASSERT_EQ(stream.seek(position, kSeekStart), model.seek(position, kSeekStart));
            break;
        }
        case 1:
        {
            const std::string bytes(static_cast<size_t>(amount), static_cast<char>('a' + step % 26));
            ASSERT_EQ(writeTo(stream, bytes), writeTo(model, bytes)) << step;
            break;
        }
        default:
            ASSERT_EQ(readFrom(stream, amount), readFrom(model, amount)) << step;
        }
        ASSERT_EQ(stream.tell(), model.tell()) << step;
    }
}
} // namespace

TEST(FBufferStream, TheCursorIsTheFillSize)
{
    CmBuffer buffer(10);
    FBufferStream stream(buffer);
    EXPECT_EQ(stream.seek(5, kSeekEnd), 5);
    EXPECT_EQ(buffer.getFillSize(), 5u);
    EXPECT_EQ(writeTo(stream, "abcde"), 5);
    EXPECT_EQ(stream.tell(), 10);
    EXPECT_EQ(readFrom(stream, 3), "");
    EXPECT_EQ(stream.tell(), 0) << "a read at the end starts anew";
    EXPECT_EQ(stream.seek(5, kSeekStart), 5);
    EXPECT_EQ(readFrom(stream, 3), "abc");
    EXPECT_EQ(stream.seek(1, kSeekCurrent), 9);
    EXPECT_EQ(readFrom(stream, 10), "e");
}

TEST(FBufferStream, SeeksGrowTheBuffer)
{
    CmBuffer buffer;
    FBufferStream stream(buffer);
    EXPECT_EQ(stream.seek(5000, kSeekStart), 5000);
    EXPECT_EQ(buffer.getSize(), 8192u);
    EXPECT_EQ(stream.seek(-6000, kSeekCurrent), -1);
    EXPECT_EQ(stream.seek(INT64_MIN, kSeekEnd), -1);
    EXPECT_EQ(stream.tell(), 5000);
    stream.rewind();
    EXPECT_EQ(writeTo(stream, std::string(9000, 'x')), 9000);
    EXPECT_EQ(buffer.getSize(), 12288u);
}

TEST(FBufferedStream, ActsAsTheStreamThatItWraps)
{
    for (uint32 blockSize : {1u, 7u, 16u, 4096u})
    {
        auto inner = adopt(new CountingStream);
        FMemoryStream model;
        {
            FBufferedStream stream(inner, blockSize, true, nullptr);
            expectToActAlike(stream, model, blockSize);
        }
        std::string padded = bytesOf(model);
        padded.resize(static_cast<size_t>(inner->getSize()));
        EXPECT_EQ(bytesOf(*inner), padded);
        EXPECT_LT(inner->getSize() - model.getSize(), blockSize) << "only the last block is padded";
    }
}

TEST(FBufferedStream, MovesWholeBlocksAndKeepsSmallChangesBack)
{
    auto inner = adopt(new CountingStream(CountingStream()));
    FBufferedStream stream(inner, 16, true, nullptr);
    for (int i = 0; i < 10; i++)
        writeTo(stream, "x");
    EXPECT_EQ(inner->writes, 0);
    stream.flush();
    EXPECT_EQ(inner->writes, 1);
    EXPECT_EQ(inner->getSize(), 16);
    stream.rewind();
    EXPECT_EQ(writeTo(stream, std::string(48, 'y')), 48);
    EXPECT_EQ(inner->writes, 2) << "blocks go straight through";
    EXPECT_EQ(stream.seek(0, kSeekEnd), 48);

    stream.seek(20, kSeekStart);
    writeTo(stream, "abc");
    stream.seek(21, kSeekStart);
    EXPECT_EQ(readFrom(stream, 4), "bcyy");
    stream.seek(40, kSeekStart);
    EXPECT_EQ(bytesOf(*inner), std::string(20, 'y') + "abc" + std::string(25, 'y'));
}

TEST(FBufferedStream, LeavesAFileAtItsTrueLength)
{
    auto file = temporaryFile();
    auto other = temporaryFile();
    {
        FBufferedStream stream(file, 4096, true, nullptr);
        writeTo(stream, "0123456789");
        stream.flush();
        EXPECT_EQ(file->getEof(), 4096);
        stream.setStream(other);
        EXPECT_EQ(file->getEof(), 10);
        writeTo(stream, "abc");
    }
    EXPECT_EQ(other->getEof(), 3);
    other->rewind();
    EXPECT_EQ(readFrom(*other, 10), "abc");
}

TEST(FStream, AFileStaysAtItsEndBehindTheLastLine)
{
    auto file = temporaryFile();
    writeTo(*file, "first\nlast \t");
    TestHook hook;
    file->setReadWriteHook(&hook, 0);
    for (bool trim : {false, true})
    {
        file->rewind();
        CmBuffer line;
        EXPECT_TRUE(file->readLine(line, trim));
        EXPECT_STREQ(line.str8(), "first");
        EXPECT_TRUE(file->readLine(line, trim));
        EXPECT_STREQ(line.str8(), trim ? "last" : "last \t");
        EXPECT_EQ(file->tell(), 12) << "behind blanks that were left out, too";
        EXPECT_EQ(hook.getValue(), 12);
        EXPECT_FALSE(file->readLine(line, trim));
    }
    EXPECT_FALSE(file->error()) << "to be sought before its start is no failure of the file";
    EXPECT_EQ(file->seek(-100, kSeekCurrent), -1);
    EXPECT_TRUE(file->error());
}

TEST(FBufferedStream, AReaderStaysInsideTheStream)
{
    auto inner = adopt(new CountingStream);
    writeTo(*inner, std::string(40, 'a') + "b");
    inner->seek(5, kSeekStart);
    inner->setByteOrder(1);
    FBufferedStream stream(inner, 16, false, nullptr);
    EXPECT_EQ(stream.getByteOrder(), 1);
    EXPECT_EQ(stream.tell(), 5);
    EXPECT_EQ(inner->tell(), 5);
    EXPECT_EQ(writeTo(stream, "x"), -1);
    EXPECT_EQ(stream.seek(100, kSeekStart), 41);
    EXPECT_EQ(stream.seek(-3, kSeekStart), 0);
    EXPECT_EQ(stream.seek(-1, kSeekEnd), 40);
    EXPECT_EQ(readFrom(stream, 9), "b");
    EXPECT_EQ(stream.seek(7, static_cast<FSeekMode>(8)), 41);
    stream.rewind();
    inner->reads = 0;
    for (int i = 0; i < 41; i++)
        EXPECT_EQ(readFrom(stream, 1).size(), 1u);
    EXPECT_EQ(inner->reads, 3);

    auto copy = adopt(FCast(FStream, stream.newCopy()));
    EXPECT_EQ(copy->seek(-1, kSeekCurrent), 40);
    EXPECT_EQ(readFrom(*copy, 2), "b");
}

TEST(FBufferedStream, KeepsBytesThatItCannotRead)
{
    auto inner = adopt(new CountingStream);
    writeTo(*inner, std::string(40, 'a'));
    inner->seek(-1, kSeekStart);
    FBufferedStream stream(inner, 16, true, nullptr);
    EXPECT_EQ(stream.tell(), 0) << "also over a stream that stands before its start";
    inner->failsReading = true;
    EXPECT_EQ(writeTo(stream, "abc"), -1);
    stream.flush();
    EXPECT_EQ(bytesOf(*inner), std::string(40, 'a'));
    inner->failsReading = false;
    EXPECT_EQ(writeTo(stream, "abc"), 3);
    stream.flush();
    EXPECT_EQ(bytesOf(*inner), "abc" + std::string(37, 'a'));
}

TEST(FStream, FiltersTakeOrderAndTypeOfWhatTheyWrap)
{
    auto inner = adopt(new FMemoryStream);
    inner->setByteOrder(1);
    inner->setFileType(FFileType("audio/wav", "wav", nullptr, 0, "Wave"));
    FBufferedStream buffered(nullptr, 16, false, nullptr);
    buffered.setStream(inner);
    FBlockStreamReader reader(inner, 16);
    FCompressionStream packed(inner, nullptr);
    FStreamProxy window(inner, 0, 0, 0);
    for (const FStream* filter : {static_cast<FStream*>(&buffered), static_cast<FStream*>(&reader),
                                  static_cast<FStream*>(&packed), static_cast<FStream*>(&window)})
    {
        EXPECT_EQ(filter->getByteOrder(), 1) << filter->isA();
        EXPECT_TRUE(filter->getFileType() == inner->getFileType()) << filter->isA();
    }
}

TEST(FBufferedStream, TellsItsHookAndObeysIt)
{
    auto inner = adopt(new CountingStream);
    writeTo(*inner, std::string(100, 'a'));
    inner->rewind();
    FBufferedStream stream(inner, 16, true, nullptr);
    TestHook hook;
    stream.setReadWriteHook(&hook, 10);
    for (int i = 0; i < 100; i++)
        readFrom(stream, 1);
    EXPECT_EQ(hook.changes, 9);
    EXPECT_EQ(hook.getValue(), 99);
    hook.cancelAt = 0;
    EXPECT_EQ(readFrom(stream, 1), "-1");
    EXPECT_EQ(writeTo(stream, "a"), -1);
}

TEST(FBufferedStream, ReturnsItsBlockToThePoolAndReportsLostData)
{
    CmBufferPool pool;
    auto inner = adopt(new CountingStream);
    {
        FBufferedStream stream(inner, 16, true, &pool);
        writeTo(stream, "abc");
        EXPECT_TRUE(stream.verify());
        inner->failsWriting = true;
        stream.flush();
        EXPECT_FALSE(stream.verify());
        EXPECT_EQ(pool.total(), 0);
    }
    EXPECT_EQ(pool.total(), 1);
    EXPECT_EQ(inner->getRefCount(), 1u);
}

TEST(FBlockStreamReader, ReadsAheadByBlocks)
{
    auto inner = adopt(new CountingStream);
    std::string bytes;
    for (int i = 0; i < 1000; i++)
        bytes += static_cast<char>('a' + i % 26);
    writeTo(*inner, bytes);
    inner->rewind();
    FBlockStreamReader reader(inner, 64);
    EXPECT_EQ(readFrom(reader, 10), bytes.substr(0, 10));
    EXPECT_EQ(inner->reads, 1);
    EXPECT_EQ(reader.seek(50, kSeekStart), 50);
    EXPECT_EQ(reader.seek(-20, kSeekCurrent), 30);
    EXPECT_EQ(readFrom(reader, 34), bytes.substr(30, 34));
    EXPECT_EQ(inner->reads, 1) << "all of it was in the buffer";
    EXPECT_EQ(readFrom(reader, 200), bytes.substr(64, 200));
    EXPECT_EQ(inner->reads, 3) << "three blocks at once, then one into the buffer";
    EXPECT_EQ(reader.tell(), 264);
    EXPECT_EQ(reader.seek(10, kSeekStart), 10);
    EXPECT_EQ(readFrom(reader, 3), bytes.substr(10, 3));
    EXPECT_EQ(reader.seek(0, kSeekEnd), -1);
    EXPECT_EQ(writeTo(reader, "x"), -1);
    reader.seek(990, kSeekStart);
    EXPECT_EQ(readFrom(reader, 500), bytes.substr(990));
    EXPECT_EQ(readFrom(reader, 5), "");
}

TEST(FBlockStreamReader, AFlushGoesOnWhereTheInnerStreamStands)
{
    auto inner = adopt(new CountingStream);
    writeTo(*inner, std::string(100, 'a'));
    inner->rewind();
    FBlockStreamReader reader(inner, 64);
    readFrom(reader, 10);
    reader.flush();
    EXPECT_EQ(inner->flushes, 1);
    EXPECT_EQ(reader.tell(), 64);
    EXPECT_EQ(readFrom(reader, 100).size(), 36u);
    reader.rewind();
    EXPECT_EQ(reader.tell(), 0);
}

TEST(FBlockStreamReader, ReadsTheSameAsWithoutIt)
{
    std::mt19937 random(5);
    std::string bytes(5000, 0);
    for (char& byte : bytes)
        byte = static_cast<char>(random());
    auto inner = adopt(new FMemoryStream(streamOf(bytes)));
    inner->rewind();
    FBlockStreamReader reader(inner, 32);
    FMemoryStream model = streamOf(bytes);
    for (int step = 0; step < 3000; step++)
    {
        const auto amount = static_cast<int64>(random() % 100);
        if (step % 3 == 0)
        {
            const int64 position = static_cast<int64>(random() % 5001);
            ASSERT_EQ(reader.seek(position, kSeekStart), model.seek(position, kSeekStart));
        }
        ASSERT_EQ(readFrom(reader, amount), readFrom(model, amount));
    }
}

TEST(FStreamProxy, IsAWindow)
{
    auto inner = adopt(new FMemoryStream(streamOf("0123456789")));
    inner->setByteOrder(1);
    FStreamProxy window(inner, 3, 5, 7), rest(inner, 6, 0, 0);
    EXPECT_EQ(window.getByteOrder(), 1);
    EXPECT_EQ(window.getMode(), 7);
    EXPECT_EQ(readFrom(window, 2), "34");
    EXPECT_EQ(readFrom(rest, 2), "67");
    EXPECT_EQ(readFrom(window, 9), "567") << "each seeks to where it stands";
    EXPECT_EQ(readFrom(window, 1), "");
    EXPECT_EQ(writeTo(window, "x"), 0);
    EXPECT_EQ(readFrom(rest, 9), "89");

    EXPECT_EQ(window.seek(100, kSeekStart), 5);
    EXPECT_EQ(window.seek(-1, kSeekEnd), 4);
    EXPECT_EQ(window.seek(-100, kSeekCurrent), 0);
    EXPECT_EQ(writeTo(window, "abcdefg"), 5);
    EXPECT_EQ(window.seek(3, static_cast<FSeekMode>(4)), 0);
    EXPECT_EQ(bytesOf(*inner), "012abcde89");
    EXPECT_EQ(rest.seek(0, kSeekEnd), 4);
    EXPECT_EQ(rest.seek(100, kSeekStart), 100) << "an open window has no end";
}

TEST(FStream, FiltersTakePositionsAsFarAsThereAreAny)
{
    constexpr int64 kLast = std::numeric_limits<int64>::max();
    auto inner = adopt(new FMemoryStream(streamOf("0123456789")));
    FBufferedStream buffered(inner, 16, true, nullptr);
    FStreamProxy open(inner, 4, 0, 0), window(inner, 4, kLast, 0);
    EXPECT_EQ(buffered.seek(kLast, kSeekStart), kLast);
    EXPECT_EQ(buffered.seek(kLast, kSeekCurrent), kLast);
    EXPECT_EQ(buffered.seek(kLast, kSeekEnd), kLast);
    EXPECT_EQ(writeTo(buffered, "a"), -1);
    for (FStreamProxy* proxy : {&open, &window})
    {
        EXPECT_EQ(proxy->seek(kLast, kSeekStart), kLast - 4);
        EXPECT_EQ(proxy->seek(kLast, kSeekCurrent), kLast - 4);
        EXPECT_EQ(readFrom(*proxy, 1), "");
        EXPECT_EQ(proxy->seek(-kLast - 1, kSeekCurrent), 0);
        EXPECT_EQ(readFrom(*proxy, 2), "45");
    }
    FBlockStreamReader reader(inner, 16);
    readFrom(reader, 3);
    EXPECT_EQ(reader.seek(kLast, kSeekCurrent), kLast);
    EXPECT_EQ(reader.seek(kLast, kSeekCurrent), kLast);
    EXPECT_EQ(reader.seek(-kLast - 1, kSeekStart), -kLast - 1) << "as the stream in memory has it";
    EXPECT_EQ(reader.seek(2, kSeekStart), 2);
    EXPECT_EQ(readFrom(reader, 2), "23");
    EXPECT_EQ(bytesOf(*inner), "0123456789");
}

TEST(FStreamProxy, WithoutAStreamThereIsNothing)
{
    FStreamProxy window(nullptr, 3, 5, 0);
    EXPECT_EQ(window.tell(), -1);
    EXPECT_EQ(readFrom(window, 1), "-1");
    EXPECT_EQ(window.seek(1, kSeekStart), -1);
}
