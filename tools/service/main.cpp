// The stand-in service as a program of its own; it ends at an interrupt or a request to terminate.
//
//     stand-in-service FOLDER [--port N] [--token TEXT] [--certificate honest|otherHost|expired|otherAuthority]
//                      [--plan "/tracks error TEXT"]...
//
// It writes into FOLDER: "authority.pem", the certificate to trust; "host", where it listens; "control", the address
// that scripts command it at (see ControlServer).

#include "tools/service/controlserver.h"
#include "tools/service/standinservice.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include <signal.h>

namespace
{

struct Arguments
{
    std::string folder;
    StandInService::Options options;
    std::vector<std::string> plans;
};

bool setIdentity(StandInService::Options& options, const std::string& name)
{
    constexpr const char* kNames[] = {"honest", "otherHost", "expired", "otherAuthority"};
    for (int i = 0; i < 4; ++i)
    {
        if (name == kNames[i])
        {
            options.identity = static_cast<StandInService::Identity>(i);
            return true;
        }
    }
    return false;
}

bool takeOption(Arguments& arguments, const std::string& name, const std::string& value)
{
    if (name == "--port")
        arguments.options.port = std::atoi(value.c_str());
    else if (name == "--token")
        arguments.options.token = value;
    else if (name == "--plan")
        arguments.plans.push_back(value);
    else
        return name == "--certificate" && setIdentity(arguments.options, value);
    return true;
}

bool readArguments(int argc, char** argv, Arguments& arguments)
{
    if (argc < 2 || argc % 2 != 0)
        return false;
    arguments.folder = argv[1];
    for (int i = 2; i < argc; i += 2)
    {
        if (!takeOption(arguments, argv[i], argv[i + 1]))
            return false;
    }
    return true;
}

/// Written under another name first, so that a script which waits for the file never reads half of it.
bool writeFile(const std::filesystem::path& path, const std::string& text)
{
    const std::filesystem::path draft = path.string() + ".new";
    {
        std::ofstream file(draft, std::ios::binary);
        file << text;
        if (!file.flush().good())
            return false;
    }
    std::error_code error;
    std::filesystem::rename(draft, path, error);
    return !error;
}

int fail(const char* text)
{
    std::fprintf(stderr, "stand-in-service: %s\n", text);
    return 1;
}

int serve(const Arguments& arguments, const sigset_t& endings)
{
    const CertificateAuthority authority;
    StandInService service(authority, arguments.options);
    for (const std::string& line : arguments.plans)
    {
        if (!service.plan(line))
            return fail(("no plan: " + line).c_str());
    }
    ControlServer control(service);
    if (!service.start() || !control.start())
        return fail("no port to listen at");

    const std::filesystem::path folder = arguments.folder;
    if (!writeFile(folder / "authority.pem", authority.pem()) ||
        !writeFile(folder / "control", control.address() + "\n") ||
        !writeFile(folder / "host", service.host() + "\n"))
        return fail("cannot write into the folder");
    std::printf("service %s\ncontrol %s\n", service.host().c_str(), control.address().c_str());
    std::fflush(stdout);

    int signal = 0;
    sigwait(&endings, &signal);
    control.stop();
    service.stop();
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    Arguments arguments;
    if (!readArguments(argc, argv, arguments))
    {
        std::fprintf(stderr, "usage: stand-in-service FOLDER [--port N] [--token TEXT] [--certificate KIND] "
                             "[--plan LINE]...\n");
        return 2;
    }

    // Blocked before any thread starts, so that only sigwait sees them.
    sigset_t endings;
    sigemptyset(&endings);
    sigaddset(&endings, SIGINT);
    sigaddset(&endings, SIGTERM);
    sigprocmask(SIG_BLOCK, &endings, nullptr);
    return serve(arguments, endings);
}
