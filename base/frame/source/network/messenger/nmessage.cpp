#include "network/messenger/nmessage.h"

#include "network/messenger/netmessagenames.h"
#include "network/messenger/ntimestamp.h"
#include "network/socket/naddress.h"

DEFINE_CLASS(NMessage, FMessage)

void NMessage::setRemote(const NAddress& address, uint16 port)
{
    String text;
    address.toText(text);
    addString(kMsgRemoteIPAddr, text);
    addData(kMsgRemotePort, port);
}

ConstString NMessage::getRemoteAddress() const
{
    return getString(kMsgRemoteIPAddr);
}

uint16 NMessage::getRemotePort() const
{
    return static_cast<uint16>(getData(kMsgRemotePort));
}

bool NMessage::getTime(const char* key, int64& microseconds) const
{
    const auto* stamp = FCast(NTimeStamp, get(key));
    if (stamp)
        microseconds = stamp->getMicroseconds();
    return stamp != nullptr;
}

bool NMessage::getSentTime(int64& microseconds) const
{
    return getTime(kNetSentStamp, microseconds);
}

bool NMessage::getReceivedTime(int64& microseconds) const
{
    return getTime(kNetReceivedStamp, microseconds);
}

void NMessage::setSentTime(int64 microseconds)
{
    add(kNetSentStamp, adopt(new NTimeStamp(microseconds)), true);
}

void NMessage::setReceivedTime(int64 microseconds)
{
    add(kNetReceivedStamp, adopt(new NTimeStamp(microseconds)), true);
}
