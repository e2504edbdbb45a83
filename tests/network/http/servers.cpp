#include "tests/network/http/servers.h"

#include "tests/network/http/peer.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include <unistd.h>

namespace
{
void put(const std::string& file, const std::string& content)
{
    std::filesystem::create_directories(std::filesystem::path(file).parent_path());
    std::ofstream(file) << content;
}

std::unique_ptr<Process> start(std::vector<std::string> arguments, const std::string& folder, int port)
{
    Process::Setup setup;
    setup.arguments = std::move(arguments);
    setup.folder = folder;
    setup.output = folder + "/output";
    auto process = std::make_unique<Process>(setup);
    EXPECT_TRUE(waitUntil([&] { return isServed(port) || !process->isRunning(); }));
    EXPECT_TRUE(process->isRunning()) << process->output();
    return process;
}
} // namespace

WebServer::WebServer(const std::string& serverFolder, const std::string& certificate, const std::string& key)
    : folder(serverFolder),
      plainPort(freePort()),
      securePort(freePort())
{
    put(folder + "/site/hello.txt", "hello");
    put(folder + "/site/part.txt", "bled");
    put(folder + "/site/included.html", "assem<!--#include virtual=\"/part.txt\" -->");
    put(folder + "/site/private/x.txt", "private");
    put(folder + "/users", "ada:{PLAIN}secret\n");
    put(folder + "/configuration", configuration(certificate, key));
    process =
        start({"/usr/sbin/nginx", "-p", folder, "-c", folder + "/configuration", "-e", folder + "/errors"},
              folder, plainPort);
}

std::string WebServer::configuration(const std::string& certificate, const std::string& key) const
{
    std::string text = "daemon off; pid " + folder + "/pid; worker_processes 1;\n";
    // Workers of another user could not read the files.
    if (geteuid() == 0)
        text += "user root;\n";
    text += "events {}\nhttp {\nlog_format test '$remote_user $status $request';\naccess_log " + folder +
            "/log test;\n";
    for (const char* use : {"client_body", "proxy", "fastcgi", "uwsgi", "scgi"})
        text += std::string(use) + "_temp_path " + folder + "/temporary;\n";
    text +=
        "types { text/html html; text/plain txt; }\nserver {\nlisten 127.0.0.1:" + std::to_string(plainPort) +
        ";\nlisten 127.0.0.1:" + std::to_string(securePort) + " ssl;\nssl_certificate " + certificate +
        ";\nssl_certificate_key " + key + ";\nroot " + folder + "/site;\nssi on;\n";
    text += "location = /moved { return 301 $scheme://$http_host/hello.txt; }\n";
    text += "location = /secure { return 302 " + secureUrl("hello.txt") + "; }\n";
    text += "location = /plain { return 302 " + plainUrl("hello.txt") + "; }\n";
    text += "location /private/ { auth_basic test; auth_basic_user_file " + folder + "/users; }\n}\n}\n";
    return text;
}

std::string WebServer::at(const char* protocol, int port, const std::string& file)
{
    return std::string(protocol) + "://127.0.0.1:" + std::to_string(port) + "/" + file;
}

std::string WebServer::log() const
{
    return contentsOf(folder + "/log");
}

ProxyServer::ProxyServer(const std::string& serverFolder, const std::string& user,
                         const std::string& password)
    : folder(serverFolder),
      number(freePort())
{
    std::string text = "Port " + std::to_string(number) +
                       "\nListen 127.0.0.1\nAllow 127.0.0.1\nTimeout 600\n" +
                       "MaxClients 20\nLogLevel Info\nLogFile \"" + folder + "/log\"\n";
    if (!user.empty())
        text += "BasicAuth " + user + " " + password + "\n";
    put(folder + "/configuration", text);
    process = start({"/usr/bin/tinyproxy", "-d", "-c", folder + "/configuration"}, folder, number);
}

std::string ProxyServer::log() const
{
    return contentsOf(folder + "/log");
}
