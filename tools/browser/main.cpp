// A stand-in browser: notes the URL it is given, fetches it from the stand-in service, and hands a redirect to a
// URL of the program's scheme to the program, byte for byte, as a desktop does.
//
//     stand-in-browser URL
//     stand-in-browser --register DATA_HOME CONFIG_HOME
//
// From the environment:
//     STANDIN_BROWSER_LOG      file that gets a line for each thing that happens
//     STANDIN_BROWSER_TRUST    PEM file of the service's authority
//     STANDIN_BROWSER_PROGRAM  the program that opens URLs of the scheme

#include "tools/browser/browserhome.h"

#include <cstdlib>
#include <filesystem>
#include <string>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <httplib.h>

namespace
{

constexpr const char* kScheme = "vlmr:";

std::string setting(const char* name)
{
    const char* value = std::getenv(name);
    return value ? value : "";
}

/// One write a line, so that lines of two browsers never mix.
void note(const std::string& line)
{
    const int file =
        open(setting("STANDIN_BROWSER_LOG").c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600);
    if (file < 0)
        return;
    const std::string bytes = line + "\n";
    if (write(file, bytes.data(), bytes.size()) < 0)
        std::perror("stand-in-browser");
    close(file);
}

/// Where the page at `url` redirects to; empty if it does not, or cannot be had.
std::string redirectOf(const std::string& url)
{
    const std::size_t hostAt = url.find("://") + 3;
    const std::size_t pathAt = url.find('/', hostAt);
    if (url.compare(0, 8, "https://") != 0 || pathAt == std::string::npos)
    {
        note("cannot open this URL");
        return "";
    }

    httplib::Client client(url.substr(0, pathAt));
    client.set_ca_cert_path(setting("STANDIN_BROWSER_TRUST"));
    client.set_follow_location(false);
    client.set_url_encode(false);
    client.set_read_timeout(60);
    const httplib::Result result = client.Get(url.substr(pathAt));
    if (!result)
    {
        note("cannot reach it: " + httplib::to_string(result.error()));
        return "";
    }
    note("status " + std::to_string(result->status));
    return result->get_header_value("Location");
}

/// Starts the program with the URL and waits for its end.
int openInProgram(std::string url)
{
    std::string program = setting("STANDIN_BROWSER_PROGRAM");
    char* arguments[] = {program.data(), url.data(), nullptr};
    pid_t child = 0;
    if (posix_spawn(&child, program.c_str(), nullptr, nullptr, arguments, environ) != 0)
    {
        note("cannot start " + program);
        return 1;
    }

    int status = 0;
    waitpid(child, &status, 0);
    note(WIFEXITED(status) ? "program ended with " + std::to_string(WEXITSTATUS(status))
                           : "program was ended by signal " + std::to_string(WTERMSIG(status)));
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc == 4 && std::string(argv[1]) == "--register")
    {
        const std::filesystem::path self = std::filesystem::read_symlink("/proc/self/exe");
        return registerBrowser(self, argv[2], argv[3]) ? 0 : 1;
    }
    if (argc != 2)
        return 2;

    note(std::string("open ") + argv[1]);
    const std::string target = redirectOf(argv[1]);
    if (target.empty())
        return 0;
    note("redirect " + target);
    return target.compare(0, 5, kScheme) == 0 ? openInProgram(target) : 0;
}
