#include "tests/faults/faultrun.h"

#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <iterator>
#include <string>
#include <vector>

#include <fcntl.h>
#include <linux/filter.h>
#include <linux/sched.h>
#include <linux/seccomp.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

// Starts a program under supervision: one of its system calls fails, or it is killed when it makes it.
//
//     faultrun [KEY=VALUE]... -- PROGRAM [ARGUMENT]...
//
//     report=FILE    where the counts go at the end
//     kind=NAME      the calls meant, see faultrun.h; without it they are only counted
//     number=N       the N-th of them, from 1
//     lasting=1      and all behind it
//     error=E        the error number that it gives; without it the program is killed
//     folder=PATH    the watched folder, whose files lose what was written and not synced when the program is killed
//     preload=FILE   a library to preload; it marks where counting begins
//     marked=1       the program marks that itself
//     malloc=N       the allocation that fails
//     filesize=N     the bytes that a file may grow to
//
// Three processes: the program; a supervisor, to which the kernel hands each call before it happens; and this one,
// which waits for the program and ends as it did. The supervisor outlives it for what the program started.

namespace
{
struct Options
{
    std::string report, folder, preload;
    int kind = -1;
    long number = 0;
    bool isLasting = false;
    int error = 0;
    bool isMarked = false;
    long allocation = -1;
    long fileSize = -1;
    char** command = nullptr;
};

struct Unsynced
{
    ino_t inode;
    bool isDirty;
};

/// What the processes share.
struct Shared
{
    std::atomic<int> listener{-1};
    std::atomic<pid_t> program{0};
    std::atomic<bool> isServing{false};
    std::atomic<bool> isReached{false};
    std::atomic<long> counts[kFaultKinds];
    // Written by the supervisor alone, read when the program is dead.
    Unsynced files[256];
    std::atomic<int> fileCount{0};
};

Options options;
Shared* shared = nullptr;

struct Row
{
    int call;
    FaultKind kind;
};

constexpr Row kRows[] = {
    {SYS_open, kOpenCalls},       {SYS_openat, kOpenCalls},      {SYS_creat, kOpenCalls},
    {SYS_read, kReadCalls},       {SYS_readv, kReadCalls},       {SYS_pread64, kReadCalls},
    {SYS_write, kWriteCalls},     {SYS_writev, kWriteCalls},     {SYS_pwrite64, kWriteCalls},
    {SYS_fsync, kSyncCalls},      {SYS_fdatasync, kSyncCalls},   {SYS_rename, kRenameCalls},
    {SYS_renameat, kRenameCalls}, {SYS_renameat2, kRenameCalls}, {SYS_sendto, kSendCalls},
    {SYS_sendmsg, kSendCalls},    {SYS_recvfrom, kReceiveCalls}, {SYS_recvmsg, kReceiveCalls},
};

// Calls that change what is on disk by a name, or a file that is open.
constexpr int kNameChanges[] = {SYS_rename, SYS_renameat, SYS_renameat2, SYS_link,  SYS_linkat,
                                SYS_unlink, SYS_unlinkat, SYS_symlink,   SYS_mkdir, SYS_mkdirat};
constexpr int kFileChanges[] = {SYS_write,     SYS_writev,    SYS_pwrite64, SYS_fsync,
                                SYS_fdatasync, SYS_ftruncate, SYS_fchmod,   SYS_fallocate};

template <std::size_t count>
bool isOneOf(const int (&calls)[count], int call)
{
    for (const int known : calls)
        if (known == call)
            return true;
    return false;
}

[[noreturn]] void fail(const char* what)
{
    std::fprintf(stderr, "faultrun: %s: %s\n", what, std::strerror(errno));
    std::_Exit(126);
}

// Options

int kindOf(std::string_view name)
{
    for (int kind = 0; kind < kFaultKinds; kind++)
        if (kFaultKindNames[kind] == name)
            return kind;
    fail("unknown kind");
}

void takeOption(const std::string& key, const std::string& value)
{
    const long number = std::atol(value.c_str());
    if (key == "report")
        options.report = value;
    else if (key == "folder")
        options.folder = value;
    else if (key == "preload")
        options.preload = value;
    else if (key == "kind")
        options.kind = kindOf(value);
    else if (key == "number")
        options.number = number;
    else if (key == "lasting")
        options.isLasting = number != 0;
    else if (key == "error")
        options.error = static_cast<int>(number);
    else if (key == "marked")
        options.isMarked = number != 0;
    else if (key == "malloc")
        options.allocation = number;
    else if (key == "filesize")
        options.fileSize = number;
    else
        fail("unknown option");
}

void parse(int count, char** arguments)
{
    for (int i = 1; i < count; i++)
    {
        const std::string text = arguments[i];
        if (text == "--")
        {
            options.command = arguments + i + 1;
            break;
        }
        const std::size_t equals = text.find('=');
        takeOption(text.substr(0, equals), equals == std::string::npos ? "" : text.substr(equals + 1));
    }
    if (!options.command || !*options.command)
        fail("no program");
}

// The program's side

// Hands the calls of the tables to the supervisor; all others pass. Gives the descriptor of the supervisor's side.
int installFilter()
{
    std::vector<int> calls = {SYS_getpgid};
    for (const Row& row : kRows)
        calls.push_back(row.call);
    calls.insert(calls.end(), std::begin(kNameChanges), std::end(kNameChanges));
    calls.insert(calls.end(), std::begin(kFileChanges), std::end(kFileChanges));

    std::vector<sock_filter> program = {BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr))};
    for (const int call : calls)
    {
        program.push_back(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned>(call), 0, 1));
        program.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_USER_NOTIF));
    }
    program.push_back(BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
    sock_fprog filter = {static_cast<unsigned short>(program.size()), program.data()};
    if (prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) != 0)
        fail("no_new_privs");
    return static_cast<int>(
        syscall(SYS_seccomp, SECCOMP_SET_MODE_FILTER, SECCOMP_FILTER_FLAG_NEW_LISTENER, &filter));
}

void setEnvironment()
{
    if (options.preload.empty())
        return;
    setenv("LD_PRELOAD", options.preload.c_str(), 1);
    setenv(kReportVariable, options.report.c_str(), 1);
    if (options.allocation > 0)
        setenv(kAllocationVariable, std::to_string(options.allocation).c_str(), 1);
    if (options.isMarked)
        setenv(kMarkedVariable, "1", 1);
}

void limitFileSize()
{
    if (options.fileSize < 0)
        return;
    std::signal(SIGXFSZ, SIG_IGN);
    const rlimit limit = {static_cast<rlim_t>(options.fileSize), static_cast<rlim_t>(options.fileSize)};
    if (setrlimit(RLIMIT_FSIZE, &limit) != 0)
        fail("file size limit");
}

void pauseBriefly()
{
    const timespec moment = {0, 100000};
    nanosleep(&moment, nullptr);
}

[[noreturn]] void beProgram()
{
    // A test that gives up kills the process that it knows; the program goes with it.
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    setEnvironment();
    limitFileSize();
    shared->program = static_cast<pid_t>(syscall(SYS_getpid));
    const int listener = installFilter();
    if (listener < 0)
        fail("the kernel refuses to supervise calls");
    shared->listener = listener;
    while (!shared->isServing)
        pauseBriefly();
    execvp(options.command[0], options.command);
    fail(options.command[0]);
}

// The supervisor's side

std::string procOf(pid_t process, const char* rest)
{
    return "/proc/" + std::to_string(process) + rest;
}

bool isOfProgram(pid_t thread)
{
    const std::string path = procOf(shared->program, "/task/") + std::to_string(thread);
    return access(path.c_str(), F_OK) == 0;
}

std::string openFile(pid_t thread, int descriptor)
{
    return procOf(thread, "/fd/") + std::to_string(descriptor);
}

/// Whether the descriptor leads to the watched folder or a file below it.
bool isWatched(pid_t thread, int descriptor)
{
    char path[4096];
    const ssize_t length = readlink(openFile(thread, descriptor).c_str(), path, sizeof path - 1);
    if (options.folder.empty() || length <= 0)
        return false;
    const std::string_view found(path, static_cast<std::size_t>(length));
    return found == options.folder || found.starts_with(options.folder + "/");
}

/// Whether the call is one on an event counter and the like, which are no files: the kernel never refuses them.
bool isOnCounter(pid_t thread, const seccomp_data& call)
{
    char path[32];
    const std::string name = openFile(thread, static_cast<int>(call.args[0]));
    const ssize_t length = readlink(name.c_str(), path, sizeof path);
    return length > 0 && std::string_view(path, static_cast<std::size_t>(length)).starts_with("anon_inode:");
}

bool opensForChange(const seccomp_data& call)
{
    constexpr unsigned long long kChanging = O_WRONLY | O_RDWR | O_CREAT | O_TRUNC;
    if (call.nr == SYS_creat)
        return true;
    const unsigned long long flags = call.nr == SYS_open ? call.args[1] : call.args[2];
    return (call.nr == SYS_open || call.nr == SYS_openat) && (flags & kChanging) != 0;
}

// Names aren't read from the program's memory: one too many is counted rather than one too few.
bool isChange(pid_t thread, const seccomp_data& call)
{
    if (isOneOf(kFileChanges, call.nr))
        return isWatched(thread, static_cast<int>(call.args[0]));
    return isOneOf(kNameChanges, call.nr) || opensForChange(call);
}

void noteState(const std::string& path, bool isDirty)
{
    struct stat facts = {};
    if (stat(path.c_str(), &facts) != 0)
        return;
    const int count = shared->fileCount;
    int at = 0;
    while (at < count && shared->files[at].inode != facts.st_ino)
        at++;
    if (at == static_cast<int>(std::size(shared->files)))
        return;
    shared->files[at] = {facts.st_ino, isDirty};
    if (at == count)
        shared->fileCount = count + 1;
}

void noteChange(pid_t thread, const seccomp_data& call)
{
    const int descriptor = static_cast<int>(call.args[0]);
    const bool isWrite = call.nr == SYS_write || call.nr == SYS_writev || call.nr == SYS_pwrite64;
    const bool isSync = call.nr == SYS_fsync || call.nr == SYS_fdatasync;
    if ((isWrite || isSync) && isWatched(thread, descriptor))
        noteState(openFile(thread, descriptor), isWrite);
    else if (isOneOf(kNameChanges, call.nr) || opensForChange(call))
        noteState(options.folder, true);
}

/// Counts the call for one kind. True where it is the one that is meant.
bool count(int kind)
{
    const long number = ++shared->counts[kind];
    if (kind != options.kind || options.number == 0)
        return false;
    return options.isLasting ? number >= options.number : number == options.number;
}

bool countAll(pid_t thread, const seccomp_data& call)
{
    bool isMeant = false;
    for (const Row& row : kRows)
    {
        const bool isTransfer = row.kind == kReadCalls || row.kind == kWriteCalls;
        if (row.call == call.nr && !(isTransfer && isOnCounter(thread, call)))
            isMeant = count(row.kind) || isMeant;
    }
    if (isChange(thread, call))
        isMeant = count(kChangeCalls) || isMeant;
    return isMeant;
}

/// An answer that is none.
constexpr int kKilled = -1;

/// Gives the answer to a call: 0 lets it happen, another number is its error. A program that was killed gets none, or
/// it would make the call before it dies.
int judge(pid_t thread, const seccomp_data& call)
{
    static bool isCounting = false;
    if (call.nr == SYS_getpgid)
    {
        if (call.args[0] == kBeginCounting || call.args[0] == kEndCounting)
            isCounting = call.args[0] == kBeginCounting;
        return 0;
    }
    if (!isCounting || !isOfProgram(thread))
        return 0;
    if (countAll(thread, call))
    {
        shared->isReached = true;
        if (options.error != 0)
            return options.error;
        kill(shared->program, SIGKILL);
        return kKilled;
    }
    noteChange(thread, call);
    return 0;
}

[[noreturn]] void supervise(int listener)
{
    shared->isServing = true;
    for (;;)
    {
        pollfd ready = {listener, POLLIN, 0};
        if (poll(&ready, 1, -1) < 0 && errno != EINTR)
            std::_Exit(1);
        if (ready.revents & POLLHUP)
            std::_Exit(0);
        if (!(ready.revents & POLLIN))
            continue;
        seccomp_notif request = {};
        if (ioctl(listener, SECCOMP_IOCTL_NOTIF_RECV, &request) != 0)
            continue; // it is gone again
        seccomp_notif_resp answer = {};
        answer.id = request.id;
        const int error = judge(static_cast<pid_t>(request.pid), request.data);
        if (error == kKilled)
            continue;
        answer.error = -error;
        answer.flags = error ? 0 : SECCOMP_USER_NOTIF_FLAG_CONTINUE;
        ioctl(listener, SECCOMP_IOCTL_NOTIF_SEND, &answer);
    }
}

// The waiting side

void passOn(int signal)
{
    kill(shared->program, signal);
}

void writeReport()
{
    std::FILE* file = options.report.empty() ? nullptr : std::fopen(options.report.c_str(), "a");
    if (!file)
        return;
    for (int kind = 0; kind < kFaultKinds; kind++)
        std::fprintf(file, "%s %ld\n", std::string(kFaultKindNames[kind]).c_str(),
                     shared->counts[kind].load());
    std::fprintf(file, "reached %d\n", shared->isReached.load() ? 1 : 0);
    for (int i = 0; i < shared->fileCount; i++)
        if (shared->files[i].isDirty)
            std::fprintf(file, "unsynced %lu\n", static_cast<unsigned long>(shared->files[i].inode));
    std::fclose(file);
}

pid_t startProgram()
{
    // The descriptor of the supervisor's side is made by the program; until that is another program, this process
    // has it too.
    const long child = syscall(SYS_clone, CLONE_FILES | SIGCHLD, nullptr, nullptr, nullptr, nullptr);
    if (child < 0)
        fail("clone");
    if (child == 0)
        beProgram();
    return static_cast<pid_t>(child);
}

int exitCodeOf(pid_t child)
{
    int status = 0;
    while (waitpid(child, &status, 0) < 0 && errno == EINTR)
        continue;
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}
} // namespace

int main(int argc, char** argv)
{
    parse(argc, argv);
    void* memory = mmap(nullptr, sizeof(Shared), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED)
        fail("shared memory");
    shared = new (memory) Shared;

    const pid_t child = startProgram();
    std::signal(SIGTERM, passOn);
    while (shared->listener < 0 && waitpid(child, nullptr, WNOHANG) == 0)
        pauseBriefly();
    if (shared->listener < 0)
        return 126;
    if (fork() == 0)
        supervise(shared->listener);
    const int code = exitCodeOf(child);
    writeReport();
    return code;
}
