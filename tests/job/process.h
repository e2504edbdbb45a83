#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <vector>

#include <sys/resource.h>
#include <sys/types.h>

/// How long anything may take before it counts as hanging. No test asserts a time; this only ends a broken run.
constexpr std::chrono::seconds kHangs{120};

/// A child process whose standard output and error go to one file.
///
/// Ended hard by the destructor if it still runs. *one thread at a time*
class Process
{
public:
    struct Setup
    {
        /// The first is the program's path, or a name to search for.
        std::vector<std::string> arguments;
        /// "NAME=value"; nothing is inherited.
        std::vector<std::string> environment;
        std::string folder = "/";
        std::string output;
    };

    explicit Process(const Setup& setup);
    ~Process();

    Process(const Process&) = delete;
    Process& operator=(const Process&) = delete;

    /// The exit code, 128 plus the signal that ended it, or nothing if it runs on after that time.
    std::optional<int> wait(std::chrono::milliseconds time);
    bool isRunning() { return !wait(std::chrono::milliseconds(0)); }

    /// Asks it to end, as a session does that ends.
    void terminate();

    /// All that it has written so far.
    std::string output() const;

    /// Waits until the output holds `text`; false if the process ends without it.
    bool waitForOutput(const std::string& text);

    pid_t id() const { return child; }
    /// What it used, once it has ended.
    const rusage& usage() const { return used; }
    /// The most memory that it has had so far, in KiB; only while it runs.
    long peakMemory() const;

private:
    pid_t child = -1;
    std::string outputFile;
    std::optional<int> result;
    rusage used{};
};

/// The bytes of a file; empty if it cannot be read.
std::string contentsOf(const std::string& path);

/// A moment's rest for a loop that asks again and again.
void pauseBriefly();

/// Asks again and again until `condition()` is true; false if that lasts as long as a hang.
template <class Condition>
bool waitUntil(Condition condition)
{
    const auto end = std::chrono::steady_clock::now() + kHangs;
    while (!condition())
    {
        if (std::chrono::steady_clock::now() > end)
            return false;
        pauseBriefly();
    }
    return true;
}
