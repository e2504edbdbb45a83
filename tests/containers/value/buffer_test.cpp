#include "containers/value/buffer.h"
#include "containers/value/cmbufferpool.h"
#include "foundation/object/iptr.h"
#include "foundation/text/string.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <thread>
#include <vector>

namespace
{
std::string filled(const Buffer& buffer)
{
    return std::string(buffer.str8(), buffer.getFillSize());
}

Buffer bufferOf(const char* text)
{
    Buffer buffer;
    buffer.appendString8(text);
    return buffer;
}
} // namespace

TEST(Buffer, GrowsByWholeSteps)
{
    Buffer buffer;
    EXPECT_TRUE(buffer.put('a'));
    EXPECT_EQ(buffer.getSize(), 4096u);
    EXPECT_TRUE(buffer.setFillSize(4096));
    EXPECT_EQ(buffer.getSize(), 4096u);
    EXPECT_TRUE(buffer.put(uint8{1}));
    EXPECT_EQ(buffer.getSize(), 8192u);

    Buffer stepped;
    stepped.setDelta(10);
    EXPECT_TRUE(stepped.grow(11));
    EXPECT_EQ(stepped.getSize(), 20u);
    EXPECT_FALSE(stepped.grow(4294967295u)) << "rounded up it has no size";
    EXPECT_EQ(stepped.getSize(), 20u);
}

TEST(Buffer, SetSizeKeepsWhatFitsAndCutsTheFillSize)
{
    Buffer buffer("abcdef", 6);
    EXPECT_EQ(buffer.getFillSize(), 6u);
    EXPECT_TRUE(buffer.setSize(3));
    EXPECT_EQ(filled(buffer), "abc");
    EXPECT_TRUE(buffer.setSize(5));
    EXPECT_EQ(std::string(buffer.ptr(), 5), std::string("abc\0\0", 5)) << "gained bytes are zero";
    EXPECT_TRUE(buffer.setSize(0));
    EXPECT_EQ(buffer.ptr(), nullptr);
    EXPECT_EQ(buffer.getFillSize(), 0u);
}

TEST(Buffer, PutsAndGetsAtTheFillSize)
{
    Buffer buffer;
    EXPECT_TRUE(buffer.put("ab", 2));
    EXPECT_TRUE(buffer.put(String("cd")));
    EXPECT_TRUE(buffer.put(u'e'));
    EXPECT_TRUE(buffer.put(uint16{0x6766}));
    EXPECT_EQ(filled(buffer), std::string("abcd\0e\0fg", 9));
    EXPECT_FALSE(buffer.put(nullptr, 1));

    buffer.setFillSize(1);
    char read[3];
    EXPECT_EQ(buffer.get(read, 3), 3u);
    EXPECT_EQ(std::string(read, 3), "bcd");
    buffer.truncateToFillSize();
    EXPECT_EQ(buffer.get(read, 3), 0u);
}

TEST(Buffer, FillsAllOrTheRest)
{
    Buffer buffer(4, 'x');
    EXPECT_EQ(std::string(buffer.ptr(), 4), "xxxx");
    buffer.setFillSize(2);
    buffer.fillup('y');
    EXPECT_EQ(std::string(buffer.ptr(), 4), "xxyy");
    EXPECT_EQ(buffer.getFillSize(), 2u);
    buffer.set('z');
    EXPECT_EQ(std::string(buffer.ptr(), 4), "zzzz");
}

TEST(Buffer, MovesBytesInside)
{
    Buffer buffer = bufferOf("abcdef");
    EXPECT_TRUE(buffer.move(2, '-'));
    EXPECT_EQ(filled(buffer), "--abcdef");
    EXPECT_TRUE(buffer.move(-3));
    EXPECT_EQ(filled(buffer), "bcdef");
    EXPECT_TRUE(buffer.shiftAt(1, 2));
    EXPECT_EQ(filled(buffer), "bcdcdef");
    EXPECT_TRUE(buffer.shiftAt(1, -2));
    EXPECT_EQ(filled(buffer), "bcdef");
    EXPECT_FALSE(buffer.shiftAt(4, -2));
    EXPECT_FALSE(buffer.shiftAt(6, 1));
    EXPECT_TRUE(buffer.copy(0, 3, 2));
    EXPECT_EQ(filled(buffer), "bcdbc");
    EXPECT_FALSE(buffer.copy(buffer.getSize(), 0, 1));
    EXPECT_TRUE(buffer.move(-100));
    EXPECT_EQ(buffer.getFillSize(), 0u);
}

TEST(Buffer, SwapsTheBytesOfElements)
{
    Buffer buffer = bufferOf("abcdefgh");
    EXPECT_TRUE(buffer.swap(2));
    EXPECT_EQ(filled(buffer), "badcfehg");
    EXPECT_TRUE(buffer.swap(8));
    EXPECT_EQ(filled(buffer), "ghefcdab");
    EXPECT_FALSE(buffer.swap(3));
    buffer.setFillSize(6);
    EXPECT_FALSE(buffer.swap(4));
    EXPECT_EQ(filled(buffer), "ghefcd");
}

TEST(Buffer, TextIsTerminatedBehindTheFillSize)
{
    Buffer buffer = bufferOf("world");
    EXPECT_TRUE(buffer.prependString8("hello "));
    EXPECT_TRUE(buffer.appendString8("!"));
    EXPECT_STREQ(buffer.str8(), "hello world!");
    EXPECT_EQ(buffer.getFillSize(), 12u);
    EXPECT_FALSE(buffer.appendString8(nullptr));

    Buffer wide;
    EXPECT_TRUE(wide.appendString16(u"b"));
    EXPECT_TRUE(wide.prependString16(u"a"));
    EXPECT_EQ(ConstString(reinterpret_cast<const char16*>(wide.ptr())), u"ab");
    EXPECT_EQ(wide.getFillSize(), 4u);
}

TEST(Buffer, ConvertsText)
{
    Buffer buffer = bufferOf("gr\xC3\xBC\xC3\x9F");
    EXPECT_TRUE(buffer.toWideString(65001));
    EXPECT_EQ(ConstString(reinterpret_cast<const char16*>(buffer.ptr())), u"grüß");
    EXPECT_EQ(buffer.getFillSize(), 8u);
    EXPECT_TRUE(buffer.toMultibyteString(1252));
    EXPECT_EQ(filled(buffer), "gr\xFC\xDF");
}

TEST(Buffer, ReadsAndWritesHexDigits)
{
    Buffer buffer;
    EXPECT_TRUE(buffer.fromHexString("00fFa7"));
    EXPECT_EQ(filled(buffer), std::string("\0\xFF\xA7", 3));
    String text;
    EXPECT_TRUE(buffer.makeHexString(text));
    EXPECT_EQ(text, "00FFA7");
    for (const char* refused : {"0g", "g0", "123", ""})
        EXPECT_FALSE(buffer.fromHexString(refused)) << refused;
    EXPECT_FALSE(buffer.fromHexString(nullptr));
    EXPECT_EQ(buffer.getFillSize(), 0u);
}

TEST(Buffer, CopiesTakesAndPasses)
{
    Buffer buffer = bufferOf("abc");
    Buffer copy(buffer), assigned("xyz", 3);
    assigned = buffer;
    EXPECT_TRUE(copy == buffer && assigned == buffer);
    EXPECT_EQ(filled(assigned), "abc");
    *copy.ptr() = 'X';
    EXPECT_FALSE(copy == buffer);

    Buffer taker;
    taker.take(buffer);
    EXPECT_EQ(filled(taker), "abc");
    EXPECT_EQ(buffer.getSize(), 0u);
    void* block = taker.pass();
    EXPECT_EQ(taker.ptr(), nullptr);
    EXPECT_STREQ(static_cast<char*>(block), "abc");
    free(block);
}

TEST(CmBufferPool, HandsOutTheFirstBufferThatIsLargeEnough)
{
    CmBufferPool pool;
    auto* small = new CmBuffer(10);
    auto* large = new CmBuffer(100);
    large->setFillSize(5);
    pool.deleteBuffer(small);
    pool.deleteBuffer(large);

    auto fresh = adopt(pool.allocateBuffer(0));
    EXPECT_EQ(fresh->getSize(), 0u);
    auto taken = adopt(pool.allocateBuffer(50));
    EXPECT_EQ(taken.get(), large);
    EXPECT_EQ(taken->getFillSize(), 0u);
    auto made = adopt(pool.allocateBuffer(50));
    EXPECT_EQ(made->getSize(), 50u);
    EXPECT_EQ(pool.total(), 1);
}

TEST(CmBufferPool, LendsItsStorageToPlainBuffers)
{
    CmBufferPool pool;
    Buffer buffer(64);
    char* const storage = buffer.ptr();
    pool.freeBuffer(buffer);
    EXPECT_EQ(buffer.getSize(), 0u);
    pool.freeBuffer(buffer);
    EXPECT_EQ(pool.total(), 1);

    Buffer other;
    EXPECT_TRUE(pool.configBuffer(other, 20));
    EXPECT_EQ(other.ptr(), storage);
    EXPECT_TRUE(pool.configBuffer(other, 20));
    EXPECT_EQ(other.getSize(), 20u);
    Buffer third;
    EXPECT_TRUE(pool.configBuffer(third, 30));
    EXPECT_EQ(third.getSize(), 30u);
}

TEST(CmBufferPool, ReducesFromTheEnd)
{
    CmBufferPool pool;
    auto first = adopt(new CmBuffer(1));
    auto second = adopt(new CmBuffer(2));
    for (CmBuffer* buffer : {first.get(), second.get()})
    {
        buffer->addRef();
        pool.deleteBuffer(buffer);
    }
    pool.reduceBuffers(1);
    EXPECT_EQ(pool.at(0), first.get());
    EXPECT_EQ(second->getRefCount(), 1u);
    EXPECT_EQ(pool.getOwnership(), CmContainer::kShared);
}

TEST(CmBufferPool, ServesManyThreads)
{
    CmBufferPool pool;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; i++)
        threads.emplace_back(
            [&pool]
            {
                for (uint32 round = 0; round < 2000; round++)
                {
                    CmBuffer* buffer = pool.allocateBuffer(1 + round % 7);
                    buffer->set(1);
                    pool.deleteBuffer(buffer);
                }
            });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_GE(pool.total(), 1);
    EXPECT_LE(pool.total(), 28);
}
