#include "network/messenger/nreceiver.h"

#include "foundation/object/stringhash.h"
#include "network/messenger/nurlmsghandler.h"
#include "storage/url/furl.h"

void NReceiver::getUrl(FUrl& url) const
{
    url.set(kNetMessageProtocol, host.text8(), port, nullptr);
}

bool NReceiver::isEqual(const CmObject* other) const
{
    const auto* receiver = FCast(NReceiver, other);
    return receiver && port == receiver->port && host == receiver->host;
}

unsigned NReceiver::hash(unsigned size) const
{
    return hashString8(host.text8(), size);
}
