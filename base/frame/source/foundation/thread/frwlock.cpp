#include "foundation/thread/frwlock.h"

#include "foundation/object/fatomic.h"
#include "foundation/thread/flockscope.h"

namespace
{
/// The counts of waiting threads change outside the guard too.
int32 read(volatile int32& count)
{
    return FAtomicAdd(count, 0);
}
} // namespace

FRwLock::FRwLock(const char*) {}

bool FRwLock::tryRead()
{
    FLockScope guard(accessGuard);
    if (writerCount < 1 || writerThread == PlatformThread::currentID())
    {
        FAtomicIncrement(readerCount);
        return true;
    }
    FAtomicIncrement(waitingReaders);
    return false;
}

void FRwLock::waitToRead()
{
    bool hasWaited = false;
    while (!tryRead())
    {
        canRead.wait();
        FAtomicDecrement(waitingReaders);
        hasWaited = true;
    }
    if (hasWaited)
        wakeReaders();
}

void FRwLock::wakeReaders()
{
    // A reader that was about to wait when the signal came may have found it used up by another; and no reader
    // signals readers when it is done.
    FLockScope guard(accessGuard);
    if (read(waitingReaders) > 0)
        canRead.signalAll();
}

void FRwLock::doneReading()
{
    FLockScope guard(accessGuard);
    FAtomicDecrement(readerCount);
    if (read(waitingWriters) > 0)
        canWrite.signalAll();
}

bool FRwLock::tryWrite()
{
    FLockScope guard(accessGuard);
    const FThreadID caller = PlatformThread::currentID();
    if (readerCount < 1 && (writerCount < 1 || writerThread == caller))
    {
        writerThread = caller;
        FAtomicIncrement(writerCount);
        return true;
    }
    FAtomicIncrement(waitingWriters);
    return false;
}

void FRwLock::waitToWrite()
{
    while (!tryWrite())
    {
        canWrite.wait();
        FAtomicDecrement(waitingWriters);
    }
}

void FRwLock::doneWriting()
{
    FLockScope guard(accessGuard);
    FAtomicDecrement(writerCount);
    if (read(waitingWriters) > 0)
        canWrite.signalAll();
    // The writer's thread stays noted; the count is asked first.
    if (read(waitingReaders) > 0)
        canRead.signalAll();
}

bool FRwLock::verify()
{
    FLockScope guard(accessGuard);
    return readerCount >= 0 && writerCount >= 0 && read(waitingReaders) >= 0 && read(waitingWriters) >= 0;
}
