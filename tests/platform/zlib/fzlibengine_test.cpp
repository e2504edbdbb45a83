#include "platform/zlib/fzlibengine.h"

#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/stream/fmemorystream.h"
#include "storage/stream/fstreamproxy.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>

namespace
{
std::string sampleText(int lines)
{
    std::string text;
    for (int i = 0; i < lines; i++)
        text += "line " + std::to_string(i * i) + "\n";
    return text;
}

/// Bytes that don't get smaller.
std::string noise(std::size_t size)
{
    std::string bytes(size, 0);
    unsigned state = 1;
    for (char& byte : bytes)
        byte = static_cast<char>((state = state * 1664525 + 1013904223) >> 24);
    return bytes;
}

IPtr<FMemoryStream> streamOf(const std::string& bytes)
{
    IPtr<FMemoryStream> stream = adopt(new FMemoryStream);
    stream->writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
    stream->rewind();
    return stream;
}

std::string contentOf(const FMemoryStream& stream)
{
    return std::string(stream.getData(), static_cast<std::size_t>(stream.getSize()));
}

std::string pack(const std::string& plain, float quality = 0.6f)
{
    const IPtr<FMemoryStream> target = adopt(new FMemoryStream);
    EXPECT_TRUE(FCompressData(streamOf(plain), target, adopt(new FZlibEngine), quality, nullptr));
    return contentOf(*target);
}

IPtr<FCompressionStream> reading(FStream* source)
{
    IPtr<FCompressionStream> stream = adopt(new FCompressionStream(source, adopt(new FZlibEngine)));
    EXPECT_TRUE(stream->beginDecompress(-1));
    return stream;
}

/// What comes in pieces of that size; `result` is the last answer.
std::string readAll(FStream& stream, int64 piece, int64& result)
{
    std::string all;
    std::string bytes(static_cast<std::size_t>(piece), 0);
    while ((result = stream.readRaw(bytes.data(), piece)) > 0)
        all.append(bytes.data(), static_cast<std::size_t>(result));
    return all;
}

TEST(FZlibEngine, TakesEveryContentThereAndBack)
{
    int64 result = 0;
    for (const std::string& plain :
         {std::string(), std::string("a"), sampleText(30000), noise(200000), std::string(3000000, 'x')})
        for (const int64 piece : {1, 1000, 1 << 20})
            if (piece > 1 || plain.size() < 1000)
            {
                EXPECT_EQ(readAll(*reading(streamOf(pack(plain))), piece, result), plain);
                EXPECT_EQ(result, 0);
            }
    EXPECT_LT(pack(std::string(3000000, 'x')).size(), 4000u);
}

TEST(FZlibEngine, QualityIsALevel)
{
    const std::string plain = sampleText(30000);
    EXPECT_LT(pack(plain, 1).size(), pack(plain, 0).size());
    EXPECT_EQ(pack(plain, 7), pack(plain, 1));
    EXPECT_EQ(pack(plain, -7), pack(plain, 0));
    EXPECT_EQ(pack(plain, std::nanf("")), pack(plain, 0));
    // The level stands in the second byte in four groups: 1, 2 to 5, 6, and above.
    const std::string marks = {pack(plain, 0)[1], pack(plain, 0.3f)[1], pack(plain, 0.6f)[1],
                               pack(plain, 1)[1]};
    EXPECT_EQ(marks, "\x01\x5E\x9C\xDA");
}

TEST(FZlibEngine, LeavesTheSourceBehindTheData)
{
    const std::string packed = pack(sampleText(100));
    const IPtr<FMemoryStream> source = streamOf(packed + "what follows");
    int64 result = 0;
    EXPECT_EQ(readAll(*reading(source), 64, result), sampleText(100));
    EXPECT_EQ(source->tell(), static_cast<int64>(packed.size()));
}

TEST(FZlibEngine, DamageIsAnErrorAndNoEnd)
{
    const std::string plain = sampleText(2000);
    const std::string packed = pack(plain);
    int64 result = 0;
    for (std::size_t cut = 0; cut < packed.size(); cut += cut < 20 ? 1 : 97)
    {
        const std::string got = readAll(*reading(streamOf(packed.substr(0, cut))), 512, result);
        EXPECT_EQ(result, -1) << "cut at " << cut;
        EXPECT_EQ(got, plain.substr(0, got.size()));
    }
    for (std::size_t at = 0; at < packed.size(); at += 31)
    {
        std::string changed = packed;
        changed[at] = static_cast<char>(changed[at] ^ 4);
        const std::string got = readAll(*reading(streamOf(changed)), 512, result);
        EXPECT_TRUE(result == -1 || got == plain) << "changed at " << at;
    }
}

TEST(FZlibEngine, SeeksForwardByReading)
{
    const std::string plain = sampleText(5000);
    const IPtr<FCompressionStream> stream = reading(streamOf(pack(plain)));
    char got[10];
    EXPECT_EQ(stream->seek(20000, kSeekStart), 20000);
    EXPECT_EQ(stream->readRaw(got, 10), 10);
    EXPECT_EQ(std::string(got, 10), plain.substr(20000, 10));
    EXPECT_EQ(stream->seek(5, kSeekCurrent), 20015);
    stream->rewind();
    EXPECT_EQ(stream->readRaw(got, 10), 10);
    EXPECT_EQ(std::string(got, 10), plain.substr(0, 10));
}

TEST(FZlibEngine, FlushedDataCanBeReadBeforeItIsWhole)
{
    const IPtr<FMemoryStream> target = adopt(new FMemoryStream);
    const IPtr<FCompressionStream> stream = adopt(new FCompressionStream(target, adopt(new FZlibEngine)));
    ASSERT_TRUE(stream->beginCompress(0.5f));
    EXPECT_EQ(stream->writeRaw("first", 5), 5);
    EXPECT_LT(target->getSize(), 5) << "held back";
    stream->flush();
    char got[6] = {};
    EXPECT_EQ(reading(streamOf(contentOf(*target)))->readRaw(got, 5), 5);
    EXPECT_STREQ(got, "first");
}

TEST(FZlibEngine, AFullTargetIsAFailure)
{
    char room[64];
    const IPtr<FMemoryStream> target = adopt(new FMemoryStream(room, 64));
    const IPtr<FCompressionStream> stream = adopt(new FCompressionStream(target, adopt(new FZlibEngine)));
    ASSERT_TRUE(stream->beginCompress(0.5f));
    const std::string plain = noise(300000);
    EXPECT_EQ(stream->writeRaw(plain.data(), static_cast<int64>(plain.size())), 0);
    EXPECT_EQ(stream->writeRaw("x", 1), 0) << "no more after a failure";
}

TEST(FZlibEngine, TheProgramBringsItAlong)
{
    ASSERT_EQ(gComponentRegistry, nullptr);
    EXPECT_EQ(FCompressionStream::createDefaultEngine(), nullptr);
    FComponentRegistry::bringUp();
    FComponentRegistry* const registry = gComponentRegistry;
    FComponentRegistry::bringUp();
    EXPECT_EQ(gComponentRegistry, registry);
    EXPECT_EQ(registry->countComponents("Compression Engine"), 1);
    const IPtr<FCompressionEngine> engine = adopt(FCompressionStream::createDefaultEngine());
    ASSERT_NE(engine, nullptr);
    EXPECT_TRUE(engine->isFormat(FUID(FZlibEngine::kClassID)));
    const IPtr<FCompressionStream> byClass =
        adopt(new FCompressionStream(adopt(new FMemoryStream), FUID(FZlibEngine::kClassID)));
    EXPECT_TRUE(byClass->beginCompress(0.5f));
    registry->release();
    gComponentRegistry = nullptr;
}

TEST(FZlibEngine, KnowsHowMuchDataCanHold)
{
    FZlibEngine engine;
    for (const int size : {0, 1, 100, 3000000})
    {
        const std::string plain(static_cast<std::size_t>(size), 0);
        EXPECT_LE(size, engine.getMaxUncompressedSize(static_cast<int64>(pack(plain, 1).size())));
    }
    EXPECT_LT(engine.getMaxUncompressedSize(100), 200000);
    EXPECT_GT(engine.getMaxUncompressedSize(INT64_MAX), 0);
}
} // namespace
