#include "tests/job/process.h"

#include <csignal>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <thread>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>

namespace
{

std::vector<char*> pointersTo(const std::vector<std::string>& texts)
{
    std::vector<char*> result;
    for (const std::string& text : texts)
        result.push_back(const_cast<char*>(text.c_str()));
    result.push_back(nullptr);
    return result;
}

} // namespace

void pauseBriefly()
{
    std::this_thread::sleep_for(std::chrono::milliseconds(3));
}

std::string contentsOf(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

Process::Process(const Setup& setup) : outputFile(setup.output)
{
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_addopen(&files, 0, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&files, 1, outputFile.c_str(), O_WRONLY | O_CREAT | O_APPEND, 0600);
    posix_spawn_file_actions_adddup2(&files, 1, 2);
    posix_spawn_file_actions_addchdir_np(&files, setup.folder.c_str());

    // The service in this process ignores broken pipes; the program must not inherit that.
    posix_spawnattr_t attributes;
    posix_spawnattr_init(&attributes);
    sigset_t usual;
    sigemptyset(&usual);
    sigaddset(&usual, SIGPIPE);
    posix_spawnattr_setsigdefault(&attributes, &usual);
    posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF);

    const std::vector<char*> arguments = pointersTo(setup.arguments);
    const std::vector<char*> environment = pointersTo(setup.environment);
    if (posix_spawnp(&child, arguments[0], &files, &attributes, arguments.data(), environment.data()) != 0)
        result = 127;
    posix_spawnattr_destroy(&attributes);
    posix_spawn_file_actions_destroy(&files);
}

Process::~Process()
{
    if (result)
        return;
    kill(child, SIGKILL);
    waitpid(child, nullptr, 0);
}

std::optional<int> Process::wait(std::chrono::milliseconds time)
{
    const auto end = std::chrono::steady_clock::now() + time;
    while (!result)
    {
        int status = 0;
        if (wait4(child, &status, WNOHANG, &used) == child)
            result = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
        else if (std::chrono::steady_clock::now() >= end)
            break;
        else
            pauseBriefly();
    }
    return result;
}

void Process::terminate()
{
    if (!result)
        kill(child, SIGTERM);
}

long Process::peakMemory() const
{
    const std::string status = contentsOf("/proc/" + std::to_string(child) + "/status");
    const std::size_t at = status.find("VmHWM:");
    return at == std::string::npos ? 0 : std::atol(status.c_str() + at + 6);
}

std::string Process::output() const
{
    return contentsOf(outputFile);
}

bool Process::waitForOutput(const std::string& text)
{
    bool ended = false;
    const bool happened = waitUntil(
        [&]
        {
            ended = !isRunning();
            return ended || output().find(text) != std::string::npos;
        });
    return happened && output().find(text) != std::string::npos;
}
