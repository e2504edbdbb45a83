#include "containers/sequence/cmlinkedlist.h"
#include "foundation/text/cmstring.h"
#include "network/socket/naddress.h"
#include "network/socket/naddresslookup.h"
#include "network/socket/nsocket.h"

#include <gtest/gtest.h>

#include <string>

namespace
{
std::string textOf(const NAddress& address)
{
    FString text;
    address.toText(text);
    return text.text8();
}
} // namespace

TEST(NAddress, ReadsFourNumbersAndNothingElse)
{
    for (const char* text : {"0.0.0.0", "127.0.0.1", "255.255.255.255", "10.20.30.40"})
    {
        NAddress address;
        EXPECT_TRUE(address.fromText(text)) << text;
        EXPECT_EQ(textOf(address), text);
    }
    for (const char* text : {"", "1.2.3", "1.2.3.4.5", "1.2.3.256", "1.2.3.4 ", " 1.2.3.4", "1..3.4",
                             "a.b.c.d", "1.2.3.-4", "1.2.3.4x", "0001.2.3.4", "localhost"})
    {
        NAddress address{{9, 9, 9, 9}};
        EXPECT_FALSE(address.fromText(text)) << text;
        EXPECT_TRUE(address.isAny()) << "a text that isn't one leaves none: " << text;
    }
    EXPECT_FALSE(NAddress().fromText(nullptr));
}

TEST(NAddressLookup, ListsTheAddressesOfThisHost)
{
    CmLinkedList known, all;
    known.takeElements();
    all.takeElements();
    const int count = NAddressLookup::getLocalAddresses(known);
    EXPECT_EQ(known.total(), count);
    EXPECT_GE(NAddressLookup::getLocalAddresses(all, true), count);
    for (int i = 0; i < count; i++)
    {
        NAddress address;
        ASSERT_TRUE(address.fromText(FCast(CmString, known.at(i))->text8()));
        EXPECT_FALSE(address.isLoopback());
        EXPECT_TRUE(NAddressLookup::isLocalAddress(address));
    }
    EXPECT_TRUE(NAddressLookup::isLocalAddress(kLoopbackAddress));
    EXPECT_FALSE(NAddressLookup::isLocalAddress(NAddress{{192, 0, 2, 1}})) << "an address of no host";
    EXPECT_TRUE(NAddressLookup::isLocalAddress(NAddressLookup::getLocalAddress()));
}

TEST(NAddressLookup, FindsHostsUntilItIsToldToGiveUp)
{
    const std::vector<NAddress> numbers = NAddressLookup::findHost("10.1.2.3");
    ASSERT_EQ(numbers.size(), 1u);
    EXPECT_EQ(textOf(numbers[0]), "10.1.2.3");

    const std::vector<NAddress> local = NAddressLookup::findHost("localhost");
    ASSERT_FALSE(local.empty());
    EXPECT_TRUE(local[0].isLoopback());

    EXPECT_TRUE(NAddressLookup::findHost("").empty());
    EXPECT_TRUE(NAddressLookup::findHost(nullptr).empty());

    NSocket stopped(NSocket::kStream);
    stopped.stopOperation();
    EXPECT_TRUE(NAddressLookup::findHost("localhost", -1, &stopped).empty());
    FString name;
    EXPECT_FALSE(NAddressLookup::findName(kLoopbackAddress, name, -1, &stopped));
    EXPECT_TRUE(name.isEmpty());
}
