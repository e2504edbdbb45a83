#include "tests/job/process.h"

#include <gtest/gtest.h>

#include <csignal>
#include <cstdio>
#include <cstdlib>

#include <unistd.h>

namespace
{
const std::string kAddressA = "10.77.0.1";
const std::string kAddressB = "10.77.0.2";

/// Two network namespaces with a cable between them. Both are taken down at the end.
class Cable
{
public:
    Cable() : a("vlmra" + std::to_string(getpid())), b("vlmrb" + std::to_string(getpid()))
    {
        isUp = ip("netns add " + a) && ip("netns add " + b) &&
               ip("-n " + a + " link add veth0 type veth peer name veth0 netns " + b) &&
               raise(a, kAddressA) && raise(b, kAddressB);
    }
    ~Cable()
    {
        ip("netns del " + a);
        ip("netns del " + b);
    }
    Cable(const Cable&) = delete;
    Cable& operator=(const Cable&) = delete;

    bool isUp;
    const std::string a;
    const std::string b;

private:
    static bool ip(const std::string& arguments)
    {
        return std::system(("PATH=$PATH:/usr/sbin:/sbin ip " + arguments + " >/dev/null 2>&1").c_str()) == 0;
    }
    static bool raise(const std::string& name, const std::string& address)
    {
        return ip("-n " + name + " addr add " + address + "/24 broadcast + dev veth0") &&
               ip("-n " + name + " link set veth0 up") && ip("-n " + name + " link set lo up");
    }
};

/// A peer program in a namespace, with its output in a file that goes with it.
class Peer
{
public:
    explicit Peer(const std::string& networkName) : process(setupFor(networkName)) {}
    ~Peer() { unlink(output.c_str()); }

    bool says(const std::string& text) { return process.waitForOutput(text); }
    std::string everything() const { return process.output(); }
    void raise(int signalNumber) { kill(process.id(), signalNumber); }
    std::optional<int> awaitEnd() { return process.wait(kHangs); }

private:
    Process::Setup setupFor(const std::string& networkName)
    {
        char name[] = "/tmp/network-peer-XXXXXX";
        close(mkstemp(name));
        output = name;
        Process::Setup setup;
        setup.arguments = {"ip", "netns", "exec", networkName, NETWORK_PEER};
        setup.environment = {"PATH=/usr/sbin:/usr/bin:/sbin:/bin"};
        setup.output = output;
        return setup;
    }

    std::string output;
    Process process;
};
} // namespace

TEST(TwoProcesses, FindEachOtherExchangeMessagesAndPart)
{
    const Cable cable;
    if (!cable.isUp)
        GTEST_SKIP()
            << "needs network namespaces and the program ip: run it as root, with iproute2 installed";

    Peer first(cable.a);
    ASSERT_TRUE(first.says("receives: 1, says hello: 1")) << first.everything();
    {
        Peer second(cable.b);
        ASSERT_TRUE(second.says("receives: 1, says hello: 1")) << second.everything();
        // The first hears the second's hello and answers it with its own.
        EXPECT_TRUE(first.says("Test Peer 1.0 on " + kAddressB + ":6991, peers: 1")) << first.everything();
        ASSERT_TRUE(second.says("Test Peer 1.0 on " + kAddressA + ":6991, peers: 1")) << second.everything();

        second.raise(SIGUSR1);
        EXPECT_TRUE(first.says("message from " + kAddressB + ": whole")) << first.everything();
        first.raise(SIGUSR1);
        EXPECT_TRUE(second.says("message from " + kAddressA + ": whole")) << second.everything();

        second.raise(SIGTERM);
        EXPECT_EQ(second.awaitEnd(), 0) << second.everything();
        EXPECT_TRUE(first.says("goodbye from")) << first.everything();
        EXPECT_TRUE(first.says("peers now: 0")) << first.everything();
    }
    EXPECT_EQ(first.everything().find("on " + kAddressA), std::string::npos) << "it doesn't hear itself";
    first.raise(SIGTERM);
    EXPECT_EQ(first.awaitEnd(), 0);
}

TEST(TwoProcesses, APeerThatDiesIsDropped)
{
    const Cable cable;
    if (!cable.isUp)
        GTEST_SKIP()
            << "needs network namespaces and the program ip: run it as root, with iproute2 installed";

    Peer first(cable.a);
    ASSERT_TRUE(first.says("receives: 1"));
    Peer second(cable.b);
    ASSERT_TRUE(first.says("peers now: 1")) << first.everything();
    second.raise(SIGKILL);
    second.awaitEnd();
    first.raise(SIGUSR1);
    EXPECT_TRUE(first.says("peers now: 0")) << first.everything();
    EXPECT_EQ(first.everything().find("goodbye"), std::string::npos) << "nobody said it";
}
