#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/message/imessagereceiver.h"
#include "foundation/thread/fthread.h"

#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <string>
#include <thread>
#include <vector>

namespace
{
using Lines = std::vector<std::string>;

class Receiver : public CmObject
{
public:
    int notify(FMessage* message) override
    {
        received.push_back(message->getMessageID());
        if (reaction)
            reaction();
        return 5;
    }

    Lines received;
    std::function<void()> reaction;
};

/// A message that tells whether it is still there.
class TrackedMessage : public FMessage
{
public:
    explicit TrackedMessage(const char* messageType) : FMessage(messageType) { alive++; }
    TrackedMessage(const TrackedMessage& other) : FMessage(other) { alive++; }
    ~TrackedMessage() override { alive--; }
    CmObject* newCopy() const override { return new TrackedMessage(*this); }

    static inline int alive = 0;
};

class FMessengerTest : public testing::Test
{
protected:
    ~FMessengerTest() override
    {
        messenger.killMessages(&a, nullptr);
        messenger.killMessages(&b, nullptr);
        EXPECT_EQ(TrackedMessage::alive, 0) << "a message was lost or leaked";
    }

    static FMessage* make(const char* messageType) { return new TrackedMessage(messageType); }
    void post(Receiver& receiver, const char* messageType)
    {
        messenger.postMessage(&receiver, make(messageType));
    }

    FMessenger messenger;
    Receiver a, b;
};
} // namespace

TEST_F(FMessengerTest, DeliversInTheOrderOfPosting)
{
    post(a, "one");
    post(b, "two");
    post(a, "three");
    EXPECT_TRUE(a.received.empty());
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"one", "three"}));
    EXPECT_EQ(b.received, (Lines{"two"}));
    messenger.deliverMessages();
    EXPECT_EQ(a.received.size(), 2u);
}

TEST_F(FMessengerTest, DelayCountsDeliveries)
{
    messenger.postMessage(&a, make("late"), false, 3);
    post(a, "soon");
    for (int pulse = 1; pulse <= 3; pulse++)
    {
        messenger.deliverMessages();
        EXPECT_EQ(a.received, (Lines{"soon"})) << "pulse " << pulse;
    }
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"soon", "late"}));
}

TEST_F(FMessengerTest, DelayedMessagesKeepTheirOrder)
{
    messenger.postMessage(&a, make("first"), false, 1);
    messenger.postMessage(&a, make("second"), false, 1);
    post(a, "now");
    messenger.deliverMessages();
    post(a, "third");
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"now", "first", "second", "third"}));
}

TEST_F(FMessengerTest, UniqueDropsTheNewOneWhateverItCarries)
{
    messenger.postMessage(&a, make("x"), true);
    FMessage* second = make("x");
    second->addInt("value", 1);
    messenger.postMessage(&a, second, true);
    messenger.postMessage(&b, make("x"), true);
    messenger.postMessage(&a, make("y"), true);
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"x", "y"}));
    EXPECT_EQ(b.received, (Lines{"x"}));
}

TEST_F(FMessengerTest, WhatIsPostedDuringADeliveryWaitsForTheNext)
{
    a.reaction = [this]
    {
        a.reaction = nullptr;
        post(a, "answer");
    };
    post(a, "question");
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"question"}));
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"question", "answer"}));
}

TEST_F(FMessengerTest, DeliveryCanBeLocked)
{
    post(a, "x");
    EXPECT_FALSE(messenger.lockMessageDeliverance(true));
    messenger.deliverMessages();
    EXPECT_TRUE(a.received.empty());
    EXPECT_TRUE(messenger.lockMessageDeliverance(false));
    messenger.deliverMessages();
    EXPECT_EQ(a.received.size(), 1u);
}

TEST_F(FMessengerTest, KillsWhatWaitsAlsoInTheRunningDelivery)
{
    FMessage kind("y");
    a.reaction = [&] { messenger.killMessages(&b, &kind); };
    post(a, "go");
    post(b, "x");
    post(b, "y");
    messenger.postMessage(&b, make("y"), false, 2);
    messenger.deliverMessages();
    EXPECT_EQ(b.received, (Lines{"x"}));
    EXPECT_FALSE(messenger.areMessagesPosted(&b, nullptr));

    a.reaction = [&] { messenger.killMessages(&b, nullptr); };
    post(a, "go");
    post(b, "x");
    messenger.deliverMessages();
    EXPECT_EQ(b.received, (Lines{"x"}));
}

TEST_F(FMessengerTest, TellsWhatIsPosted)
{
    post(a, "x");
    post(a, "x");
    post(a, "y");
    EXPECT_TRUE(messenger.areMessagesPosted(&a, "y"));
    EXPECT_FALSE(messenger.areMessagesPosted(&a, "z"));
    EXPECT_FALSE(messenger.areMessagesPosted(&b, "y"));
    EXPECT_EQ(messenger.messagesPosted(&a, "x"), 2);
    EXPECT_EQ(messenger.messagesPosted(&a, nullptr), 3);
}

TEST_F(FMessengerTest, SendingCallsAtOnceAndLeavesTheMessage)
{
    FMessage message("now");
    EXPECT_EQ(messenger.sendMessage(&a, &message), 5);
    EXPECT_EQ(messenger.sendMessage(static_cast<CmObject*>(nullptr), &message), 0);
    EXPECT_EQ(a.received, (Lines{"now"}));
    EXPECT_EQ(message.getRefCount(), 1u);
}

TEST_F(FMessengerTest, FindsReceiversByName)
{
    FMessage message("named");
    EXPECT_EQ(messenger.sendMessage("a", &message, false), 0) << "nobody has the name";
    messenger.postMessage("a", make("lost"), false);
    messenger.registerName("a", &b);
    messenger.registerName("a", &a);
    EXPECT_EQ(messenger.sendMessage("a", &message, false), 5);
    messenger.postMessage("a", make("posted"), false);
    messenger.deliverMessages();
    EXPECT_EQ(a.received, (Lines{"named", "posted"}));
    EXPECT_TRUE(b.received.empty());
    messenger.unregisterName("a");
    messenger.unregisterName("never");
    EXPECT_EQ(messenger.sendMessage("a", &message, false), 0);
    EXPECT_EQ(a.getRefCount(), 1u) << "receivers are borrowed";
    messenger.registerName("left behind", &a);
}

TEST_F(FMessengerTest, ANameIsNotTakenBackWhileItsReceiverIsCalled)
{
    std::atomic<bool> isTakenBack{false};
    std::thread other;
    a.reaction = [&]
    {
        other = std::thread(
            [&]
            {
                messenger.unregisterName("a");
                isTakenBack = true;
            });
        FThreadSleep(20);
        EXPECT_FALSE(isTakenBack);
    };
    messenger.registerName("a", &a);
    FMessage message("named");
    messenger.sendMessage("a", &message, false);
    other.join();
    EXPECT_EQ(messenger.sendMessage("a", &message, false), 0);
}

TEST_F(FMessengerTest, SendsNamedMessagesToTheNetworkFirst)
{
    struct Network : INetworkMessenger
    {
        explicit Network(Receiver& receiver) : local(receiver) {}
        void sendMessage(const char* name, FMessage* message) override
        {
            sent.push_back(std::string(name) + " " + message->getMessageID());
            EXPECT_TRUE(local.received.empty());
        }
        Receiver& local;
        Lines sent;
    } network(a);
    messenger.setNetwork(&network);
    messenger.registerName("a", &a);
    FMessage message("m");
    messenger.sendMessage("elsewhere", &message, true);
    messenger.sendMessage("a", &message, true);
    messenger.sendMessage("a", &message, false);
    EXPECT_EQ(network.sent, (Lines{"elsewhere m", "a m"}));
    EXPECT_EQ(a.received.size(), 2u);
}

TEST_F(FMessengerTest, GroupsGetACopyEach)
{
    EXPECT_FALSE(messenger.addToNotifyGroup(1, &a));
    const int first = messenger.createNotifyGroup();
    const int second = messenger.createNotifyGroup();
    EXPECT_EQ(first, 1);
    EXPECT_EQ(second, 2);
    messenger.addToNotifyGroup(first, &a);
    messenger.addToNotifyGroup(first, &b);
    messenger.addToNotifyGroup(second, &b);

    messenger.postMessage(first, make("posted"));
    EXPECT_EQ(TrackedMessage::alive, 2) << "the original is given up";
    messenger.deliverMessages();
    messenger.postMessage(7, make("to nobody"));
    FMessage message("sent");
    EXPECT_EQ(messenger.sendMessage(second, &message), 5);
    EXPECT_TRUE(messenger.removeFromNotifyGroup(first, &a));
    messenger.sendMessage(first, &message);
    EXPECT_EQ(a.received, (Lines{"posted"}));
    EXPECT_EQ(b.received, (Lines{"posted", "sent", "sent"}));

    EXPECT_TRUE(messenger.deleteNotifyGroup(first));
    EXPECT_FALSE(messenger.deleteNotifyGroup(second)) << "the second group is now the first";
    EXPECT_TRUE(messenger.removeFromNotifyGroup(first, &b));
}

TEST_F(FMessengerTest, ServesReceiversOutsideTheClassTree)
{
    struct Outside : FObject, IMessageReceiver
    {
        int32 notify(IMessage* message) override
        {
            received.push_back(message->getMessageID());
            return 0;
        }
        int32 queryInterface(const char* interfaceID, void** object) override
        {
            if (isSameInterface(interfaceID, IMessageReceiver::iid))
                return offerInterface<IMessageReceiver>(this, object);
            return FObject::queryInterface(interfaceID, object);
        }
        FORWARD_FUNKNOWN(FObject)
        Lines received;
    } outside;
    IMessenger& face = messenger;
    EXPECT_EQ(face.postMessage(nullptr, make("to nobody")), -1);
    EXPECT_EQ(face.postMessage(&outside, nullptr), -1);
    EXPECT_EQ(face.killMessages(nullptr, nullptr), -1);
    EXPECT_EQ(face.postMessage(&outside, make("x")), 0);
    EXPECT_TRUE(face.wasMessagePosted(&outside));
    messenger.deliverMessages();
    EXPECT_EQ(outside.received, (Lines{"x"}));
    EXPECT_FALSE(face.wasMessagePosted(&outside));
    face.postMessage(&outside, make("y"));
    face.killMessages(&outside, nullptr);
    messenger.deliverMessages();
    EXPECT_EQ(outside.received, (Lines{"x"}));
}

TEST_F(FMessengerTest, ThreadsPostWhileTheMainThreadDelivers)
{
    constexpr int kMessages = 2000;
    std::vector<std::thread> threads;
    for (Receiver* receiver : {&a, &b})
        threads.emplace_back(
            [this, receiver]
            {
                for (int i = 0; i < kMessages; i++)
                    messenger.postMessage(receiver, new FMessage("news"));
            });
    while (a.received.size() + b.received.size() < 2 * kMessages)
        messenger.deliverMessages();
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(a.received.size(), b.received.size());
}
