#include "network/http/httprequest.h"

#include "foundation/text/fbase64.h"
#include "foundation/text/fstring.h"
#include "storage/path/filenametext.h"
#include "storage/url/furl.h"

#include <algorithm>

namespace
{
constexpr const char* kUserAgent = "User-Agent: Vellamoor HTTP URL Handler";
constexpr const char* kVersion = " HTTP/1.0";
constexpr const char* kLineEnd = "\r\n";

bool isControl(char c)
{
    return static_cast<unsigned char>(c) < ' ' || c == 0x7F;
}

FString hostAndPort(const FUrl& url)
{
    FString port;
    port.printf(":%d", static_cast<int>(static_cast<uint16>(url.getPort())));
    FString result(url.getHost());
    result.append(port);
    return result;
}
} // namespace

void HttpRequest::get(const FUrl& url, uint16 defaultPort)
{
    FString file(url.getFile());
    FUrl::urlEncode(file);
    FString line("GET /");
    line.append(file).append(kVersion);
    addLine(line);
    addHost(url, defaultPort);
}

void HttpRequest::getThroughProxy(const FUrl& url, uint16 defaultPort)
{
    FString whole;
    url.getUrl(whole);
    FString line("GET ");
    line.append(whole).append(kVersion);
    addLine(line);
    addHost(url, defaultPort);
}

void HttpRequest::connect(const FUrl& url)
{
    FString line("CONNECT ");
    line.append(hostAndPort(url)).append(kVersion);
    addLine(line);
    FString host("Host: ");
    host.append(hostAndPort(url));
    addLine(host);
}

void HttpRequest::addHost(const FUrl& url, uint16 defaultPort)
{
    FString line("Host: ");
    const bool isDefault = static_cast<uint16>(url.getPort()) == defaultPort;
    line.append(isDefault ? url.getHost() : hostAndPort(url));
    addLine(line);
}

void HttpRequest::addCredentials(const char* field, const FString& user, const FString& password)
{
    FString credentials(user);
    credentials.append(":").append(password);
    if (!FBase64::encode(credentials))
        return;
    FString line(field);
    line.append(": Basic ").append(credentials);
    addLine(line);
}

void HttpRequest::finish()
{
    addLine(kUserAgent);
    text += kLineEnd;
}

void HttpRequest::addLine(const ConstString& line)
{
    const std::string bytes = FileNameText::toBytes(line);
    sound = sound && std::none_of(bytes.begin(), bytes.end(), isControl);
    text += bytes + kLineEnd;
}
