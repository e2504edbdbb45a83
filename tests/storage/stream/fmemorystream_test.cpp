#include "storage/stream/fmemorystream.h"

#include "foundation/object/classfactory.h"
#include "foundation/object/iptr.h"
#include "storage/stream/fstreamcounter.h"
#include "streamfixture.h"

#include <gtest/gtest.h>

#include <cstdlib>

TEST(FMemoryStream, GrowsByPages)
{
    FMemoryStream stream;
    EXPECT_TRUE(stream.setSize(4096));
    EXPECT_EQ(stream.getAllocated(), 4096);
    EXPECT_TRUE(stream.setSize(4097));
    EXPECT_EQ(stream.getAllocated(), 8192);
    stream.seek(10, kSeekStart);
    EXPECT_TRUE(stream.setSize(1));
    EXPECT_EQ(stream.getAllocated(), 8192) << "the block never shrinks";
    EXPECT_EQ(stream.tell(), 10);
    EXPECT_TRUE(stream.setSize(0));
    EXPECT_EQ(stream.getData(), nullptr);
    EXPECT_EQ(stream.tell(), 0);
}

TEST(FMemoryStream, SeeksPastItsBoundsButNotPastTheEndFromTheEnd)
{
    FMemoryStream stream = streamOf("0123456789");
    EXPECT_EQ(stream.seek(5, kSeekEnd), 10);
    EXPECT_EQ(stream.seek(-3, kSeekEnd), 7);
    EXPECT_EQ(stream.seek(-20, kSeekEnd), -10);
    EXPECT_EQ(readFrom(stream, 5), "");
    EXPECT_EQ(stream.tell(), -10);
    EXPECT_EQ(writeTo(stream, "x"), 0);
    EXPECT_EQ(stream.seek(25, kSeekCurrent), 15);
    EXPECT_EQ(stream.seek(3, static_cast<FSeekMode>(9)), 15);
    EXPECT_EQ(readFrom(stream, 5), "");
    EXPECT_EQ(stream.tell(), 10) << "a read past the end returns to it";

    stream.seek(12, kSeekStart);
    EXPECT_EQ(writeTo(stream, "ab"), 2);
    EXPECT_EQ(bytesOf(stream), std::string("0123456789\0\0ab", 14));
    stream.seek(INT64_MAX, kSeekStart);
    EXPECT_EQ(writeTo(stream, "ab"), 0);
    EXPECT_EQ(readFrom(stream, 1), "");
}

TEST(FMemoryStream, WorksOnABlockOfTheCallersInPlace)
{
    char block[100] = {};
    FMemoryStream stream(block, 100);
    EXPECT_EQ(writeTo(stream, std::string(100, 'x')), 100);
    EXPECT_EQ(block[99], 'x');
    EXPECT_TRUE(stream.verify());
    EXPECT_FALSE(stream.truncate());
    EXPECT_EQ(writeTo(stream, "y"), 0);
    EXPECT_FALSE(stream.verify());
    stream.rewind();
    EXPECT_EQ(writeTo(stream, "y"), 0) << "the error stays";
    EXPECT_EQ(readFrom(stream, 2), "xx");
    EXPECT_EQ(stream.setStreamSize(200), kStreamSizeNotChanged);
    EXPECT_EQ(stream.getSize(), 100);
    EXPECT_EQ(stream.getData(), block);
}

TEST(FMemoryStream, RunsOutOfMemoryOnceAndForAll)
{
    FMemoryStream stream = streamOf("abc");
    EXPECT_EQ(stream.setStreamSize(INT64_MAX / 2), kStreamSizeNotChanged);
    EXPECT_EQ(stream.getSize(), 0);
    EXPECT_EQ(writeTo(stream, "a"), 0);
    EXPECT_FALSE(stream.verify());
}

TEST(FMemoryStream, PassesItsBlock)
{
    FMemoryStream stream = streamOf("abc");
    void* block = stream.pass();
    EXPECT_EQ(memcmp(block, "abc", 3), 0);
    free(block);
    EXPECT_EQ(stream.getSize(), 3);
    EXPECT_EQ(stream.getAllocated(), 0);
    EXPECT_EQ(readFrom(stream, 3), "");
    EXPECT_EQ(writeTo(stream, "ab"), 0) << "inside the size that is left there is no block";
    FMemoryStream target, copy(stream);
    EXPECT_TRUE(stream.copyTo(target));
    EXPECT_EQ(target.getSize() + copy.getSize(), 0) << "nothing is made up in its place";
    stream.reset();
    EXPECT_EQ(writeTo(stream, "ab"), 2);
}

TEST(FMemoryStream, ResetsAndTruncates)
{
    FMemoryStream stream = streamOf("abcdef");
    char* const block = stream.getData();
    stream.reset();
    EXPECT_EQ(stream.getData(), block);
    writeTo(stream, "xyz");
    stream.seek(2, kSeekStart);
    EXPECT_TRUE(stream.truncateToCursor());
    EXPECT_EQ(bytesOf(stream), "xy");
    EXPECT_EQ(stream.getAllocated(), 2);
    stream.rewind();
    EXPECT_TRUE(stream.truncateToCursor());
    EXPECT_EQ(stream.getData(), nullptr);
}

TEST(FMemoryStream, CopiesStandBehindTheirContent)
{
    FMemoryStream stream = streamOf("abc");
    stream.setByteOrder(1);
    FMemoryStream copy(stream), assigned = streamOf("longer than that");
    assigned = stream;
    auto made = adopt(stream.newCopy());
    EXPECT_EQ(bytesOf(copy), "abc");
    EXPECT_EQ(copy.tell(), 3);
    EXPECT_EQ(copy.getByteOrder(), 1);
    EXPECT_NE(copy.getData(), stream.getData());
    EXPECT_EQ(bytesOf(assigned), "abc");
    EXPECT_EQ(bytesOf(*FCast(FMemoryStream, made.get())), "abc");

    char block[4] = "xyz";
    FMemoryStream borrowed(block, 3);
    borrowed.takeOver(stream);
    EXPECT_EQ(bytesOf(borrowed), "abc");
    EXPECT_EQ(borrowed.getByteOrder(), 1);
    EXPECT_EQ(stream.getSize(), 0);
    EXPECT_EQ(writeTo(stream, "new"), 3);
    EXPECT_STREQ(block, "xyz");
}

TEST(FMemoryStream, TakesFromOtherStreamsOfItsKindInOneWrite)
{
    FMemoryStream source = streamOf("abcdef");
    source.seek(2, kSeekStart);
    CountingStream target;
    EXPECT_TRUE(target.read(source, 3));
    EXPECT_EQ(target.writes, 1);
    EXPECT_EQ(source.tell(), 5);
    EXPECT_FALSE(target.read(source, 3));
    EXPECT_EQ(bytesOf(target), std::string("cdef\0\0", 6)) << "it has grown to what was asked";
    source.seek(-4, kSeekStart);
    EXPECT_FALSE(target.read(source, 2));
}

TEST(FMemoryStream, WritesItselfInOneCall)
{
    FMemoryStream source = streamOf(std::string(5000, 'a'));
    source.seek(7, kSeekStart);
    CountingStream target;
    EXPECT_TRUE(source.copyTo(target));
    EXPECT_EQ(target.writes, 1);
    EXPECT_EQ(bytesOf(target), std::string(5000, 'a'));
    target.failsWriting = true;
    EXPECT_FALSE(source.copyTo(target));
}

TEST(FMemoryStream, OffersItsInterfaces)
{
    auto stream = adopt(
        FCast(FMemoryStream, toFObject(ClassFactory::instance(true)->createObjectByName("FMemoryStream"))));
    ASSERT_TRUE(stream);
    writeTo(*stream, "abc");
    auto sizeable = adopt(askInterface<ISizeableStream>(static_cast<CmObject*>(stream.get())));
    auto memory = adopt(askInterface<IMemoryStream>(static_cast<CmObject*>(stream.get())));
    ASSERT_TRUE(sizeable && memory);
    EXPECT_EQ(stream->getRefCount(), 3u);
    int64 size = 0;
    EXPECT_EQ(sizeable->getStreamSize(size), 0);
    EXPECT_EQ(size, 3);
    EXPECT_EQ(memory->getData(), stream->getData());
}

TEST(FStreamCounter, CountsTheHighestPosition)
{
    FStreamCounter counter;
    EXPECT_EQ(writeTo(counter, "abcd"), 4);
    EXPECT_EQ(counter.seek(1, kSeekEnd), 3);
    EXPECT_EQ(counter.seek(-9, kSeekCurrent), 0);
    EXPECT_EQ(writeTo(counter, "x"), 1);
    EXPECT_EQ(counter.getSize(), 4);
    EXPECT_EQ(counter.seek(9, kSeekStart), 9);
    EXPECT_EQ(counter.getSize(), 9);
    EXPECT_EQ(counter.seek(0, static_cast<FSeekMode>(5)), -1);
    EXPECT_EQ(readFrom(counter, 3), "");
    counter.rewind();
    EXPECT_EQ(counter.getSize() + counter.tell(), 0);
}
