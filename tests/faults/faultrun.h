#pragma once

#include <string_view>

#include <sys/syscall.h>

// What the launcher, the preloaded library and the tests agree on.

/// System calls by what a test calls them. A call may stand in several rows of the launcher's table.
enum FaultKind : int
{
    kOpenCalls,
    kReadCalls,
    kWriteCalls,
    kSyncCalls,
    kRenameCalls,
    kSendCalls,
    kReceiveCalls,
    /// Every call that changes a file below the watched folder, of whatever kind.
    kChangeCalls,
    kFaultKinds
};

inline constexpr std::string_view kFaultKindNames[kFaultKinds] = {"open",   "read", "write", "fsync",
                                                                  "rename", "send", "recv",  "change"};

/// A program marks by getpgid with one of these where counting begins and ends; no process has such a number.
inline constexpr int kBeginCounting = 0x7FA17B0;
inline constexpr int kEndCounting = 0x7FA17E0;

/// The environment of the preloaded library: which allocation fails (0: none), whether counting waits for the mark,
/// and the file to which the count is appended.
inline constexpr const char* kAllocationVariable = "FAULTS_ALLOCATION";
inline constexpr const char* kMarkedVariable = "FAULTS_MARKED";
inline constexpr const char* kReportVariable = "FAULTS_REPORT";
