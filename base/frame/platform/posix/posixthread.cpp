#include "foundation/thread/fthread.h"

#include <atomic>
#include <condition_variable>
#include <mutex>

#include <pthread.h>
#include <sched.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>

namespace
{
struct Scheduling
{
    int policy;
    int nice;       ///< below the process's own niceness, where `policy` is or falls back to time sharing
    int roundRobin; ///< above the lowest priority of round robin
};

constexpr Scheduling kLevels[] = {
    {SCHED_OTHER, 10, 0}, {SCHED_OTHER, 5, 0}, {SCHED_OTHER, 0, 0},
    {SCHED_RR, -5, 0},    {SCHED_RR, -10, 4},  {SCHED_RR, -15, 13},
};

const Scheduling& schedulingOf(int level)
{
    const bool isLevel = level >= kThreadPriorityLowest && level <= kThreadPriorityHighest;
    return kLevels[isLevel ? level : kThreadPriorityLowest];
}

bool setPolicy(pid_t thread, int policy, int priority)
{
    // What a thread of high priority starts, a browser for one, is to run as everybody else.
    const int former = sched_getscheduler(thread);
    const int inherited = policy == SCHED_RR ? SCHED_RESET_ON_FORK : former & SCHED_RESET_ON_FORK;
    sched_param parameters{};
    sched_getparam(thread, &parameters);
    if ((former & ~SCHED_RESET_ON_FORK) == policy && parameters.sched_priority == priority)
        return true;

    parameters.sched_priority = priority;
    return sched_setscheduler(thread, policy | inherited, &parameters) == 0;
}

/// Takes the niceness, or what is permitted on the way to it.
void setNiceness(pid_t thread, int wanted)
{
    const auto id = static_cast<id_t>(thread);
    const int present = getpriority(PRIO_PROCESS, id);
    for (int nice = wanted; nice != present; nice += nice < present ? 1 : -1)
        if (setpriority(PRIO_PROCESS, id, nice) == 0)
            return;
}

void applyScheduling(pid_t thread, const Scheduling& level)
{
    if (level.policy == SCHED_RR &&
        setPolicy(thread, SCHED_RR, sched_get_priority_min(SCHED_RR) + level.roundRobin))
        return;

    setPolicy(thread, SCHED_OTHER, 0);
    const int base = getpriority(PRIO_PROCESS, static_cast<id_t>(getpid()));
    setNiceness(thread, std::clamp(base + level.nice, -20, 19));
}

/// Held by its owner, and by the thread itself while that runs.
class PosixThread final : public PlatformThread
{
public:
    PosixThread(Body threadBody, void* threadContext) : body(threadBody), context(threadContext) {}

    int start();
    void adopt();

    int resume() override;
    void applyPriority(int level) override;
    void cancel() override;
    bool isCurrent() const override { return pthread_equal(thread, pthread_self()) != 0; }
    bool join() override;
    void detach() override;

private:
    static void* runThread(void* record);
    int runBody();
    void awaitResume();
    void setKernelID(pid_t id);
    void release();

    Body body;
    void* context;
    pthread_t thread{};
    bool isAdopted = false;
    std::atomic<int> holders{1};

    std::mutex lock;
    std::condition_variable changed;
    // 0 before the thread has come up and after its end: the system may give the number to another one then.
    pid_t kernelID = 0;
    bool isResumed = false;
};

int PosixThread::start()
{
    holders = 2;
    const int error = pthread_create(&thread, nullptr, &PosixThread::runThread, this);
    if (error != 0)
        return error;

    std::unique_lock<std::mutex> guard(lock);
    changed.wait(guard, [this] { return kernelID != 0; });
    return 0;
}

void PosixThread::adopt()
{
    thread = pthread_self();
    kernelID = static_cast<pid_t>(syscall(SYS_gettid));
    isAdopted = true;
}

void* PosixThread::runThread(void* record)
{
    // A cancel unwinds the stack up to here.
    struct Holder
    {
        ~Holder()
        {
            thread->setKernelID(0);
            thread->release();
        }

        PosixThread* thread;
    } holder{static_cast<PosixThread*>(record)};

    int former = 0;
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &former);
    return reinterpret_cast<void*>(static_cast<intptr_t>(holder.thread->runBody()));
}

int PosixThread::runBody()
{
    setKernelID(static_cast<pid_t>(syscall(SYS_gettid)));
    awaitResume();
    return body(context);
}

void PosixThread::awaitResume()
{
    std::unique_lock<std::mutex> guard(lock);
    changed.wait(guard, [this] { return isResumed; });
}

void PosixThread::setKernelID(pid_t id)
{
    std::lock_guard<std::mutex> guard(lock);
    kernelID = id;
    changed.notify_all();
}

int PosixThread::resume()
{
    std::lock_guard<std::mutex> guard(lock);
    isResumed = true;
    changed.notify_all();
    return 0;
}

void PosixThread::applyPriority(int level)
{
    std::lock_guard<std::mutex> guard(lock);
    if (kernelID != 0)
        applyScheduling(kernelID, schedulingOf(level));
}

void PosixThread::cancel()
{
    if (!isAdopted)
        pthread_cancel(thread);
}

bool PosixThread::join()
{
    if (isAdopted || isCurrent() || pthread_join(thread, nullptr) != 0)
        return false;
    release();
    return true;
}

void PosixThread::detach()
{
    if (!isAdopted)
        pthread_detach(thread);
    release();
}

void PosixThread::release()
{
    if (holders.fetch_sub(1) == 1)
        delete this;
}
} // namespace

int PlatformThread::createSuspended(Body body, void* context, PlatformThread*& result)
{
    auto* thread = new PosixThread(body, context);
    const int error = thread->start();
    result = thread;
    if (error != 0)
    {
        delete thread;
        result = nullptr;
    }
    return error;
}

PlatformThread* PlatformThread::adoptCurrent()
{
    auto* thread = new PosixThread(nullptr, nullptr);
    thread->adopt();
    return thread;
}

FThreadID PlatformThread::currentID()
{
    return static_cast<FThreadID>(pthread_self());
}

void PlatformThread::nameCurrent(const char* name)
{
    // The system takes 15 bytes and refuses longer names.
    char shortName[16] = {};
    strncpy(shortName, name, sizeof shortName - 1);
    pthread_setname_np(pthread_self(), shortName);
}

int PlatformThread::countProcessors()
{
    return static_cast<int>(std::max(1L, sysconf(_SC_NPROCESSORS_CONF)));
}

int PlatformThread::countAvailableProcessors()
{
    cpu_set_t permitted;
    if (sched_getaffinity(0, sizeof permitted, &permitted) == 0)
        return std::max(1, CPU_COUNT(&permitted));
    return static_cast<int>(std::max(1L, sysconf(_SC_NPROCESSORS_ONLN)));
}

FCancellationPoint::FCancellationPoint() : former(PTHREAD_CANCEL_DISABLE)
{
    // Threads that are none of ours keep their own state: it is only ever widened for the time of the wait.
    pthread_setcancelstate(PTHREAD_CANCEL_ENABLE, &former);
}

FCancellationPoint::~FCancellationPoint()
{
    int present = 0;
    pthread_setcancelstate(former, &present);
}
