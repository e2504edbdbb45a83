#include "storage/stream/ffilestream.h"

#include "storage/stream/fbufferedstream.h"
#include "storage/stream/uprogresshook.h"
#include "tests/storage/filefixture.h"
#include "tests/storage/sizelimit.h"

#include <cerrno>

namespace
{
class CountingHook : public UProgressHook
{
public:
    bool wasCanceled() override { return canceled; }
    void setMaximum(int64) override {}
    void setValue(int64 newValue) override { value = newValue; }
    int64 getValue() const override { return value; }
    void setText(const char16*) override {}

    int64 value = 0;
    bool canceled = false;
};

class FFileStreamTest : public FileTest, public testing::WithParamInterface<int>
{
protected:
    FFileStream* open(const char* name, int flags)
    {
        FStream* stream = exists(name) ? files->openFile(at(name), flags | GetParam(), nullptr)
                                       : files->createFile(at(name), flags | GetParam(), nullptr);
        return FCast(FFileStream, stream);
    }
};

// Buffered and unbuffered files behave alike.
INSTANTIATE_TEST_SUITE_P(BothKinds, FFileStreamTest, testing::Values(0, int{kFileDirect}));

TEST_P(FFileStreamTest, ReadsAndWritesInTurn)
{
    FFileStream* stream = open("a", kFileReadWrite);
    ASSERT_TRUE(stream && stream->isValid());
    EXPECT_TRUE(stream->writeInt32(1));
    EXPECT_TRUE(stream->writeInt32(2));
    EXPECT_TRUE(stream->writeInt32(3));
    EXPECT_EQ(stream->seek(4, kSeekStart), 4);
    int32 value = 0;
    EXPECT_TRUE(stream->readInt32(value));
    EXPECT_EQ(value, 2);
    EXPECT_TRUE(stream->writeInt32(4)) << "writing right behind a read";
    stream->rewind();
    int32 values[3] = {};
    EXPECT_TRUE(stream->readInt32Array(values, 3));
    EXPECT_EQ(values[2], 4);
    EXPECT_EQ(stream->tell(), 12);
    EXPECT_EQ(stream->getEof(), 12);
    EXPECT_EQ(stream->tell(), 12);
    EXPECT_FALSE(stream->readInt32(value));
    EXPECT_TRUE(stream->eof());
    EXPECT_FALSE(stream->error()) << "the end is no error";
    EXPECT_TRUE(files->closeFile(stream));
}

TEST_P(FFileStreamTest, SizeCanBeSet)
{
    FFileStream* stream = open("a", kFileReadWrite);
    stream->writeString8("0123456789", false);
    EXPECT_TRUE(stream->setEof(4));
    EXPECT_EQ(stream->getEof(), 4);
    EXPECT_EQ(stream->setStreamSize(6), 0);
    int64 size = 0;
    EXPECT_EQ(stream->getStreamSize(size), 0);
    EXPECT_EQ(size, 6);
    EXPECT_EQ(stream->setStreamSize(-1), 4);
    const IPtr<ISizeableStream> sizeable =
        adopt(askInterface<ISizeableStream>(static_cast<CmObject*>(stream)));
    EXPECT_EQ(sizeable.get(), static_cast<ISizeableStream*>(stream));
    EXPECT_TRUE(files->closeFile(stream));
    EXPECT_EQ(contentOf("a"), std::string("0123\0\0", 6));
}

TEST_P(FFileStreamTest, HookFollowsAndCancels)
{
    CountingHook hook;
    FFileStream* stream = open("a", kFileReadWrite);
    stream->setReadWriteHook(&hook, 0);
    stream->writeString8("0123456789", false);
    EXPECT_EQ(hook.value, 10);
    stream->seek(2, kSeekStart);
    EXPECT_EQ(hook.value, 2);
    stream->seek(3, kSeekCurrent);
    EXPECT_EQ(hook.value, 5);
    stream->seek(0, kSeekEnd);
    EXPECT_EQ(hook.value, 5);
    stream->rewind();
    EXPECT_EQ(hook.value, 0);
    hook.canceled = true;
    char byte = 0;
    EXPECT_EQ(stream->readRaw(&byte, 1), -1);
    EXPECT_EQ(stream->writeRaw(&byte, 1), -1);
    EXPECT_EQ(hook.value, 0);
    stream->setReadWriteHook(nullptr, 0);
    files->closeFile(stream);
}

TEST_P(FFileStreamTest, ClosedStreamsRefuse)
{
    FFileStream* stream = open("a", kFileWrite);
    EXPECT_TRUE(stream->close());
    EXPECT_TRUE(stream->close());
    char byte = 0;
    EXPECT_EQ(stream->readRaw(&byte, 1), -1);
    EXPECT_EQ(stream->writeRaw(&byte, 1), -1);
    EXPECT_EQ(stream->seek(0, kSeekStart), -1);
    EXPECT_EQ(stream->tell(), -1);
    EXPECT_EQ(stream->getEof(), -1);
    EXPECT_EQ(stream->getFileRef(), -1);
    EXPECT_FALSE(stream->setEof(0));
    EXPECT_TRUE(stream->eof());
    stream->release();
}

TEST_P(FFileStreamTest, FullDiskShowsWhenClosingAtTheLatest)
{
    FFileStream* stream = open("a", kFileWrite);
    {
        const SizeLimit limit(4096);
        const std::string block(16384, 'x');
        stream->writeRaw(block.data(), 10000);
        stream->addRef();
        EXPECT_FALSE(files->closeFile(stream));
    }
    EXPECT_EQ(stream->getFirstError(true), EFBIG);
    stream->release();
}

TEST_P(FFileStreamTest, FirstErrorIsKept)
{
    FFileStream* stream = open("a", kFileWrite);
    stream->setFirstError(ENOSPC);
    stream->setFirstError(EIO);
    EXPECT_EQ(stream->getFirstError(true), ENOSPC);
    EXPECT_EQ(stream->getFirstError(false), FNFileSystem::kDiskFull);
    FString text;
    stream->getErrorMessage(text);
    EXPECT_EQ(utf8(text), "This disk is full.");
    stream->addRef();
    EXPECT_FALSE(files->closeFile(stream)) << "what went wrong earlier counts";
    stream->clearError();
    EXPECT_EQ(stream->getFirstError(false), 0);
    stream->release();
}

TEST_F(FileTest, DirectFilesLeaveNothingReservedBehind)
{
    FFileStream* stream = FCast(FFileStream, files->createFile(at("a"), kFileWrite | kFileDirect, nullptr));
    EXPECT_GT(stream->getSeekAlign(), 0);
    stream->writeString8("abc", false);
    EXPECT_EQ(stream->getEof(), 3) << "room that is reserved doesn't count";
    EXPECT_TRUE(files->closeFile(stream));
    EXPECT_EQ(contentOf("a"), "abc");
    EXPECT_LT(std::filesystem::file_size(root + "/a"), 4u);
}

TEST_F(FileTest, ACacheDoesNotLengthenAFileThatLostData)
{
    FFileStream* file = FCast(FFileStream, files->createFile(at("a"), kFileWrite | kFileDirect, nullptr));
    {
        FBufferedStream cache(file, 4096, true, nullptr);
        const SizeLimit limit(4096);
        const std::string bytes(10000, 'x');
        cache.writeRaw(bytes.data(), 10000);
        cache.flush();
        EXPECT_FALSE(cache.verify());
    }
    EXPECT_EQ(file->getEof(), 4096);
    EXPECT_FALSE(files->closeFile(file));
}

TEST_F(FileTest, BufferedWritesArriveWithoutClosing)
{
    FStream* stream = files->createFile(at("a"), kFileWrite, nullptr);
    stream->writeString8("abc", false);
    EXPECT_EQ(contentOf("a"), "");
    stream->flush();
    EXPECT_EQ(contentOf("a"), "abc");
    stream->writeString8("d", false);
    stream->release();
    EXPECT_EQ(contentOf("a"), "abcd") << "letting the stream go closes it";
}
} // namespace
