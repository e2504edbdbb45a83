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
    explicit Replies(std::string bytes) : rest(std::move(bytes)) {}

    /// False where there is none left: nobody answers.
    bool takeNext(std::string& reply)
    {
        if (isOver)
            return false;
        const size_t end = rest.find(kNextReply);
        isOver = end == std::string::npos;
        reply = rest.substr(0, end);
        rest.erase(0, isOver ? rest.size() : end + 1);
        return true;
    }

private:
    std::string rest;
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
        const size_t count = reply.copy(data, static_cast<size_t>(size));
        reply.erase(0, count);
        return static_cast<int>(count);
    }
    int sendSome(const char*, int size) override { return size; }

private:
    Replies& replies;
    std::string reply;
};

class ReplayHandler : public FUrlHttpHandler
{
    DECLARE_TYPE(ReplayHandler, FUrlHttpHandler)

    ReplayHandler(FUrl& replayedUrl, Replies& allReplies) : FUrlHttpHandler(replayedUrl), replies(allReplies)
    {
    }

protected:
    FUrlStream* newStream() override { return new ReplayStream(replies); }

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
