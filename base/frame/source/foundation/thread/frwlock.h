#pragma once

#include "foundation/object/types.h"
#include "foundation/thread/fcondition.h"
#include "foundation/thread/flock.h"
#include "foundation/thread/platformthread.h"

/// A lock that many read or one thread writes.
///
/// A thread that writes may write and read again without waiting. One that reads and then wants to write waits for
/// itself, for ever. Thread-safe.
class FRwLock
{
public:
    /// The name serves the reader of the code only.
    explicit FRwLock(const char* name = nullptr);

    void waitToRead();
    void doneReading();
    void waitToWrite();
    void doneWriting();
    /// Whether the books are in order: no operation was ended more often than begun. For debugging.
    bool verify();

private:
    bool tryRead();
    bool tryWrite();
    void wakeReaders();

    FCondition canRead;
    FCondition canWrite;
    FLock accessGuard;
    FThreadID writerThread = 0;
    volatile int32 readerCount = 0;
    volatile int32 writerCount = 0;
    volatile int32 waitingReaders = 0;
    volatile int32 waitingWriters = 0;
};
