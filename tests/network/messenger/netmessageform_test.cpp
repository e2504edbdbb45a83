#include "containers/sequence/cmlinkedlist.h"
#include "network/messenger/netmessageform.h"
#include "network/messenger/netmessagenames.h"
#include "network/socket/naddress.h"
#include "storage/stream/fmemorystream.h"
#include "tests/network/everykind.h"
#include "tests/storage/objectfixture.h"

#include <gtest/gtest.h>

namespace
{
std::string bytesOf(const FMessage& message)
{
    FMemoryStream stream;
    EXPECT_TRUE(writeNetMessage(stream, "inbox", message));
    return contentOf(stream);
}

IPtr<NMessage> readFrom(const std::string& bytes)
{
    FString receiver;
    return readNetMessage(*streamOf(bytes), receiver);
}
} // namespace

TEST(NetMessageForm, NamesTheReceiverThenAZeroThenTheMessage)
{
    FMessage message("news");
    message.addInt("n", 5);
    const std::string bytes = bytesOf(message);
    const std::string expected("\6\0\0\0inbox\0" // the receiver
                               "\0\0\0\0"        // the zero
                               "\5\0\0\0news\0"  // the type
                               "\1\0\0\0"        // one value
                               "\2\0\0\0n\0\1\0" // its name, an integer
                               "\5\0\0\0\0\0\0\0",
                               43);
    EXPECT_EQ(hex(bytes), hex(expected));

    FString receiver;
    const auto read = readNetMessage(*streamOf(bytes), receiver);
    ASSERT_TRUE(read);
    EXPECT_STREQ(receiver.text8(), "inbox");
    EXPECT_TRUE(read->isType("news"));
    EXPECT_EQ(read->getData("n"), 5);

    std::string another = bytes;
    another[10] = 1;
    EXPECT_FALSE(readFrom(another)) << "the word behind the receiver isn't 0";
}

TEST(NetMessageForm, CarriesEveryKindOfValue)
{
    const WordComponents components;
    const auto message = makeEveryKind("kinds");
    const auto read = readFrom(bytesOf(*message));
    ASSERT_TRUE(read);
    EXPECT_EQ(differenceFromEveryKind(*read, "kinds"), "");
    const auto copy = adopt(static_cast<FMessage*>(read->newCopy()));
    EXPECT_EQ(differenceFromEveryKind(*copy, "kinds"), "") << "the type lives on in a copy";

    int here = 0;
    message->addPointer("pointer", &here);
    FMemoryStream stream;
    EXPECT_FALSE(writeNetMessage(stream, "inbox", *message)) << "an address means nothing elsewhere";
    EXPECT_FALSE(bytesForNetwork("inbox", *message));
}

TEST(NetMessageForm, GetsTheTimeOfSendingAndKeepsTheRest)
{
    const WordComponents components;
    const auto bytes = bytesForNetwork("inbox", *makeEveryKind("kinds"));
    ASSERT_TRUE(bytes);
    const std::string before = contentOf(*bytes);
    const auto stamped = withSentTime(*bytes, 77);
    ASSERT_TRUE(stamped);
    EXPECT_EQ(hex(contentOf(*bytes)), hex(before)) << "others are sending them";
    stamped->rewind();
    FString receiver;
    const auto read = readNetMessage(*stamped, receiver);
    ASSERT_TRUE(read);
    EXPECT_STREQ(receiver.text8(), "inbox");
    int64 time = 0;
    EXPECT_TRUE(read->getSentTime(time));
    EXPECT_EQ(time, 77);
    read->remove(kNetSentStamp);
    EXPECT_EQ(differenceFromEveryKind(*read, "kinds"), "");
}

TEST(NetMessageForm, DropsMessagesThatAreCutOrDamaged)
{
    const WordComponents components;
    const std::string bytes = bytesOf(*makeEveryKind("kinds"));
    for (size_t length = 0; length < bytes.size(); length++)
        EXPECT_FALSE(readFrom(bytes.substr(0, length))) << length;
    // Some damage can't be seen. What it reads as must be harmless, which the sanitizers watch.
    int accepted = 0;
    for (size_t place = 0; place < bytes.size(); place++)
        for (const char value : {'\0', '\x7f', '\xff'})
        {
            std::string damaged = bytes;
            damaged[place] = value;
            accepted += readFrom(damaged) != nullptr;
        }
    EXPECT_LT(accepted, static_cast<int>(bytes.size() * 3));
}

TEST(NetMessageForm, LeavesNothingBehindOfListsThatShare)
{
    FMessage message("m");
    {
        const auto node = adopt(new StoredNode(1));
        const auto list = adopt(new CmLinkedList);
        list->add(node);
        message.add("list", list, true);
        const std::string bytes = bytesOf(message);
        message.remove("list");
        const auto read = readFrom(bytes);
        ASSERT_TRUE(read);
        EXPECT_EQ(FCast(CmLinkedList, read->get("list"))->total(), 1);
        EXPECT_EQ(StoredNode::alive, 2);
        EXPECT_FALSE(readFrom(bytes.substr(0, bytes.size() - 1)));
    }
    EXPECT_EQ(StoredNode::alive, 0);
}

TEST(NetMessageForm, LimitsTheObjects)
{
    FMessage message("m");
    const auto list = adopt(new CmLinkedList);
    list->takeElements();
    message.add("list", list, true);
    // The list is one of them.
    for (int i = 1; i < kMaxNetMessageObjects; i++)
        list->add(new CmString("x"));
    EXPECT_TRUE(readFrom(bytesOf(message)));
    list->add(new CmString("x"));
    EXPECT_FALSE(readFrom(bytesOf(message)));
    EXPECT_FALSE(bytesForNetwork("inbox", message)) << "nobody would take it";

    const auto one = adopt(new CmString("x"));
    const auto references = adopt(new CmLinkedList);
    references->retainElements();
    message.add("list", references, true);
    for (int i = 1; i < kMaxNetMessageObjects; i++)
        references->add(one);
    EXPECT_TRUE(readFrom(bytesOf(message)));
    references->add(one);
    EXPECT_FALSE(readFrom(bytesOf(message))) << "a reference is short, but no less work";

    FMessage large("m");
    const std::string text(static_cast<size_t>(kMaxNetMessage), 'x');
    large.addString8("text", text.c_str());
    EXPECT_FALSE(bytesForNetwork("inbox", large));
}

TEST(NMessage, KeepsTimeStampsAndTheSender)
{
    NMessage message("m");
    int64 time = -1;
    EXPECT_FALSE(message.getSentTime(time));
    message.setSentTime(123456789012);
    message.setRemote(NAddress{{10, 0, 0, 7}}, 40000);
    const auto read = readFrom(bytesOf(message));
    ASSERT_TRUE(read);
    EXPECT_TRUE(read->getSentTime(time));
    EXPECT_EQ(time, 123456789012);
    EXPECT_FALSE(read->getReceivedTime(time));
    EXPECT_TRUE(read->getRemoteAddress() == ConstString("10.0.0.7"));
    EXPECT_EQ(read->getRemotePort(), 40000);
}
