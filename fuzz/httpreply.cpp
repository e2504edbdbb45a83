#include "foundation/object/iptr.h"
#include "fuzz/fuzztext.h"
#include "network/http/furlhttphandler.h"
#include "network/http/furlstream.h"
#include "services/defaults/fdefaultpool.h"
#include "storage/url/furl.h"

#include <algorithm>

namespace
{
constexpr char kNextReply = '\x1E';

/// The replies that one run gets, connection by connection, parted by a byte.
class Replies
{
public:
    explicit Replies(std::string allBytes) : bytes(std::move(allBytes)) {}

    /// False where there is none left: nobody answers.
    bool takeNext(std::string& reply)
    {
        if (isOver)
            return false;
        const size_t end = bytes.find(kNextReply, next);
        isOver = end == std::string::npos;
        reply = bytes.substr(next, isOver ? end : end - next);
        next = end + 1;
        return true;
    }

private:
    std::string bytes;
    size_t next = 0;
    bool isOver = false;
};

class ReplayStream : public FUrlStream
{
    DECLARE_TYPE(ReplayStream, FUrlStream)

    explicit ReplayStream(Replies& allReplies) : replies(allReplies) {}

    bool open(const char*, uint16, int) override { return replies.takeNext(reply); }
    bool close() override { return true; }

protected:
    int receiveSome(char* data, int size) override
    {
        const size_t count = reply.copy(data, static_cast<size_t>(size), received);
        received += count;
        return static_cast<int>(count);
    }
    int sendSome(const char*, int size) override { return size; }

private:
    Replies& replies;
    std::string reply;
    size_t received = 0;
};

class ReplayHandler : public FUrlHttpHandler
{
    DECLARE_TYPE(ReplayHandler, FUrlHttpHandler)

    ReplayHandler(FUrl& replayedUrl, Replies& allReplies) : FUrlHttpHandler(replayedUrl), replies(allReplies)
    {
    }

protected:
    FUrlStream* newStream() override { return new ReplayStream(replies); }
    bool askUser(FString& name, FString& secret) override
    {
        name = secret = u"ada";
        return true;
    }

private:
    Replies& replies;
};

void useProxy(bool isUsed)
{
    if (!gDefaultPool)
    {
        initFUrlHttpHandler();
        gDefaultPool = new FDefaultPool;
    }
    gDefaultPool->setLong("HttpHandlerDefaults", "Use Proxy", isUsed ? 1 : 0);
    gDefaultPool->setTString("HttpHandlerDefaults", "Proxy Host", "proxy");
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzText input(data, size);
    useProxy(input.takeByte() % 2 == 1);
    const size_t begin = std::min<size_t>(size, 1);
    Replies replies(std::string(reinterpret_cast<const char*>(data) + begin, size - begin));
    FUrl url(u"http://host/file");
    const auto handler = adopt(new ReplayHandler(url, replies));

    const bool isOpen = handler->open();
    require(handler->getLength() >= 0);
    require(isOpen || handler->getRedirected().isEmpty());
    require(!isOpen || handler->getStream());
    char block[100];
    int64 total = 0;
    if (FStream* stream = handler->getStream())
        for (int64 count; (count = stream->readRaw(block, sizeof block)) > 0;)
            total += count;
    require(total <= static_cast<int64>(size));
    require(handler->close() || !isOpen);
    return 0;
}
