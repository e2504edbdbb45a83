// A program on a network, for the tests: it tells what it hears, and sends to whoever it hears of.

#include "foundation/message/fmessenger.h"
#include "network/messenger/nmessage.h"
#include "network/messenger/nmessenger.h"
#include "tests/network/everykind.h"

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <thread>

namespace
{
constexpr char kType[] = "every kind";

std::atomic<bool> isAskedToEnd{false};
std::atomic<bool> isAskedToSend{false};

void onSignal(int number)
{
    (number == SIGUSR1 ? isAskedToSend : isAskedToEnd) = true;
}

int countPeers(NMessenger& messenger)
{
    CmLinkedList peers;
    peers.takeElements();
    return messenger.copyReceivers(peers);
}

/// Prints a line for each thing that it hears.
class Listener : public CmObject
{
    DECLARE_TYPE(Listener, CmObject)

    explicit Listener(NMessenger& heard) : messenger(heard) {}

    int notify(FMessage* message) override
    {
        if (message->isType(kNetAvailableMessage))
            tell("hello", *message);
        else if (message->isType(kNetByeByeMessage))
            tell("goodbye", *message);
        else
        {
            const std::string wrong = differenceFromEveryKind(*message, kType);
            printf("message from %s: %s\n", message->getString8(kMsgRemoteIPAddr),
                   wrong.empty() ? "whole" : wrong.c_str());
        }
        return 1;
    }

private:
    void tell(const char* what, FMessage& message)
    {
        printf("%s from %s, %s %s on %s:%d, peers: %d\n", what, message.getString8(kNetSender),
               message.getString8(kNetProgramName), message.getString8(kNetProgramVersion),
               message.getString8(kMsgRemoteIPAddr), static_cast<int>(message.getData(kMsgRemotePort)),
               countPeers(messenger));
    }

    NMessenger& messenger;
};

void run(NMessenger& messenger)
{
    int peers = 0;
    while (!isAskedToEnd)
    {
        gMessenger->deliverMessages();
        if (isAskedToSend.exchange(false))
            messenger.sendMessage("inbox", makeEveryKind(kType));
        if (const int now = countPeers(messenger); now != peers)
            printf("peers now: %d\n", peers = now);
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
}
} // namespace

int main()
{
    setvbuf(stdout, nullptr, _IOLBF, 0);
    for (const int number : {SIGTERM, SIGUSR1})
        signal(number, onSignal);
    gMessenger = FMessenger::instance();
    const WordComponents components;
    NMessenger messenger;
    Listener listener(messenger);
    NMessenger::setProgramInfo(
        [](String& name, String& version)
        {
            name = u"Test Peer";
            version = "1.0";
        });
    messenger.addToNotifyGroup(&listener);
    gMessenger->registerName("inbox", &listener);
    const bool receives = messenger.start();
    const bool isHeard = messenger.sendHelloMessage();
    printf("receives: %d, says hello: %d\n", receives, isHeard);
    run(messenger);
    messenger.stop();
    gMessenger->killMessages(&listener, nullptr);
    printf("stopped\n");
    return 0;
}
