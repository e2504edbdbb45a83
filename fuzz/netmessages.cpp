// What a peer sends as a message.

#include "foundation/text/fstring.h"
#include "fuzz/fuzztext.h"
#include "network/messenger/netmessageform.h"
#include "storage/stream/fmemorystream.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FMemoryStream stream(const_cast<uint8_t*>(data), static_cast<int64>(size));
    FString receiver;
    const IPtr<NMessage> message = readNetMessage(stream, receiver);
    if (!message)
        return 0;
    // What was read can be copied, and what can be sent on reads again.
    const auto copy = adopt(static_cast<FMessage*>(message->newCopy()));
    FMemoryStream written;
    if (!writeNetMessage(written, receiver.text8(), *copy))
        return 0;
    written.rewind();
    require(readNetMessage(written, receiver) != nullptr);
    return 0;
}
