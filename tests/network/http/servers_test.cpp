#include "tests/network/http/servers.h"

#include "network/http/furltlsstream.h"
#include "tests/network/http/httpfixture.h"
#include "tests/network/http/peer.h"
#include "tools/service/certificates.h"

#include <cstdio>

#include <openssl/pem.h>

// Against servers as they are: nginx and tinyproxy.

namespace
{
class Servers : public HttpTest
{
protected:
    void SetUp() override
    {
        HttpTest::SetUp();
        folders.app.fromUTF8(root.c_str());
        std::filesystem::create_directories(root + "/Resources");
        trust(authority);
        server = makeServer("server", authority.issue());
    }

    void trust(const CertificateAuthority& trusted) const { put("Resources/cacert.pem", trusted.pem()); }

    std::unique_ptr<WebServer> makeServer(const std::string& name, const ServerIdentity& identity) const
    {
        const std::string certificate = root + "/" + name + ".pem", key = root + "/" + name + ".key";
        FILE* certificateFile = fopen(certificate.c_str(), "w");
        EXPECT_EQ(PEM_write_X509(certificateFile, identity.certificate.get()), 1);
        fclose(certificateFile);
        FILE* keyFile = fopen(key.c_str(), "w");
        EXPECT_EQ(PEM_write_PrivateKey(keyFile, identity.key.get(), nullptr, nullptr, 0, nullptr, nullptr),
                  1);
        fclose(keyFile);
        return std::make_unique<WebServer>(root + "/" + name, certificate, key);
    }

    /// Whether it opens and has this body. A proxy may order the fields anew, so the length can be anything.
    testing::AssertionResult gives(const Outcome& outcome, const std::string& body) const
    {
        if (outcome.isOpen && outcome.body == body)
            return testing::AssertionSuccess();
        return testing::AssertionFailure() << testing::PrintToString(outcome);
    }

    CertificateAuthority authority;
    std::unique_ptr<WebServer> server;
};

bool holds(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}
} // namespace

TEST_F(Servers, GiveTheirFiles)
{
    const std::string hello = server->plainUrl("hello.txt");
    // "Connection: close" takes the length away that came before it.
    EXPECT_EQ(get(hello), (Outcome{true, 0, "hello", "", hello}));
    EXPECT_EQ(get(server->plainUrl("moved")), (Outcome{true, 0, "hello", "", hello}));
    const std::string included = server->plainUrl("included.html");
    EXPECT_EQ(get(included), (Outcome{true, 0, "assembled", "", included}));
    EXPECT_EQ(get(server->plainUrl("secure")), (Outcome{false, 0, "", "", server->secureUrl("hello.txt")}));

    const Outcome missing = get(server->plainUrl("missing"));
    EXPECT_FALSE(missing.isOpen);
    EXPECT_TRUE(holds(missing.body, "404 Not Found")) << missing.body;

    const std::string secret = server->plainUrl("private/x.txt");
    EXPECT_EQ(getAs(secret, u"ada", u"secret"), (Outcome{true, 0, "private", "", secret}));
    testing::internal::CaptureStderr();
    EXPECT_FALSE(get(secret).isOpen);
    testing::internal::GetCapturedStderr();
    EXPECT_TRUE(waitUntil([&] { return holds(server->log(), "ada 200 GET /private/x.txt HTTP/1.0\n"); }))
        << server->log();
}

TEST_F(Servers, GiveTheirFilesEncrypted)
{
    const std::string hello = server->secureUrl("hello.txt");
    EXPECT_EQ(get(hello), (Outcome{true, 0, "hello", "", hello}));
    EXPECT_EQ(get(server->secureUrl("moved")), (Outcome{true, 0, "hello", "", hello}));
    const std::string included = server->secureUrl("included.html");
    EXPECT_EQ(get(included), (Outcome{true, 0, "assembled", "", included}));
    EXPECT_FALSE(get(server->secureUrl("missing")).isOpen);
    const std::string secret = server->secureUrl("private/x.txt");
    EXPECT_EQ(getAs<FUrlHttpsHandler>(secret, u"ada", u"secret"), (Outcome{true, 0, "private", "", secret}));
    std::string byName = hello;
    byName.replace(byName.find("127.0.0.1"), 9, "localhost");
    EXPECT_EQ(get(byName), (Outcome{true, 0, "hello", "", byName}));
    EXPECT_EQ(get(server->secureUrl("plain")), (Outcome{false, 0, "", "", server->plainUrl("hello.txt")}))
        << "encryption isn't given up unseen";
}

TEST_F(Servers, AreTrustedForGoodReasonOnly)
{
    const std::string hello = server->secureUrl("hello.txt");
    EXPECT_TRUE(get(hello).isOpen);
    const auto other = makeServer("other", authority.issueForOtherHost());
    EXPECT_FALSE(get(other->secureUrl("hello.txt")).isOpen) << "the certificate of another host";
    const auto expired = makeServer("expired", authority.issueExpired());
    EXPECT_FALSE(get(expired->secureUrl("hello.txt")).isOpen) << "yesterday's certificate";
    trust(CertificateAuthority("Somebody else"));
    EXPECT_FALSE(get(hello).isOpen) << "nobody vouches for it";
    put("Resources/cacert.pem", "rubbish");
    EXPECT_FALSE(get(hello).isOpen);
    std::filesystem::remove(root + "/Resources/cacert.pem");
    EXPECT_FALSE(get(hello).isOpen);
    IStandardFolders::setInstance(nullptr);
    EXPECT_FALSE(get(hello).isOpen);
    for (const std::string& log : {other->log(), expired->log()})
        EXPECT_EQ(log, "") << "not even the request may go there";
}

TEST_F(Servers, AreReachedThroughAProxy)
{
    const ProxyServer proxy(root + "/proxy", "", "");
    useProxy(proxy.port());
    const std::string hello = server->plainUrl("hello.txt"), secure = server->secureUrl("hello.txt");
    EXPECT_TRUE(gives(get(hello), "hello"));
    EXPECT_TRUE(gives(get(server->plainUrl("moved")), "hello"));
    const std::string secret = server->plainUrl("private/x.txt");
    EXPECT_TRUE(gives(getAs(secret, u"ada", u"secret"), "private"));
    EXPECT_FALSE(get("http://127.0.0.1:" + std::to_string(freePort()) + "/x").isOpen);
    EXPECT_TRUE(gives(get(secure), "hello"));
    EXPECT_FALSE(get("https://127.0.0.1:" + std::to_string(freePort()) + "/x").isOpen);
    EXPECT_TRUE(holds(proxy.log(), "GET " + hello)) << proxy.log();
    EXPECT_TRUE(holds(proxy.log(), "CONNECT 127.0.0.1:")) << proxy.log();
}

TEST_F(Servers, AreReachedThroughAProxyThatWantsToKnowTheUser)
{
    const ProxyServer proxy(root + "/proxy", "bob", "proxysecret");
    useProxy(proxy.port());
    const std::string hello = server->plainUrl("hello.txt"), secure = server->secureUrl("hello.txt");
    for (const std::string& url : {hello, secure})
    {
        useProxyCredentials("bob", "wrong");
        testing::internal::CaptureStderr();
        EXPECT_FALSE(get(url).isOpen);
        testing::internal::
            GetCapturedStderr(); // a wrong name counts as the server's wish to know the right one
        useProxyCredentials("bob", "proxysecret");
        for (const int isToldAtOnce : {0, 1})
        {
            set("Use Proxy Authentication", isToldAtOnce);
            EXPECT_TRUE(gives(get(url), "hello"));
        }
        set("Use Proxy Authentication", 0);
    }
    const std::string secret = server->secureUrl("private/x.txt");
    EXPECT_TRUE(gives(getAs<FUrlHttpsHandler>(secret, u"ada", u"secret"), "private"));
}

// What the peer says is no TLS, or stops in its middle.
TEST_F(Servers, MayBeNoneForEncryptedBytes)
{
    for (const std::string& bytes :
         {std::string(), std::string("HTTP/1.0 200 OK\r\n\r\nhello"), std::string(9000, '\x16'),
          std::string("\x16\x03\x03\x00\x40\x02\x00\x00\x3c\x03\x03", 11)})
    {
        Peer proxy([&](const std::string&, size_t)
                   { return Peer::Answer{"HTTP/1.0 200 OK\r\n\r\n" + bytes}; });
        useProxy(proxy.port());
        EXPECT_FALSE(get(server->secureUrl("hello.txt")).isOpen);
        ASSERT_EQ(proxy.requests().size(), 1u);
        EXPECT_EQ(proxy.requests()[0].substr(0, 18), "CONNECT 127.0.0.1:");
    }
    Peer silent([&](const std::string&, size_t) { return Peer::Answer{"HTTP/1.0 200 OK\r\n\r\n", true}; });
    useProxy(silent.port());
    FUrl url(wide(server->secureUrl("hello.txt")).text16());
    url.makeHandler();
    std::thread worker([&] { EXPECT_FALSE(url.getHandler()->open()); });
    silent.waitForRequest();
    url.getHandler()->cancel();
    worker.join();
}
