#pragma once

#include "tests/faults/faultrun.h"

#include <filesystem>
#include <map>
#include <optional>
#include <string>
#include <vector>

/// What is to go wrong in one start of a program; nothing, as it stands.
struct Fault
{
    /// The calls meant, and which of them; 0 only counts.
    FaultKind kind = kChangeCalls;
    long number = 0;
    /// Also all behind it.
    bool isLasting = false;
    /// What the call gives; 0 kills the program before it.
    int error = 0;
    /// The allocation that fails; 0 none, -1 leaves the allocator alone.
    long allocation = -1;
    /// The bytes that a file may grow to.
    long fileSize = -1;
    /// The watched folder.
    std::string folder;
    /// The program marks by itself from when to when calls count.
    bool isMarked = false;
};

/// What the launcher has counted.
struct FaultReport
{
    std::map<std::string, long> counts;
    bool isReached = false;
    /// The files in the watched folder that were written and not synced, and the folder itself where its names were.
    std::vector<unsigned long> unsynced;

    long countOf(FaultKind kind) const { return countOf(std::string(kFaultKindNames[kind])); }
    long countOf(const std::string& name) const
    {
        const auto found = counts.find(name);
        return found == counts.end() ? 0 : found->second;
    }
};

/// The beginning of a command: the launcher with its options. The report is removed first.
std::vector<std::string> launcherFor(const Fault& fault, const std::string& report);
FaultReport readReport(const std::string& report);

/// Why no call can be supervised here; empty where it can.
std::string whyUnsupervised();

/// Which numbers of 1 to `count` are tried, the first and the last among them: about `most`. In a full sweep, for
/// which the variable FAULTS_FULL is set, all; of more than 1000 each so manieth as its value says.
std::vector<long> pointsOf(long count, long most);

/// Cuts the files that were not synced to nothing, as a disk may have them after its power went.
void dropUnsynced(const std::filesystem::path& folder, const FaultReport& report);

/// Counts what was tried and writes one line at its end: subject, points tried, of how many.
class Tally
{
public:
    explicit Tally(std::string subject) : name(std::move(subject)) {}
    ~Tally();
    Tally(const Tally&) = delete;
    Tally& operator=(const Tally&) = delete;

    void add(long triedPoints, long allPoints)
    {
        tried += triedPoints;
        all += allPoints;
    }
    /// Counts one outcome under a word.
    void note(const std::string& outcome) { outcomes[outcome]++; }

private:
    std::string name;
    long tried = 0;
    long all = 0;
    std::map<std::string, long> outcomes;
};
