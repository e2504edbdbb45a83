#pragma once

/// Memory that is not there for `new` ends the process from now on as `endWithoutMemory` does, instead of a crash.
/// Main thread, once.
void endInWordsWithoutMemory();

/// Ends the process with a line on standard error and the exit code 1.
///
/// Nothing is tidied up: the files on disk are whole at any moment, and tidying up needs memory. Thread-safe.
[[noreturn]] void endWithoutMemory();
