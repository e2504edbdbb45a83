#include "storage/stream/fcompressionstream.h"

#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"
#include "storage/stream/fstreamunpacker.h"
#include "streamfixture.h"

#include <gtest/gtest.h>

namespace CompressionTest
{
/// Writes each byte followed by how often it comes, at most 255 times; what is begun is written at the end.
class RunCompressor : public FCompressor
{
    DECLARE_TYPE(RunCompressor, FCompressor)

    bool begin(FStream* itsTarget, float) override
    {
        target = itsTarget;
        return true;
    }
    bool write(void* data, int count) override
    {
        for (const char* bytes = static_cast<char*>(data); count > 0; count--, bytes++)
        {
            if ((run > 0 && *bytes != byte) || run == 255)
                flush();
            byte = *bytes;
            run++;
        }
        return !hasFailed;
    }
    void end() override { flush(); }
    void flush() override
    {
        if (run > 0)
            hasFailed |= !target->writeChar8(byte) || !target->writeUChar8(run);
        run = 0;
    }

private:
    FStream* target = nullptr;
    char byte = 0;
    uint8 run = 0;
    bool hasFailed = false;
};

class RunDecompressor : public FDecompressor
{
    DECLARE_TYPE(RunDecompressor, FDecompressor)

    explicit RunDecompressor(bool canItSeek) : seeks(canItSeek) {}

    bool begin(FStream* itsSource) override
    {
        source = itsSource;
        run = 0;
        position = 0;
        return true;
    }
    int read(void* data, int count) override
    {
        int done = 0;
        for (; done < count; done++, run--)
        {
            if (run == 0 && (!source->readChar8(byte) || !source->readUChar8(run)))
                break;
            static_cast<char*>(data)[done] = byte;
        }
        position += done;
        return done;
    }
    void end() override {}
    bool canSeek() override { return seeks; }
    int64 seek(int64 target, int mode) override
    {
        const int64 wanted = mode == kSeekCurrent ? position + target : target;
        source->rewind();
        begin(source);
        char skipped;
        while (position < wanted && read(&skipped, 1) == 1)
        {
        }
        return position;
    }

private:
    FStream* source = nullptr;
    char byte = 0;
    uint8 run = 0;
    int64 position = 0;
    bool seeks;
};

class RunEngine : public FCompressionEngine
{
    DECLARE_COPYABLE(RunEngine, FCompressionEngine)

    FCompressor* newCompressor() override { return new RunCompressor; }
    FDecompressor* newDecompressor() override { return new RunDecompressor(seeks); }
    void getFormat(FUID& format) override { format = FUID(1, 2, 3, 4); }
    int getType() override { return type; }

    bool seeks = false;
    int type = kDefaultEngine;
};

static FUnknown* makeEngine(int type)
{
    auto* engine = new RunEngine;
    engine->type = type;
    return static_cast<CmObject*>(engine);
}

static const FUID kOtherClass(7, 7, 7, 1), kDefaultClass(7, 7, 7, 2), kWrongClass(7, 7, 7, 3);

/// A registry with three components of the category, of which the last is the default engine.
struct Registry
{
    Registry()
    {
        const char* category = "Compression Engine";
        add(category, kWrongClass, []() -> FUnknown* { return static_cast<CmObject*>(new CmBuffer); });
        add(category, kOtherClass, [] { return makeEngine(5); });
        add(category, kDefaultClass, [] { return makeEngine(1); });
        gComponentRegistry = &registry;
    }
    ~Registry() { gComponentRegistry = old; }
    void add(const char* category, const FUID& uid, FComponentDescription::CreateFunction make)
    {
        registry.registerComponent(new FComponentDescription(category, uid, "test", make));
    }

    FComponentRegistry* old = gComponentRegistry;
    FComponentRegistry registry;
};

static std::string sampleText()
{
    return std::string(300, 'a') + "bc" + std::string(700, 'd');
}

static IPtr<FMemoryStream> packed(const std::string& bytes)
{
    auto target = adopt(new FMemoryStream);
    FMemoryStream source = streamOf(bytes);
    EXPECT_TRUE(FCompressData(&source, target, adopt(new RunEngine), 0.5f, nullptr));
    target->rewind();
    return target;
}

struct Unpacking
{
    explicit Unpacking(bool seeks, int64 size = -1)
    {
        engine->seeks = seeks;
        EXPECT_TRUE(stream->beginDecompress(size));
    }
    IPtr<RunEngine> engine = adopt(new RunEngine);
    IPtr<FCompressionStream> stream = adopt(new FCompressionStream(packed(sampleText()), engine));
};
} // namespace CompressionTest

using namespace CompressionTest;

TEST(FCompressionStream, GivesBackWhatWasWritten)
{
    auto target = adopt(new FMemoryStream);
    auto engine = adopt(new RunEngine);
    {
        FCompressionStream stream(target, engine);
        EXPECT_TRUE(stream.beginCompress(1));
        EXPECT_EQ(writeTo(stream, std::string(300, 'x')), 300);
        EXPECT_EQ(stream.tell(), 300);
        EXPECT_EQ(target->getSize(), 2);
        stream.flush();
        EXPECT_EQ(target->getSize(), 4);
        writeTo(stream, "y");
    }
    EXPECT_EQ(target->getSize(), 6) << "the end writes what was begun";
    EXPECT_EQ(target->getRefCount(), 1u);
    EXPECT_EQ(engine->getRefCount(), 1u);

    target->rewind();
    FMemoryStream plain;
    EXPECT_TRUE(FDecompressData(target, &plain, engine, nullptr, 7));
    EXPECT_EQ(bytesOf(plain), std::string(300, 'x') + "y");
}

TEST(FCompressionStream, AFailureWritesNothing)
{
    auto target = adopt(new CountingStream);
    target->failsWriting = true;
    FCompressionStream stream(target, adopt(new RunEngine));
    EXPECT_TRUE(stream.beginCompress(0));
    EXPECT_EQ(writeTo(stream, "abc"), 0);
    EXPECT_EQ(stream.tell(), 0);
    FMemoryStream source = streamOf("abcdef");
    EXPECT_FALSE(FCompressData(&source, target, adopt(new RunEngine), 0, nullptr));
}

TEST(FCompressionStream, SeeksByReadingWhereTheEngineCannot)
{
    Unpacking unpacking(false);
    FCompressionStream& stream = *unpacking.stream;
    EXPECT_EQ(stream.seek(300, kSeekStart), 300);
    EXPECT_EQ(readFrom(stream, 3), "bcd");
    EXPECT_EQ(stream.seek(10, kSeekCurrent), 313);
    EXPECT_EQ(stream.seek(-10, kSeekCurrent), 313);
    EXPECT_EQ(stream.seek(0, kSeekEnd), 313);
    EXPECT_EQ(stream.seek(5000, kSeekStart), 1002) << "the end stops it";
    EXPECT_EQ(stream.seek(301, kSeekStart), 301) << "the target is told, but the stream was only rewound";
    EXPECT_EQ(stream.tell(), 0);
    EXPECT_EQ(readFrom(stream, 2), "aa");
}

TEST(FCompressionStream, LetsASeekingEngineSeek)
{
    Unpacking unpacking(true);
    FCompressionStream& stream = *unpacking.stream;
    EXPECT_EQ(stream.seek(302, kSeekStart), 302);
    EXPECT_EQ(stream.seek(-2, kSeekCurrent), 300);
    EXPECT_EQ(readFrom(stream, 2), "bc");
    stream.rewind();
    EXPECT_EQ(stream.tell(), 0);
    EXPECT_EQ(readFrom(stream, 2000), sampleText());
}

TEST(FCompressionStream, FindsItsEngineAmongTheComponents)
{
    auto target = adopt(new FMemoryStream);
    EXPECT_FALSE(FCompressionStream(target, nullptr).beginCompress(1)) << "no registry, no compression";

    Registry components;
    auto engine = adopt(FCompressionStream::createDefaultEngine());
    ASSERT_TRUE(engine);
    EXPECT_EQ(engine->getRefCount(), 1u);
    EXPECT_TRUE(engine->isFormat(FUID(1, 2, 3, 4)));
    EXPECT_FALSE(engine->isFormat(FUID(1, 2, 3, 5)));
    EXPECT_TRUE(FCompressionStream(target, nullptr).beginCompress(1));
    EXPECT_EQ(FCompressionStream(target, kOtherClass).getEngine()->getType(), 5);
    EXPECT_EQ(FCompressionStream(target, kWrongClass).getEngine(), nullptr);
    EXPECT_FALSE(FCompressionStream(target, FUID(9, 9, 9, 9)).beginDecompress(-1));
}

TEST(FCompressionStream, BecomesAPlainStream)
{
    for (int64 size : {1002, -1, 2000})
    {
        Unpacking unpacking(false, size);
        auto plain = adopt(FCompressionStream::createUncompressedStream(unpacking.stream.get()));
        auto* memory = FCast(FMemoryStream, toFObject(plain));
        ASSERT_TRUE(memory);
        EXPECT_EQ(memory->tell(), 0);
        EXPECT_EQ(bytesOf(*memory), sampleText()) << size;
    }
    auto other = adopt(new FMemoryStream);
    auto same = adopt(FCompressionStream::createUncompressedStream(other.get()));
    EXPECT_EQ(toFStream(same), other.get());
    EXPECT_EQ(other->getRefCount(), 2u);
}

TEST(FStreamUnpacker, UnpacksWhereTheSizeIsKnown)
{
    Unpacking known(false, 1002), unknown(false);
    FStreamUnpacker unpacker(known.stream);
    EXPECT_NE(unpacker.getStream(), known.stream.get());
    EXPECT_EQ(unpacker.getStream()->seek(-702, kSeekEnd), 300);
    EXPECT_EQ(readFrom(*unpacker.getStream(), 3), "bcd");
    EXPECT_EQ(FStreamUnpacker(unknown.stream).getStream(), unknown.stream.get());
    EXPECT_EQ(FStreamUnpacker(nullptr).getStream(), nullptr);
}

TEST(FCompressData, TellsItsHookAndStopsWhenCancelled)
{
    FMemoryStream source = streamOf(std::string(200000, 'a')), target;
    TestHook hook;
    hook.setValueCompression(10);
    EXPECT_TRUE(FCompressData(&source, &target, adopt(new RunEngine), 1, &hook));
    EXPECT_EQ(hook.getValue(), 20000);
    EXPECT_EQ(hook.changes, 4);

    hook.value = 0;
    hook.cancelAt = 1;
    source.rewind();
    EXPECT_FALSE(FCompressData(&source, &target, adopt(new RunEngine), 1, &hook));
    EXPECT_EQ(source.tell(), 65536);
    EXPECT_FALSE(FCompressData(&source, &target, nullptr, 1, nullptr)) << "without an engine";
}

TEST(FCompressData, EstimatesTheRatioByASample)
{
    auto engine = adopt(new RunEngine);
    FMemoryStream source = streamOf(std::string(100000, 'a')), empty;
    const float ratio = FGetCompressionRatio(&source, engine, 1);
    EXPECT_FLOAT_EQ(ratio, 66.0f / 8192.0f);
    EXPECT_EQ(source.tell(), 8192);
    EXPECT_EQ(FGetCompressionRatio(&empty, engine, 1), 1.0f);
    source.rewind();
    EXPECT_EQ(FGetCompressionRatio(&source, nullptr, 1), 1.0f);
    FMemoryStream shortOne = streamOf("abab");
    EXPECT_FLOAT_EQ(FGetCompressionRatio(&shortOne, engine, 1), 2.0f);
}
