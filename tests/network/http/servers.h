#pragma once

#include "tests/job/process.h"

#include <memory>
#include <string>

/// A web server of the system's, nginx, on loopback ports of its own, with one site as plain and as encrypted one.
///
/// | file           | is answered by                                         |
/// |----------------|--------------------------------------------------------|
/// | hello.txt      | "hello"                                                |
/// | included.html  | "assembled" without a length                           |
/// | moved          | a redirection, 301, to hello.txt                       |
/// | secure         | a redirection, 302, to hello.txt of the encrypted site |
/// | plain          | a redirection, 302, to hello.txt of the plain one      |
/// | private/x.txt  | "private", for "ada" with "secret"                     |
class WebServer
{
public:
    /// `folder` is for its files; `certificate` and `key` are PEM files.
    WebServer(const std::string& folder, const std::string& certificate, const std::string& key);

    std::string plainUrl(const std::string& file) const { return at("http", plainPort, file); }
    std::string secureUrl(const std::string& file) const { return at("https", securePort, file); }
    /// The lines of its log, each "<name of the user> <status> <request>".
    std::string log() const;

private:
    static std::string at(const char* protocol, int port, const std::string& file);
    std::string configuration(const std::string& certificate, const std::string& key) const;

    std::string folder;
    int plainPort;
    int securePort;
    std::unique_ptr<Process> process;
};

/// A proxy, tinyproxy, on a loopback port of its own.
class ProxyServer
{
public:
    /// With a user that isn't empty it lets nobody else through.
    ProxyServer(const std::string& folder, const std::string& user, const std::string& password);

    int port() const { return number; }
    std::string log() const;

private:
    std::string folder;
    int number;
    std::unique_ptr<Process> process;
};
