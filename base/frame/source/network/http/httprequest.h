#pragma once

#include "foundation/object/types.h"

#include <string>

class ConstString;
class FString;
class FUrl;

/// The text of one request of HTTP/1.0, put together line by line. One thread at a time.
///
///     HttpRequest request;
///     request.get(url, 80);
///     request.addCredentials("Authorization", user, password);
///     request.finish();
class HttpRequest
{
public:
    /// "GET" for the host of the URL itself; the file is encoded.
    void get(const FUrl& url, uint16 defaultPort);
    /// "GET" for a proxy: the URL goes out as it is written.
    void getThroughProxy(const FUrl& url, uint16 defaultPort);
    /// "CONNECT", by which a proxy lets all bytes pass to the URL's host.
    void connect(const FUrl& url);
    /// For the scheme "Basic". Base64 is for 7-bit text; others are left out.
    void addCredentials(const char* field, const FString& user, const FString& password);
    /// Ends the request.
    void finish();

    /// Whether it can be sent: a control character in a host or URL would make further lines of it.
    bool isSound() const { return sound; }
    /// In UTF-8.
    const std::string& getText() const { return text; }

private:
    void addLine(const ConstString& line);
    void addHost(const FUrl& url, uint16 defaultPort);

    std::string text;
    bool sound = true;
};
