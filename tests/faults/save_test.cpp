#include "tests/faults/faultrunner.h"
#include "tests/job/process.h"

#include <cerrno>
#include <fstream>

#include <sys/mount.h>
#include <unistd.h>

#include <gtest/gtest.h>

namespace fs = std::filesystem;

namespace
{
constexpr int kDone = 0;
constexpr int kFailed = 3;
constexpr int kKilled = 137;
constexpr int kOutOfMemory = 1;

constexpr const char* kOld = "the older value";
constexpr const char* kNew = "the newer value, which is not as long as the file";

struct Subject
{
    const char* word;
    const char* file;
};

constexpr Subject kSubjects[] = {
    {"tokens", "scat.xml"}, {"cache", "Vellamoor Upload Manager Cache.xml"}, {"settings", "Defaults.xml"}};

/// Saves of the files in the user folder, each in a folder of its own with a fault of its own.
class Save : public testing::Test
{
protected:
    void SetUp() override
    {
        if (const std::string reason = whyUnsupervised(); !reason.empty())
            GTEST_SKIP() << reason;
        std::string pattern = fs::temp_directory_path() / "faults-XXXXXX";
        root = mkdtemp(pattern.data());
        folder = root / "user";
    }
    void TearDown() override
    {
        if (!root.empty())
            fs::remove_all(root);
    }

    int run(const std::vector<std::string>& launcher, const char* what, const Subject& subject,
            const char* value) const
    {
        Process::Setup setup;
        setup.arguments = launcher;
        for (const std::string& argument : {std::string(FAULTS_SAVER), folder.string(), std::string(what),
                                            std::string(subject.word), std::string(value)})
            setup.arguments.push_back(argument);
        setup.output = root / "output";
        Process process(setup);
        return process.wait(kHangs).value_or(-1);
    }

    /// With a fault. Fills `report`.
    int run(Fault fault, const char* what, const Subject& subject, const char* value)
    {
        fault.folder = folder;
        fault.isMarked = true;
        const int code = run(launcherFor(fault, root / "report"), what, subject, value);
        report = readReport(root / "report");
        return code;
    }

    /// The bytes of the file with this value.
    std::string bytesOf(const Subject& subject, const char* value)
    {
        begin(subject, value);
        return contentsOf(folder / subject.file);
    }

    /// A user folder with this value in the file.
    void begin(const Subject& subject, const char* value)
    {
        fs::remove_all(folder);
        fs::create_directory(folder);
        ASSERT_EQ(run(std::vector<std::string>(), "save", subject, value), kDone);
    }

    /// The same from bytes that are known.
    void put(const Subject& subject, const std::string& bytes)
    {
        fs::remove_all(folder);
        fs::create_directory(folder);
        if (!bytes.empty())
            std::ofstream(folder / subject.file, std::ios::binary) << bytes;
    }

    /// What stands under the file's name: "old", "new", or what is wrong with it.
    std::string stateOf(const Subject& subject, const std::string& oldBytes,
                        const std::string& newBytes) const
    {
        const fs::path file = folder / subject.file;
        const std::string bytes = contentsOf(file);
        if (bytes == newBytes && fs::exists(file))
            return newBytes == oldBytes ? "unchanged" : "new";
        if (bytes == oldBytes && fs::exists(file) == !oldBytes.empty())
            return "old";
        const std::string stem = fs::path(subject.file).stem();
        const bool hasTwin = !oldBytes.empty() && contentsOf(folder / (stem + "_old.xml")) == oldBytes;
        const std::string what = fs::exists(file) ? "damaged" : "missing";
        return what + (hasTwin ? ", the older one only as _old" : ", and no older one");
    }

    fs::path root;
    fs::path folder;
    FaultReport report;
};

/// Kills a save of the subject before each of its changes to the disk and tells in what state its file is.
class PowerLoss : public Save
{
protected:
    void kill(const Subject& subject, bool isReplacing, Tally& tally)
    {
        const std::string newBytes = bytesOf(subject, kNew);
        const std::string oldBytes = isReplacing ? bytesOf(subject, kOld) : "";
        put(subject, oldBytes);
        ASSERT_EQ(run(Fault(), "save", subject, kNew), kDone);
        EXPECT_TRUE(report.unsynced.empty()) << subject.file << " is told as saved and may still be lost";
        const long count = report.countOf(kChangeCalls);
        ASSERT_GT(count, 2);
        for (long number = 1; number <= count; number++)
        {
            for (const bool isDropped : {false, true})
            {
                put(subject, oldBytes);
                Fault fault;
                fault.number = number;
                EXPECT_EQ(run(fault, "save", subject, kNew), kKilled);
                if (isDropped)
                    dropUnsynced(folder, report);
                const std::string state = stateOf(subject, oldBytes, newBytes);
                tally.note(state);
                EXPECT_TRUE(state == "old" || state == "new")
                    << subject.file << " killed before change " << number << " of " << count
                    << (isDropped ? ", what was not synced is lost: " : ": ") << state;
                expectFound(subject, state, isReplacing);
            }
        }
        tally.add(2 * count, 2 * count);
    }

    /// The next start finds that version, and its own save leaves nothing else behind.
    void expectFound(const Subject& subject, const std::string& state, bool isReplacing)
    {
        const bool isThere = state == "new" || isReplacing;
        EXPECT_EQ(run(std::vector<std::string>(), "load", subject, state == "new" ? kNew : kOld),
                  isThere ? kDone : kFailed);
        EXPECT_EQ(run(std::vector<std::string>(), "save", subject, kNew), kDone);
        EXPECT_EQ(std::distance(fs::directory_iterator(folder), fs::directory_iterator()), 1) << state;
    }
};

/// Lets calls of a save or a load fail.
class FailingCall : public Save
{
protected:
    /// The outcome of a save that had a fault: what it said must be so.
    void expectHonest(int code, const Subject& subject, const std::string& oldBytes,
                      const std::string& newBytes, const std::string& where)
    {
        const std::string state = stateOf(subject, oldBytes, newBytes);
        EXPECT_TRUE(code == kDone || code == kFailed || code == kOutOfMemory) << where << ": " << code;
        if (state == "unchanged")
            return;
        if (code == kDone)
            EXPECT_EQ(state, "new") << where << " was told as done";
        else if (code == kFailed)
            EXPECT_EQ(state, "old") << where << " was told as failed";
        else
            EXPECT_TRUE(state == "old" || state == "new") << where << ": " << state;
    }

    static std::string at(const Subject& subject, const std::string& kind, long number)
    {
        return std::string(subject.file) + ", " + kind + " " + std::to_string(number);
    }

    void failCalls(const Subject& subject, FaultKind kind, int error, Tally& tally)
    {
        const std::string newBytes = bytesOf(subject, kNew), oldBytes = bytesOf(subject, kOld);
        ASSERT_EQ(run(Fault(), "save", subject, kNew), kDone);
        const long count = report.countOf(kind);
        for (long number = 1; number <= count; number++)
        {
            for (const bool isLasting : {false, true})
            {
                put(subject, oldBytes);
                Fault fault;
                fault.kind = kind;
                fault.number = number;
                fault.error = error;
                fault.isLasting = isLasting;
                const int code = run(fault, "save", subject, kNew);
                EXPECT_TRUE(report.isReached);
                tally.note(code == kDone ? "saved" : "told as failed");
                expectHonest(code, subject, oldBytes, newBytes,
                             at(subject, std::string(kFaultKindNames[kind]), number));
            }
        }
        tally.add(2 * count, 2 * count);
    }

    void failAllocations(const char* what, const Subject& subject, long most, Tally& tally)
    {
        const std::string newBytes = bytesOf(subject, kNew), oldBytes = bytesOf(subject, kOld);
        Fault fault;
        fault.allocation = 0;
        put(subject, oldBytes);
        ASSERT_EQ(run(fault, what, subject, kOld), kDone);
        const long count = report.countOf("malloc");
        ASSERT_GT(count, 0);
        const std::vector<long> points = pointsOf(count, most);
        for (const long number : points)
        {
            put(subject, oldBytes);
            fault.allocation = number;
            const int code = run(fault, what, subject, what == std::string("save") ? kNew : kOld);
            tally.note(code == kDone ? "done" : code == kFailed ? "told as failed" : "ended without memory");
            const std::string where = at(subject, "malloc", number);
            // A load that succeeds leaves what it found.
            const std::string& expected = what == std::string("save") ? newBytes : oldBytes;
            expectHonest(code, subject, oldBytes, expected, where);
        }
        tally.add(static_cast<long>(points.size()), count);
    }
};

/// A disk of a few pages in memory, for the time of a test.
class SmallDisk
{
public:
    explicit SmallDisk(const fs::path& place) : path(place)
    {
        fs::create_directories(path);
        isMounted = mount("none", path.c_str(), "tmpfs", 0, "size=256k") == 0;
    }
    ~SmallDisk()
    {
        if (isMounted)
            umount2(path.c_str(), MNT_DETACH);
    }
    SmallDisk(const SmallDisk&) = delete;
    SmallDisk& operator=(const SmallDisk&) = delete;

    /// Takes all room but so many bytes.
    void fill(std::uintmax_t remaining) const
    {
        std::ofstream file(path / "filler", std::ios::binary);
        const std::uintmax_t space = fs::space(path).available;
        file << std::string(space > remaining ? space - remaining : 0, '.');
    }

    fs::path path;
    bool isMounted = false;
};
} // namespace

TEST_F(PowerLoss, LeavesTheOlderOrTheNewerVersionUnderTheName)
{
    Tally tally("power loss while saving");
    for (const Subject& subject : kSubjects)
        for (const bool isReplacing : {true, false})
            kill(subject, isReplacing, tally);
}

TEST_F(FailingCall, OfASaveIsToldAndLeavesTheOlderVersion)
{
    constexpr std::pair<FaultKind, int> kKinds[] = {{kOpenCalls, EACCES},
                                                    {kWriteCalls, ENOSPC},
                                                    {kSyncCalls, EIO},
                                                    {kRenameCalls, EACCES},
                                                    {kChangeCalls, EROFS}};
    for (const auto& [kind, error] : kKinds)
    {
        Tally tally("save, failing " + std::string(kFaultKindNames[kind]));
        for (const Subject& subject : kSubjects)
            failCalls(subject, kind, error, tally);
    }
}

TEST_F(FailingCall, OfALoadIsToldAndChangesNothing)
{
    Tally tally("load, failing open and read");
    for (const Subject& subject : kSubjects)
    {
        const std::string oldBytes = bytesOf(subject, kOld);
        ASSERT_EQ(run(Fault(), "load", subject, kOld), kDone);
        const FaultReport counted = report;
        for (const FaultKind kind : {kOpenCalls, kReadCalls})
        {
            for (long number = 1; number <= counted.countOf(kind); number++)
            {
                Fault fault;
                fault.kind = kind;
                fault.number = number;
                fault.error = EIO;
                const int code = run(fault, "load", subject, kOld);
                EXPECT_TRUE(code == kFailed || code == kDone) << at(subject, "load", number) << ": " << code;
                EXPECT_EQ(stateOf(subject, oldBytes, ""), "old");
                tally.add(1, 1);
            }
        }
    }
}

TEST_F(FailingCall, OfTheAllocatorLosesNoFile)
{
    for (const char* what : {"save", "load"})
    {
        Tally tally(std::string(what) + ", failing malloc");
        for (const Subject& subject : kSubjects)
            failAllocations(what, subject, 25, tally);
    }
}

TEST_F(Save, ThatIsCutAtAnyByteLeavesTheOlderVersion)
{
    Tally tally("save, no room from byte n on");
    for (const Subject& subject : kSubjects)
    {
        const std::string newBytes = bytesOf(subject, kNew), oldBytes = bytesOf(subject, kOld);
        const long size = static_cast<long>(newBytes.size());
        const std::vector<long> points = pointsOf(size, 40);
        for (const long number : points)
        {
            put(subject, oldBytes);
            Fault fault;
            fault.fileSize = number - 1;
            EXPECT_EQ(run(fault, "save", subject, kNew), kFailed) << subject.file << " at byte " << number;
            EXPECT_EQ(stateOf(subject, oldBytes, newBytes), "old") << subject.file << " at byte " << number;
        }
        tally.add(static_cast<long>(points.size()), size);
    }
}

TEST_F(Save, OnAFullDiskLeavesTheOlderVersion)
{
    SmallDisk disk(root / "disk");
    if (!disk.isMounted)
        GTEST_SKIP() << "a small disk can be mounted by root only";
    Tally tally("save, a disk with n pages free");
    constexpr std::uintmax_t kPage = 4096;
    folder = disk.path / "user";
    for (const Subject& subject : kSubjects)
    {
        const std::string newBytes = bytesOf(subject, kNew), oldBytes = bytesOf(subject, kOld);
        const std::uintmax_t pages = newBytes.size() / kPage + 1;
        for (std::uintmax_t free = 0; free <= pages; free++)
        {
            put(subject, oldBytes);
            disk.fill(free * kPage);
            const int code = run(std::vector<std::string>(), "save", subject, kNew);
            EXPECT_EQ(code, free < pages ? kFailed : kDone) << subject.file << " with " << free << " pages";
            EXPECT_EQ(stateOf(subject, oldBytes, newBytes), free < pages ? "old" : "new");
            fs::remove(disk.path / "filler");
            tally.add(1, 1);
        }
    }
    folder = root / "user";
}
