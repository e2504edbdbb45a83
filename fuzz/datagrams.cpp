// What comes as a datagram on the port of hellos and goodbyes.

#include "containers/value/cmbuffer.h"
#include "foundation/message/fmessenger.h"
#include "fuzz/fuzztext.h"
#include "network/messenger/nbroadcastrecvthread.h"
#include "network/messenger/nbroadcasttext.h"
#include "network/messenger/nmessenger.h"

namespace
{
/// What was read must be printed as something that reads the same.
void checkRoundTrip(const uint8_t* data, size_t size)
{
    NBroadcastText text, again;
    if (!text.parse(reinterpret_cast<const char*>(data), static_cast<unsigned>(size)))
        return;
    const std::string printed = text.print();
    if (printed.size() > NBroadcastText::kMaxSize)
        return;
    require(again.parse(printed.data(), static_cast<unsigned>(printed.size())));
    require(again.port == text.port && again.isHello == text.isHello);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    gMessenger = FMessenger::instance();
    static NMessenger messenger;
    static NBroadcastRecvThread ear(messenger, 0);
    static CmObject listener;
    messenger.addToNotifyGroup(&listener);

    checkRoundTrip(data, size);
    CmBuffer datagram(static_cast<const void*>(data), static_cast<uint32>(size));
    ear.handleBroadcastMessage(datagram, 1, NAddress{{192, 0, 2, 1}}, 1);
    gMessenger->killMessages(&listener, nullptr);
    // A hello would go out to the network.
    gMessenger->killMessages(&messenger, nullptr);
    return 0;
}
