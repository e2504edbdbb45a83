#include "network/messenger/nmessenger.h"

#include "foundation/thread/flockscope.h"
#include "network/messenger/nbroadcastrecvthread.h"
#include "network/messenger/nbroadcasttext.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/netmessagework.h"
#include "network/messenger/netnamework.h"
#include "network/messenger/nmessagerecvthread.h"
#include "network/messenger/nreceiver.h"
#include "network/messenger/nurlmsghandler.h"
#include "network/socket/naddresslookup.h"
#include "storage/stream/fmemorystream.h"

#include <algorithm>

NMessenger* gNetMessenger = nullptr;
NMessenger::ProgramInfo NMessenger::programInfo = nullptr;

namespace
{
/// Milliseconds that a message has to get through when the messenger stops.
constexpr int kGrace = 2000;
/// As many hellos may wait for one object; further ones come too fast to be of use.
constexpr int kMaxWaitingNews = 64;
/// Pulses that a hello waits, so that however many programs are heard of, there are a few hellos a second.
constexpr int kHelloDelay = 15;
} // namespace

NMessenger::NMessenger()
    : sending("Important Message", kThreadPriorityLow),
      searching("Host Name", kThreadPriorityLow)
{
    receivers.takeElements();
    initNUrlMsgHandler();
    if (!gNetMessenger)
        gNetMessenger = this;
}

NMessenger::~NMessenger()
{
    stop();
    if (gNetMessenger == this)
        gNetMessenger = nullptr;
}

// Running

bool NMessenger::start(bool messagesOnly)
{
    if (messageThread || broadcastThread)
        return messageThread != nullptr;
    takeLocalNames();
    const bool receives = startMessages();
    if (!messagesOnly)
        startBroadcasts();
    if (FMessenger* messenger = gMessenger)
    {
        messenger->registerName(kNetMessengerName, this);
        messenger->setNetwork(this);
    }
    return receives;
}

void NMessenger::takeLocalNames()
{
    FLockScope guard(lock);
    if (!hostName.isEmpty())
        return;
    NAddressLookup::getLocalHostName(hostName);
    NAddressLookup::getLocalAddress().toText(hostAddress);
}

bool NMessenger::startMessages()
{
    auto thread = std::make_unique<NMessageRecvThread>(port, timer);
    if (!thread->open() || thread->run() != 0)
        return false;
    port = thread->getPort();
    messageThread = std::move(thread);
    return true;
}

void NMessenger::startBroadcasts()
{
    auto thread = std::make_unique<NBroadcastRecvThread>(*this, kNetBroadcastPort);
    if (thread->open() && thread->run() == 0)
        broadcastThread = std::move(thread);
}

void NMessenger::stop()
{
    if (messageThread || broadcastThread)
    {
        sendByeByeMessage();
        if (FMessenger* messenger = gMessenger)
        {
            messenger->setNetwork(nullptr);
            messenger->unregisterName(kNetMessengerName);
        }
        messageThread = nullptr;
        broadcastThread = nullptr;
    }
    sending.end(kGrace);
    searching.end(0);
    if (FMessenger* messenger = gMessenger)
        messenger->killMessages(this, nullptr);
}

// Peers

void NMessenger::addToNotifyGroup(CmObject* object)
{
    FLockScope guard(lock);
    if (object && !notifyGroup.containsAbs(object))
        notifyGroup.add(object);
}

void NMessenger::removeFromNotifyGroup(CmObject* object)
{
    FLockScope guard(lock);
    notifyGroup.removeAbs(object);
}

NMessenger::Entering NMessenger::enterReceiver(const char* host, uint16 receiverPort)
{
    const auto entry = adopt(new NReceiver(host, receiverPort));
    FLockScope guard(lock);
    if (receivers.contains(entry))
        return kKnown;
    if (receivers.total() >= kMaxReceivers)
        return kNoRoom;
    receivers.add(IPtr<NReceiver>(entry).take());
    return kEntered;
}

bool NMessenger::addReceiver(const char* host, uint16 receiverPort)
{
    return host && *host && enterReceiver(host, receiverPort) == kEntered;
}

bool NMessenger::removeReceiver(const char* host, uint16 receiverPort)
{
    const NReceiver entry(host, receiverPort);
    FLockScope guard(lock);
    return receivers.remove(receivers.lookup(&entry));
}

int NMessenger::copyReceivers(CmContainer& result)
{
    FLockScope guard(lock);
    for (CmLinkedListIterator it(receivers); !it.done(); it.next())
        result.add(it.current()->newCopy());
    return receivers.total();
}

bool NMessenger::sendHelloMessage(int broadcastPort)
{
    return broadcast(true, broadcastPort);
}

bool NMessenger::sendByeByeMessage(int broadcastPort)
{
    return broadcast(false, broadcastPort);
}

bool NMessenger::broadcast(bool isHello, int broadcastPort)
{
    NBroadcastText text;
    text.isHello = isHello;
    text.port = port;
    getLocalHostName(text.host);
    if (programInfo)
        programInfo(text.program, text.version);
    const std::string bytes = text.print();
    const auto stream = adopt(new NBroadcastStream);
    return stream->open(static_cast<uint16>(broadcastPort)) &&
           stream->writeRaw(bytes.data(), static_cast<int64>(bytes.size())) > 0;
}

void NMessenger::peerChanged(bool isThere, NMessage& message)
{
    const ConstString host = message.getRemoteAddress();
    // The peer is entered first: whoever hears of it may answer at once.
    Entering entering = kKnown;
    if (isThere)
        entering = enterReceiver(host.text8(), message.getRemotePort());
    else
        removeReceiver(host.text8(), message.getRemotePort());
    if (entering == kNoRoom)
        return;
    tellGroup(message);
    FMessenger* messenger = gMessenger;
    // A program that we didn't know doesn't know us.
    if (entering == kEntered && messenger)
        messenger->postMessage(this, new FMessage(kSendHalloMsg), true, kHelloDelay);
}

void NMessenger::tellGroup(NMessage& message)
{
    FMessenger* messenger = gMessenger;
    if (!messenger)
        return;
    // The lock stays held, so that an object which has left the group gets nothing more.
    FLockScope guard(lock);
    for (CmLinkedListIterator it(notifyGroup); !it.done(); it.next())
        if (messenger->messagesPosted(it.current(), message.getMessageID()) < kMaxWaitingNews)
            messenger->postMessage(it.current(), static_cast<FMessage*>(message.newCopy()));
}

// Messages

void NMessenger::sendMessage(const char* receiver, FMessage* message)
{
    CmLinkedList peers;
    peers.takeElements();
    if (!receiver || !message || copyReceivers(peers) == 0)
        return;
    // Written once: anybody can enter peers, and none may cost more than a place in the queue.
    const IPtr<FMemoryStream> bytes = bytesForNetwork(receiver, *message);
    for (CmLinkedListIterator it(peers); bytes && !it.done(); it.next())
    {
        const auto url = adopt(new FUrl);
        static_cast<NReceiver*>(it.current())->getUrl(*url);
        sending.add(new NetMessageWork(*this, *url, bytes));
    }
}

bool NMessenger::sendMessageTo(FUrl* url, const char* receiver, FMessage* message)
{
    if (!url || !receiver || !message)
        return false;
    const IPtr<FMemoryStream> bytes = bytesForNetwork(receiver, *message);
    if (bytes)
        sending.add(new NetMessageWork(*this, *url, bytes));
    return bytes != nullptr;
}

int NMessenger::notify(FMessage* message)
{
    if (message->isType(kSendHalloMsg))
    {
        sendHelloMessage();
        return 1;
    }
    if (!message->contains(kNetMessagePortKey) || !message->contains(kMsgRemotePort))
        return CmObject::notify(message);
    const int64 told = message->getData(kNetMessagePortKey);
    const char* host = message->getString8(kMsgRemoteIPAddr);
    if (told > 0 && told <= 65535)
        addReceiver(host, static_cast<uint16>(told));
    return 1;
}

// Hosts

bool NMessenger::hostNameToIP(const char* name, String& ip)
{
    const std::vector<NAddress> found = NAddressLookup::findHost(name);
    ip.assign("");
    if (!found.empty())
        found[0].toText(ip);
    return !found.empty();
}

bool NMessenger::ipToHostName(const char* ip, String& name)
{
    NAddress address;
    name.assign("");
    return address.fromText(ip) && NAddressLookup::findName(address, name);
}

void NMessenger::requestHostName(const char* host, CmObject* asker)
{
    int number = 0;
    {
        FLockScope guard(lock);
        number = ++lastRequest;
        requests.push_back({number, asker});
    }
    searching.add(new NetNameWork(*this, host, number));
}

void NMessenger::cancelRequests(CmObject* asker)
{
    FLockScope guard(lock);
    std::erase_if(requests, [asker](const Request& request) { return request.asker == asker; });
}

void NMessenger::answerRequest(int number, FMessage& answer)
{
    FMessenger* messenger = gMessenger;
    // The lock stays held, so that an asker that has given up gets nothing more.
    FLockScope guard(lock);
    const auto isMeant = [number](const Request& request) { return request.number == number; };
    const auto found = std::find_if(requests.begin(), requests.end(), isMeant);
    if (found == requests.end())
        return;
    if (messenger)
        messenger->postMessage(found->asker, static_cast<FMessage*>(answer.newCopy()));
    requests.erase(found);
}

void NMessenger::getLocalHostName(String& name)
{
    FLockScope guard(lock);
    name = hostName;
}

void NMessenger::getLocalAddress(String& address)
{
    FLockScope guard(lock);
    address = hostAddress;
}
