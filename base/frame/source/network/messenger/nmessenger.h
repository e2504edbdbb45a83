#pragma once

#include "containers/sequence/cmlinkedlist.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"
#include "foundation/thread/flock.h"
#include "network/messenger/netmessagenames.h"
#include "network/messenger/nworkcrew.h"

#include <atomic>
#include <memory>
#include <vector>

class FUrl;
class IMicrosecondsTimer;
class NBroadcastRecvThread;
class NMessage;
class NMessageRecvThread;

/// Lets the programs of a local network find each other and exchange messages.
///
/// Peers are found by hello and goodbye, which go to everyone as datagrams, or are entered by hand. A message goes by
/// TCP to an object's name at a peer, and arrives there through FMessenger on the main thread. Network errors drop the
/// message, or the peer that can't be reached, in silence. Nothing is signed or secret: everyone on the network can
/// send anything, so receivers check what they get.
///
/// Start, stop, the notify group and `notify` belong to the main thread; all else is thread-safe. The lock guards
/// peers, group and requests; FMessenger's are taken under it, never the other way round.
class NMessenger : public CmObject, public INetworkMessenger
{
    DECLARE_TYPE(NMessenger, CmObject)

    /// Peers known at a time; those who say hello beyond that aren't heard.
    static constexpr int kMaxReceivers = 1024;

    /// The first one made is `gNetMessenger`.
    NMessenger();
    NMessenger(const NMessenger&) = delete;
    NMessenger& operator=(const NMessenger&) = delete;
    ~NMessenger() override;
    CmObject* newCopy() const override { return nullptr; }

    // Running

    /// Begins to receive: messages, and unless `messagesOnly` also hellos and goodbyes. A port that can't be had
    /// leaves the messenger without its thread; false where that is the one for messages. Says no hello by itself.
    bool start(bool messagesOnly = false);
    /// Says goodbye, ends the threads, and gives messages that are being sent a moment.
    void stop();
    /// The port for messages, by default 6991. Another one is set before `start`; 0 takes a free one.
    uint16 getMsgPort() const { return port; }
    void setMsgPort(uint16 newPort) { port = newPort; }
    /// Borrowed; null, as at first, gives messages no time stamps. Set while the messenger doesn't run.
    IMicrosecondsTimer* getTimer() const { return timer; }
    void setTimer(IMicrosecondsTimer* newTimer) { timer = newTimer; }

    // Peers

    /// Objects of the group get `kNetAvailableMessage` and `kNetByeByeMessage`. They are borrowed, and leave the group
    /// and call FMessenger's `killMessages` before they go.
    void addToNotifyGroup(CmObject* object);
    void removeFromNotifyGroup(CmObject* object);
    /// Enters a peer by hand. False where it is known, or too many are.
    bool addReceiver(const char* host, uint16 receiverPort);
    bool removeReceiver(const char* host, uint16 receiverPort);
    /// Adds a copy of each peer, an NReceiver, to the container, which must own it. Returns how many.
    int copyReceivers(CmContainer& result);

    /// Says hello to everyone on the local networks, on this port; false where there is no network.
    bool sendHelloMessage(int broadcastPort = kNetBroadcastPort);
    bool sendByeByeMessage(int broadcastPort = kNetBroadcastPort);

    // Messages

    /// Sends the message as it is now to the object that is registered under this name at each known peer; peers
    /// without one drop it. The sending goes on after the return, in no set order. What comes too fast for the network
    /// is dropped.
    void sendMessage(const char* receiver, FMessage* message) override;
    /// Sends to the peer of this URL alone. False where the message has a value that can't be sent, or is too large.
    bool sendMessageTo(FUrl* url, const char* receiver, FMessage* message);

    // Hosts

    /// "a.b.c.d"; false where the name isn't known. This and the next one may take many seconds.
    bool hostNameToIP(const char* name, String& ip);
    bool ipToHostName(const char* ip, String& name);
    /// Finds out the name of an address, or the address of a name, in the background, and posts `kIpToNameResult` to
    /// the asker. An asker that goes before the answer calls `cancelRequests`.
    void requestHostName(const char* host, CmObject* asker);
    void cancelRequests(CmObject* asker);
    /// The name of this host.
    void getLocalHostName(String& name);
    /// "a.b.c.d", known from `start` on.
    void getLocalAddress(String& address);

    /// What hellos say of the program; without it "unknown". Called by the main thread.
    using ProgramInfo = void (*)(String& name, String& version);
    static void setProgramInfo(ProgramInfo info) { programInfo = info; }

    /// On `kSendHalloMsg` says hello. A message that tells a port and where it comes from enters that peer.
    int notify(FMessage* message) override;

    // For the messenger's own threads

    /// Enters or removes the peer that a hello or goodbye tells of, and tells the group.
    void peerChanged(bool isThere, NMessage& message);
    /// Posts the answer to whoever asked, if it still waits.
    void answerRequest(int number, FMessage& answer);

private:
    struct Request
    {
        int number;
        CmObject* asker;
    };
    enum Entering
    {
        kEntered,
        kKnown,
        kNoRoom
    };

    bool startMessages();
    void startBroadcasts();
    void takeLocalNames();
    bool broadcast(bool isHello, int broadcastPort);
    Entering enterReceiver(const char* host, uint16 receiverPort);
    void tellGroup(NMessage& message);

    static ProgramInfo programInfo;

    FString hostName;
    std::atomic<uint16> port{kNetMessagePort};
    CmLinkedList receivers;
    CmLinkedList notifyGroup;
    std::atomic<IMicrosecondsTimer*> timer{nullptr};
    std::unique_ptr<NMessageRecvThread> messageThread;
    std::unique_ptr<NBroadcastRecvThread> broadcastThread;
    FString hostAddress;
    std::vector<Request> requests;
    int lastRequest = 0;
    FLock lock{"net messenger"};
    NWorkCrew sending;
    NWorkCrew searching;
};

/// The messenger of the program; null where there is none. *Main thread*.
extern NMessenger* gNetMessenger;
