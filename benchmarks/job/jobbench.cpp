// The program as a whole process beside `curl -F`, its start, and what it costs while it waits.
//
// Sizes and rounds come from the environment: BENCH_UPLOAD_MIB, BENCH_ROUNDS, BENCH_STARTS, BENCH_TRACKS, BENCH_IDLE_S.

#include "tests/job/job.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>

#include <unistd.h>

namespace
{

using Clock = std::chrono::steady_clock;

int setting(const char* name, int usual)
{
    const char* text = std::getenv(name);
    return text && std::atoi(text) > 0 ? std::atoi(text) : usual;
}

double secondsSince(Clock::time_point begun)
{
    return std::chrono::duration<double>(Clock::now() - begun).count();
}

double seconds(const timeval& time)
{
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
}

double median(std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    const std::size_t middle = values.size() / 2;
    return values.size() % 2 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

/// What one process took from its start to its end.
struct Cost
{
    double wall = 0;
    double cpu = 0;
    double peakMiB = 0;
};

Cost costOf(const Process& process, Clock::time_point begun)
{
    const rusage& used = process.usage();
    return {secondsSince(begun), seconds(used.ru_utime) + seconds(used.ru_stime),
            static_cast<double>(used.ru_maxrss) / 1024};
}

void printRow(const std::string& subject, const std::string& size, double ours, double peer, const char* unit)
{
    std::printf("| %s | %s | %.4g %s | %.4g (curl) | %.2f | |\n", subject.c_str(), size.c_str(), ours, unit,
                peer, ours / peer);
}

class JobBench : public Job
{
protected:
    /// A file of that many MiB with bytes that don't repeat within a block.
    std::string makeTrack(int mebibytes)
    {
        std::string block(1 << 20, '\0');
        std::uint32_t state = 1;
        for (char& byte : block)
            byte = static_cast<char>((state = state * 1664525 + 1013904223) >> 24);
        const std::string path = exports / "big.wav";
        std::ofstream file(path, std::ios::binary);
        for (int i = 0; i < mebibytes; ++i)
            file << block;
        return path;
    }

    Cost measureProgram(const std::string& track)
    {
        SampleDescription description("Loomrit");
        description.track({{"Path", track}, {"MediaTrackTitle", "Big"}});
        const std::string file = writeDescription(description);
        const auto begun = Clock::now();
        Run run = open(file);
        run.finish();
        return costOf(*run.process, begun);
    }

    Cost measureCurl(const std::string& track)
    {
        Process::Setup setup;
        setup.arguments = {"curl",
                           "--silent",
                           "--fail",
                           "--cacert",
                           root / "authority.pem",
                           "-F",
                           "oauth_token=" + token(),
                           "-F",
                           "track[title]=Big",
                           "-F",
                           "track[asset_data]=@" + track,
                           "https://" + service->host() + "/tracks"};
        setup.environment = {"PATH=/usr/bin:/bin", "HOME=" + root.string()};
        setup.output = root / "curl-output";
        const auto begun = Clock::now();
        Process curl(setup);
        EXPECT_EQ(curl.wait(kHangs).value_or(-1), 0) << curl.output();
        return costOf(curl, begun);
    }

    Run open(const std::string& file) { return start({file}); }

    /// Seconds of processor time that a running process has used so far.
    static double processorTime(pid_t process)
    {
        const std::string stat = contentsOf("/proc/" + std::to_string(process) + "/stat");
        unsigned long user = 0, system = 0;
        // The second field is a name in parentheses that may hold blanks.
        std::sscanf(stat.c_str() + stat.rfind(')'), ") %*c %*d %*d %*d %*d %*d %*u %*u %*u %*u %*u %lu %lu",
                    &user, &system);
        return static_cast<double>(user + system) / static_cast<double>(sysconf(_SC_CLK_TCK));
    }
};

} // namespace

TEST_F(JobBench, UploadBesideCurl)
{
    const int size = setting("BENCH_UPLOAD_MIB", 512), rounds = setting("BENCH_ROUNDS", 5);
    logIn();
    const std::string track = makeTrack(size);
    std::vector<Cost> ours, theirs;
    for (int i = 0; i < rounds; ++i)
    {
        ours.push_back(measureProgram(track));
        theirs.push_back(measureCurl(track));
        std::printf("round %d: ours %.2f s, %.2f s CPU, %.1f MiB; curl %.2f s, %.2f s CPU, %.1f MiB\n", i + 1,
                    ours[i].wall, ours[i].cpu, ours[i].peakMiB, theirs[i].wall, theirs[i].cpu,
                    theirs[i].peakMiB);
    }
    ASSERT_EQ(received("/tracks").size(), 2 * ours.size());
    for (const ReceivedRequest& request : received("/tracks"))
        EXPECT_TRUE(request.complete);

    const auto row = [&](const char* name, double Cost::*part, const char* unit)
    {
        std::vector<double> mine, peers;
        for (int i = 0; i < rounds; ++i)
        {
            mine.push_back(ours[i].*part);
            peers.push_back(theirs[i].*part);
        }
        printRow(name, std::to_string(size) + " MiB", median(mine), median(peers), unit);
    };
    row("upload over TLS, wall time", &Cost::wall, "s");
    row("upload over TLS, CPU time", &Cost::cpu, "s");
    row("upload over TLS, peak memory", &Cost::peakMiB, "MiB");
}

TEST_F(JobBench, StartToFirstRequest)
{
    logIn();
    std::vector<double> times;
    for (int i = 0; i < setting("BENCH_STARTS", 20); ++i)
    {
        const std::string file = writeDescription(minimal());
        const auto begun = Clock::now();
        Run run = open(file);
        ASSERT_TRUE(service->waitForRequests("/me", i + 1, kHangs));
        times.push_back(secondsSince(begun) * 1000);
        run.finish();
    }
    std::printf(
        "| start to the first request at the service | %zu starts | median %.0f ms, %.0f to %.0f | | | |\n",
        times.size(), median(times), *std::min_element(times.begin(), times.end()),
        *std::max_element(times.begin(), times.end()));
}

TEST_F(JobBench, IdleWhileAnUploadStalls)
{
    constexpr int kSize = 4;
    const int time = setting("BENCH_IDLE_S", 10);
    logIn();
    ASSERT_TRUE(service->plan("/tracks stall 1000"));
    SampleDescription description("Loomrit");
    description.track({{"Path", makeTrack(kSize)}});
    Run run = open(writeDescription(description));
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    sleep(1);
    const double before = processorTime(run.process->id());
    sleep(static_cast<unsigned>(time));
    const double used = processorTime(run.process->id()) - before;
    std::printf("| CPU time while an upload stalls | %d s | %.2f %% of one core | | | |\n", time,
                used / time * 100);
    service->release();
    run.finish();
}

TEST_F(JobBench, QueueOfManyTracks)
{
    const int count = setting("BENCH_TRACKS", 10000);
    logIn();
    ASSERT_TRUE(service->plan("/tracks stall 0"));
    SampleDescription description("Loomrit");
    for (int i = 0; i < count; ++i)
        description.track({{"Path", tone()}, {"MediaTrackTitle", "Track " + std::to_string(i)}});
    const std::string file = writeDescription(description);
    const auto begun = Clock::now();
    Run run = open(file);
    ASSERT_TRUE(service->waitForRequests("/tracks", 1, kHangs));
    const double milliseconds = secondsSince(begun) * 1000;
    std::printf("| start to the first track's request | %d tracks | %.0f ms, %.1f MiB | | | |\n", count,
                milliseconds, static_cast<double>(run.process->peakMemory()) / 1024);
    run.process->terminate();
    service->release();
    run.process->wait(kHangs);
}

TEST_F(JobBench, MemoryOverManyUploads)
{
    const int count = 1000;
    logIn();
    SampleDescription description("Loomrit");
    for (int i = 0; i < count; ++i)
        description.track({{"Path", tone()}});
    Run run = open(writeDescription(description));
    ASSERT_TRUE(service->waitForRequests("/tracks", 100, kHangs));
    const double early = static_cast<double>(run.process->peakMemory()) / 1024;
    ASSERT_TRUE(service->waitForRequests("/tracks", count, kHangs));
    const double late = static_cast<double>(run.process->peakMemory()) / 1024;
    run.finish();
    std::printf(
        "| peak memory after 100 and after %d uploads of one process | %d | %.1f and %.1f MiB | | | |\n",
        count, count, early, late);
}
