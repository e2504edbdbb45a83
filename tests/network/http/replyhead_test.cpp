#include "network/http/httpreplyhead.h"

#include "storage/path/filenametext.h"
#include "storage/stream/fmemorystream.h"

#include <gtest/gtest.h>

namespace
{
using End = HttpReplyHead::End;

struct Row
{
    const char* reply;
    End end;
    int status;
    int64 length;
    const char* rest;
};

void fill(FMemoryStream& stream, const std::string& bytes)
{
    stream.writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
    stream.rewind();
}

std::string restOf(FStream& stream)
{
    std::string rest(100, '\0');
    rest.resize(static_cast<size_t>(stream.readRaw(rest.data(), 100)));
    return rest;
}
} // namespace

TEST(HttpReplyHead, EndsWhereALineAsksForMore)
{
    const Row rows[] = {
        {"HTTP/1.0 200 OK\r\n\r\nbody", End::kBlankLine, 200, 0, "body"},
        {"HTTP/1.0 404 Not Found\n\nbody", End::kBlankLine, 404, 0, "body"},
        {"\r\nbody", End::kBlankLine, 0, 0, "body"},
        {"HTTP/1.0\r\n\r\n", End::kBlankLine, 0, 0, ""},
        {"HTTP/1.0 x\r\n\r\n", End::kBlankLine, 0, 0, ""},
        {"HTTP/1.0 99999999999999999999 x\r\n\r\n", End::kBlankLine, 2147483647, 0, ""},
        // What stands in the first line counts only as such
        {"Location: 302\r\nA: b\r\n\r\n", End::kBlankLine, 302, 0, ""},
        {"H 302 x\r\nLocation: /x\r\nA: b\r\n", End::kLocation, 302, 0, "A: b\r\n"},
        {"H 303 x\r\nLocation: /x\r\n\r\n", End::kBlankLine, 303, 0, ""},
        {"H 407 x\r\nProxy-Authenticate: Basic realm\r\nA: b\r\n", End::kProxyAuthenticate, 407, 0,
         "A: b\r\n"},
        {"H 407 x\r\nX-Proxy-Authenticate: Basic\r\n\r\n", End::kBlankLine, 407, 0, ""},
        {"H 407 x\r\npadding-padding-pad-B Proxy-Authenticate:\r\n", End::kProxyAuthenticate, 407, 0, ""},
        {"H 407 x\r\nProxy-Authenticate: Digest\r\n\r\n", End::kBlankLine, 407, 0, ""},
        {"H 200 x\r\nProxy-Authenticate: Basic\r\n\r\n", End::kBlankLine, 200, 0, ""},
        {"H 401 x\r\nWWW-Authenticate: Basic realm\r\nA: b\r\n", End::kAuthenticate, 401, 0, "A: b\r\n"},
        {"H 401 x\r\nWWW-Authenticate: Digest\r\n\r\n", End::kBlankLine, 401, 0, ""},
        {"H 200 x\r\nContent-Length: 42\r\n\r\n", End::kBlankLine, 200, 42, ""},
        {"H 200 x\r\nContent-Length:42\r\n\r\n", End::kBlankLine, 200, 2, ""},
        {"H 200 x\r\nContent-Length: -42\r\n\r\n", End::kBlankLine, 200, 0, ""},
        {"H 200 x\r\ncontent-length: 42\r\n\r\n", End::kBlankLine, 200, 0, ""},
        // Cut
        {"", End::kCut, 0, 0, ""},
        {"HTTP/1.0 200 OK", End::kCut, 0, 0, ""},
        {"HTTP/1.0 200 OK\r\nContent-Length: 42", End::kCut, 200, 0, ""},
    };
    for (const Row& row : rows)
    {
        FMemoryStream stream;
        fill(stream, row.reply);
        HttpReplyHead head(stream);
        EXPECT_EQ(head.read(), row.end) << row.reply;
        EXPECT_EQ(head.getStatus(), row.status) << row.reply;
        EXPECT_EQ(head.getLength(), row.length) << row.reply;
        EXPECT_EQ(restOf(stream), row.rest) << row.reply;
    }
}

// Each of these lines passes for another field; servers do send them.
TEST(HttpReplyHead, KnowsThreeFieldsByTheirFirstLetter)
{
    FMemoryStream plain;
    fill(plain, "HTTP/1.0 200 OK\r\nContent-Length: 42\r\nConnection: close\r\n\r\n");
    HttpReplyHead head(plain);
    EXPECT_EQ(head.read(), End::kBlankLine);
    EXPECT_EQ(head.getLength(), 0) << "no number at index 16";

    FMemoryStream moved;
    fill(moved, "HTTP/1.0 301 x\r\nLast-Modified: today\r\nLocation:  http://h/x \r\nL\r\n\r\n");
    HttpReplyHead redirection(moved);
    for (const char16* location : {u"fied: today", u"  http://h/x ", u""})
    {
        EXPECT_EQ(redirection.read(), End::kLocation);
        EXPECT_TRUE(redirection.getLocation() == ConstString(location)) << redirection.getLocation().text8();
    }
    EXPECT_EQ(redirection.read(), End::kBlankLine);

    FMemoryStream refused;
    fill(refused, "HTTP/1.0 401 x\r\nWarning: 199 - ab Beware\r\n");
    EXPECT_EQ(HttpReplyHead(refused).read(), End::kAuthenticate);
}

TEST(HttpReplyHead, KeepsTheWholeLinesOfACutReply)
{
    FMemoryStream stream;
    fill(stream, "HTTP/1.0 200 OK\r\nA: \xE4\n\rB: cut");
    HttpReplyHead head(stream);
    EXPECT_EQ(head.read(), End::kCut);
    EXPECT_EQ(FileNameText::toBytes(head.getLines()), "HTTP/1.0 200 OK\r\nA: \xE4\n");
}

TEST(HttpReplyHead, EndsAHeadThatGoesOnForEver)
{
    for (const std::string& piece : {std::string(1000, 'a'), std::string("A: b\r\n")})
    {
        std::string bytes;
        while (bytes.size() < 2 * HttpReplyHead::kLongest)
            bytes += piece;
        FMemoryStream stream;
        fill(stream, bytes);
        HttpReplyHead head(stream);
        EXPECT_EQ(head.read(), End::kFailed);
        EXPECT_LE(stream.tell(), static_cast<int64>(HttpReplyHead::kLongest) + 1);
    }
}
