#include "tests/faults/faultrunner.h"

#include "tests/job/process.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>

#include <sys/stat.h>
#include <unistd.h>

namespace fs = std::filesystem;

std::vector<std::string> launcherFor(const Fault& fault, const std::string& report)
{
    fs::remove(report);
    std::vector<std::string> result = {FAULTS_LAUNCHER, "report=" + report};
    const auto add = [&](const char* key, const std::string& value)
    { result.push_back(std::string(key) + "=" + value); };
    add("kind", std::string(kFaultKindNames[fault.kind]));
    add("number", std::to_string(fault.number));
    add("lasting", fault.isLasting ? "1" : "0");
    add("error", std::to_string(fault.error));
    add("folder", fault.folder);
    add("marked", fault.isMarked ? "1" : "0");
    if (fault.allocation >= 0 || !fault.isMarked)
        add("preload", FAULTS_PRELOAD);
    if (fault.allocation > 0)
        add("malloc", std::to_string(fault.allocation));
    if (fault.fileSize >= 0)
        add("filesize", std::to_string(fault.fileSize));
    result.push_back("--");
    return result;
}

FaultReport readReport(const std::string& report)
{
    FaultReport result;
    std::ifstream file(report);
    std::string name;
    for (long value = 0; file >> name >> value;)
    {
        if (name == "unsynced")
            result.unsynced.push_back(static_cast<unsigned long>(value));
        else if (name == "reached")
            result.isReached = value != 0;
        else
            result.counts[name] = value;
    }
    return result;
}

std::string whyUnsupervised()
{
    static const std::string reason = []() -> std::string
    {
        const fs::path output = fs::temp_directory_path() / ("faultrun-" + std::to_string(getpid()));
        Process::Setup setup;
        setup.arguments = {FAULTS_LAUNCHER, "--", "/bin/true"};
        setup.output = output;
        Process process(setup);
        const bool isRunning = process.wait(kHangs) == 0;
        const std::string said = process.output();
        fs::remove(output);
        return isRunning ? "" : "system calls cannot be supervised here: " + said;
    }();
    return reason;
}

std::vector<long> pointsOf(long count, long most)
{
    constexpr long kMany = 1000;
    const char* const full = std::getenv("FAULTS_FULL");
    const long stride = full && count > kMany ? std::max(std::atol(full), 1L) : 1;
    const long step = full ? stride : std::max((count + most - 1) / most, 1L);
    std::vector<long> result;
    for (long number = 1; number <= count; number += step)
        result.push_back(number);
    if (!result.empty() && result.back() != count)
        result.push_back(count);
    return result;
}

void dropUnsynced(const fs::path& folder, const FaultReport& report)
{
    for (const fs::directory_entry& entry : fs::directory_iterator(folder))
    {
        struct stat facts = {};
        if (stat(entry.path().c_str(), &facts) != 0)
            continue;
        for (const unsigned long inode : report.unsynced)
            if (inode == facts.st_ino)
                fs::resize_file(entry.path(), 0);
    }
}

Tally::~Tally()
{
    std::printf("faults: %-44s %6ld of %6ld points", name.c_str(), tried, all);
    const char* separator = ": ";
    for (const auto& [outcome, times] : outcomes)
    {
        std::printf("%s%s %ld", separator, outcome.c_str(), times);
        separator = ", ";
    }
    std::printf("\n");
}
