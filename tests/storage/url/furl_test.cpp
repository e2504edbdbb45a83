#include "storage/url/furl.h"

#include "storage/attribute/fattributes.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furlfilehandler.h"
#include "storage/url/urlpathconverter.h"
#include "tests/storage/filefixture.h"

namespace
{
/// Serves nothing; stands for the handlers of the network.
class StubHandler : public FUrlHandler
{
public:
    using FUrlHandler::FUrlHandler;
    CmObject* newCopy() const override { return nullptr; }
    bool open() override { return false; }
    bool close() override { return false; }
};

FUrlHandler* createStub(FUrl& url)
{
    return new StubHandler(url);
}

FUrlHandler* createNothing(FUrl&)
{
    return nullptr;
}

class FUrlTest : public FileTest
{
protected:
    static void SetUpTestSuite()
    {
        initFUrlFileHandler();
        FUrl::registerHandler(FString("http"), 80, createNothing);
        FUrl::registerHandler(FString("http"), 81, createStub);
        FUrl::registerHandler(FString("https"), 443, createNothing);
    }
};

std::string urlOf(const FUrl& url)
{
    FString text;
    url.getUrl(text);
    return utf8(text);
}

std::string described(const FUrl& url)
{
    std::string text;
    for (const FString* part : {&url.getProtocol(), &url.getUser(), &url.getPassword(), &url.getHost()})
        text += utf8(*part) + "|";
    return text + std::to_string(url.getPort()) + "|" + utf8(url.getFile()) + "|" + utf8(url.getPathName()) +
           "|" + utf8(url.getName()) + "|" + std::to_string(url.getPathType());
}

TEST_F(FUrlTest, TakesTextsApart)
{
    struct Row
    {
        const char16* text;
        const char* parts;
        const char* url;
    };
    const Row rows[] = {
        {u"http://a:b@h:8080/x/y.txt", "http|a|b|h|8080|x/y.txt|http://h:8080/x|y.txt|0",
         "http://h:8080/x/y.txt"},
        {u"http://h", "http|||h|80||http://h:80||1", "http://h:80/"},
        {u" http://h/ ", "http|||h|80||http://h:80||1", "http://h:80/"},
        {u"http://h/x/", "http|||h|80|x/|http://h:80|x|1", "http://h:80/x/"},
        {u"http://me@h/x", "http|||h|80|x|http://h:80|x|0", "http://h:80/x"},
        {u"http://h:x/y", "http|||h|80|y|http://h:80|y|0", "http://h:80/y"},
        {u"gopher://h/y", "gopher|||h|0|y|gopher://h|y|0", "gopher://h/y"},
        {u"file:///a/b", "file||||0|/a/b|file:////a|b|0", "file:///a/b"},
        {u"file://a@b:1/", "file||||0|a@b:1/|file://|a@b:1|1", "file://a@b:1/"},
        {u"https://h?a=b/c:d@e", "https|||h?a=b|443|c:d@e|https://h?a=b:443|c:d@e|0",
         "https://h?a=b:443/c:d@e"},
        {u"", "||||0||://||1", "://"},
    };
    for (const Row& row : rows)
    {
        const FUrl url(row.text);
        EXPECT_EQ(described(url), row.parts) << utf8(row.text);
        EXPECT_EQ(urlOf(url), row.url);
        EXPECT_EQ(fullPathOf(url), row.url) << "as a path it is the same text";
    }
}

TEST_F(FUrlTest, AnotherTextTakesNothingAlong)
{
    FUrl url(u"http://a:b@h:8080/x");
    url.setUrl(u"other/y");
    EXPECT_EQ(described(url), "http|||other|80|y|http://other:80|y|0")
        << "but the protocol, where it has none";
    url.setUrl(u"gopher://z");
    EXPECT_EQ(urlOf(url), "gopher://z:80/") << "and the port, where nobody knows another";
}

TEST_F(FUrlTest, PortsReachBeyondASignedNumber)
{
    EXPECT_EQ(urlOf(FUrl(u"https://127.0.0.1:45678/me")), "https://127.0.0.1:45678/me");
    FUrl url;
    url.set("http", "h", 65535, u"x");
    EXPECT_EQ(urlOf(url), "http://h:65535/x");
    EXPECT_EQ(urlOf(FUrl("http", "h", u"x")), "http://h:80/x");
    EXPECT_EQ(urlOf(FUrl("http", "h", 0, u"x", u"u", u"p")), "http://h/x");
}

TEST_F(FUrlTest, EncodesBytes)
{
    struct Row
    {
        const char16* plain;
        const char* encoded;
    };
    const Row rows[] = {
        {u"a b", "a%20b"},
        {u"\n", "%a"},
        {u"-./&+=?_~09azAZ", "-./&+=?_~09azAZ"},
        {u"\u00E4", "%c3%a4"},
        {u"%#:@", "%25%23%3a%40"},
        {u"", ""},
    };
    for (const Row& row : rows)
    {
        FString text(row.plain);
        FUrl::urlEncode(text);
        EXPECT_EQ(utf8(text), row.encoded);
    }
}

TEST_F(FUrlTest, DecodesBytes)
{
    struct Row
    {
        const char* encoded;
        const char* plain;
    };
    const Row rows[] = {
        {"%41%4a", "AJ"}, {"%4A+%20", "J+ "}, {"%zz", ""},      {"a%00b", "a"},  {"%c3%a4", "\xC3\xA4"},
        {"100%", "100%"}, {"%4", "%4"},       {"%4%31", "@31"}, {"%E4", "\xE4"},
    };
    for (const Row& row : rows)
    {
        FString text(row.encoded);
        FUrl::urlDecode(text);
        EXPECT_EQ(utf8(text), row.plain) << row.encoded;
    }
}

TEST_F(FUrlTest, MovesLikeAPath)
{
    FUrl url(u"http://h:1/a/b.txt");
    EXPECT_FALSE(url.isRootDir());
    EXPECT_TRUE(url.ascend());
    EXPECT_EQ(urlOf(url), "http://h:1/a/");
    EXPECT_TRUE(url.isFolder());
    url.descend(u"c", FPath::kFolder);
    url.descend(u"d.txt", FPath::kFile);
    EXPECT_EQ(urlOf(url), "http://h:1/a/c/d.txt");
    EXPECT_TRUE(url.isFile());
    url.setName(u"e.txt");
    EXPECT_EQ(urlOf(url), "http://h:1/a/c/e.txt");
    while (url.ascend())
    {
    }
    EXPECT_EQ(urlOf(url), "http://h:1/");
    EXPECT_TRUE(url.isRootDir());

    EXPECT_TRUE(FUrl(u"file:///a").isRootDir()) << "what stands in the root counts as one";
    EXPECT_FALSE(FUrl(u"file:///a/b").isRootDir());
    url.setFile(u"a b", true);
    EXPECT_EQ(urlOf(url), "http://h:1/a%20b");
}

TEST_F(FUrlTest, NamesThatThePathMakesReachTheUrl)
{
    FUrl url(u"http://h:1/a.b/song.wav?x");
    url.setFileType(FFileType(nullptr, "xml", "xml", 0, "XML"));
    EXPECT_EQ(urlOf(url), "http://h:1/a.b/song.xml");
    EXPECT_EQ(utf8(url.getName()), "song.xml");

    put("take.wav", "");
    put("take-01.wav", "");
    FUrl taken(FString(("file://" + root + "/take.wav").c_str()).text16());
    EXPECT_TRUE(taken.uniqueName());
    EXPECT_EQ(urlOf(taken), "file://" + root + "/take-02.wav");
}

TEST_F(FUrlTest, ArchiveRoundTrip)
{
    const IPtr<FMemoryStream> stream = adopt(new FMemoryStream);
    const FUrl url(u"http://a:b@h:45678/x/y");
    {
        FNewArchive archive(stream, true);
        EXPECT_TRUE(url.externalize(archive));
    }
    for (const bool isWhole : {true, false})
    {
        if (!isWhole)
            stream->setSize(stream->getSize() - 4);
        stream->rewind();
        FNewArchive archive(stream, false);
        FUrl restored(u"file:///z");
        EXPECT_EQ(restored.internalize(archive), isWhole);
        EXPECT_EQ(described(restored) == described(url), isWhole);
    }
}

TEST_F(FUrlTest, CopiesAndComparisons)
{
    const FUrl url(u"http://a:b@h:1/x");
    const FUrl copy(url);
    EXPECT_TRUE(url.isEqual(&copy));
    EXPECT_EQ(url.hash(997), copy.hash(997));
    const FUrl others[] = {FUrl(u"http://a:b@h:2/x"), FUrl(u"http://h:1/x"), FUrl(u"https://a:b@h:1/x")};
    for (const FUrl& other : others)
        EXPECT_FALSE(url.isEqual(&other)) << urlOf(other);

    FAttributes attributes;
    EXPECT_TRUE(url.storeAttributes(attributes));
    FUrl restored(u"file:///z");
    EXPECT_TRUE(restored.restoreAttributes(attributes));
    EXPECT_EQ(described(restored), described(url));
    FAttributes small;
    FUrl(u"http://h").storeAttributes(small);
    EXPECT_FALSE(small.containsAttribute("File") || small.containsAttribute("User"));
    EXPECT_TRUE(small.containsAttribute("Port"));
}

TEST_F(FUrlTest, HandlersAreFoundByProtocol)
{
    FUrl http(u"http://h/x");
    EXPECT_TRUE(http.makeHandler()) << "the first that makes one";
    FUrlHandler* handler = http.getHandler();
    EXPECT_TRUE(http.makeHandler());
    EXPECT_EQ(http.getHandler(), handler);
    const FUrl copy(http);
    EXPECT_EQ(copy.getHandler(), nullptr);
    IBStream* stream = nullptr;
    EXPECT_NE(http.openStream(&stream), 0);
    EXPECT_EQ(stream, nullptr);
    FUrl https(u"https://h/x");
    EXPECT_FALSE(https.makeHandler());
    EXPECT_NE(https.openStream(&stream), 0);
    EXPECT_EQ(files->openFile(&https, kFileRead, nullptr), nullptr);
}

TEST_F(FUrlTest, FilesOpenByUrl)
{
    put("a b.txt", "content");
    FUrl url(FString((("file://" + root) + "/a%20b.txt").c_str()).text16());
    IBStream* stream = nullptr;
    ASSERT_EQ(url.openStream(&stream), 0);
    char text[7] = {};
    EXPECT_EQ(stream->read(text, 7, nullptr), 0);
    EXPECT_EQ(std::string(text, 7), "content");
    EXPECT_EQ(url.getHandler()->getLength(), 7);
    EXPECT_TRUE(url.getHandler()->close());
    EXPECT_FALSE(url.getHandler()->close());
    stream->release();

    EXPECT_TRUE(files->fileExists(&url));
    EXPECT_EQ(files->getFileSize(&url), 7);
    EXPECT_TRUE(files->renameFile(&url, u"c.txt"));
    EXPECT_EQ(contentOf("c.txt"), "content");
    EXPECT_TRUE(write(&url, "new"));
    EXPECT_EQ(contentOf("c.txt"), "new");
    FUrl missing(u"file:///none/such");
    EXPECT_NE(missing.openStream(&stream), 0);
}

TEST_F(FUrlTest, ConvertsToPathsAndBack)
{
    const FNPath path(u"/a b/c", FPath::kFile);
    IPtr<FUnknown> made =
        adopt(IObjectConverter::convertObject(static_cast<CmObject*>(const_cast<FNPath*>(&path)), "FUrl"));
    FUrl* url = FCast(FUrl, toCmObject(made));
    ASSERT_NE(url, nullptr);
    EXPECT_EQ(described(*url), "file||||0|/a b/c|file:////a b|c|0");
    FUrl encoded(u"file:///a%20b/%E4");
    made = adopt(IObjectConverter::convertObject(static_cast<CmObject*>(&encoded), "FNPath"));
    EXPECT_EQ(FCast(FNPath, toCmObject(made))->platformPath(), "/a b/\xE4");

    FUrl http(u"http://h/x");
    UrlPathConverter* converter = UrlPathConverter::instance();
    EXPECT_TRUE(converter->canConvert(static_cast<CmObject*>(&http), "FNPath"));
    EXPECT_EQ(converter->convert(static_cast<CmObject*>(&http), "FNPath"), nullptr);
    EXPECT_FALSE(converter->canConvert(static_cast<CmObject*>(&http), "FUrl"));
    FNPath fromUrl;
    EXPECT_TRUE(FNFileSystem::pathFromURL(u"file:///x%20y", fromUrl));
    EXPECT_EQ(fullPathOf(fromUrl), "/x y");
    EXPECT_FALSE(FNFileSystem::pathFromURL(u"http://x/y", fromUrl));
}
} // namespace
