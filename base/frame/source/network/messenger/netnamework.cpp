#include "network/messenger/netnamework.h"

#include "foundation/message/fmessage.h"
#include "network/messenger/netmessagenames.h"
#include "network/messenger/nmessenger.h"
#include "network/socket/naddresslookup.h"

NetNameWork::NetNameWork(NMessenger& owner, const char* host, int requestNumber)
    : messenger(owner),
      asked(host),
      request(requestNumber)
{
}

void NetNameWork::performThreadWork(void*)
{
    String host, ip;
    NAddress address;
    if (address.fromText(asked.text8()))
    {
        ip = asked;
        NAddressLookup::findName(address, host, -1, &canceller);
    }
    else
    {
        host = asked;
        const std::vector<NAddress> found = NAddressLookup::findHost(asked.text8(), -1, &canceller);
        if (!found.empty())
            found[0].toText(ip);
    }
    const auto answer = adopt(new FMessage(kIpToNameResult));
    answer->addString(kNetHost, host);
    answer->addString(kNetIP, ip);
    messenger.answerRequest(request, *answer);
}

void NetNameWork::cancelWork()
{
    canceller.stopOperation();
}
