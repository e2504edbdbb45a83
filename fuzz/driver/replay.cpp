#include <cstdint>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <sys/resource.h>
#include <vector>

// Runs a target over the files of a command line and of its folders, without a fuzzer, and tells for each the time of the
// processor and the growth of the process's memory. The name is written first: after a crash it is the last line.

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace
{
namespace fs = std::filesystem;

long peakInKilobytes()
{
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

void addFiles(const fs::path& place, std::vector<fs::path>& files)
{
    if (!fs::is_directory(place))
    {
        files.push_back(place);
        return;
    }
    for (const fs::directory_entry& entry : fs::recursive_directory_iterator(place))
        if (entry.is_regular_file())
            files.push_back(entry.path());
}

bool runFile(const fs::path& path)
{
    std::ifstream file(path, std::ios::binary);
    const std::string bytes(std::istreambuf_iterator<char>(file), {});
    if (!file)
    {
        std::fprintf(stderr, "%s can't be read\n", path.c_str());
        return false;
    }
    std::printf("%s (%zu bytes)", path.c_str(), bytes.size());
    std::fflush(stdout);
    const long before = peakInKilobytes();
    const std::clock_t start = std::clock();
    LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
    const double seconds = static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
    std::printf(" %.1f ms, %ld KB more\n", 1000 * seconds, peakInKilobytes() - before);
    return true;
}
} // namespace

int main(int argc, char** argv)
{
    std::vector<fs::path> files;
    for (int i = 1; i < argc; i++)
        addFiles(argv[i], files);
    bool allRead = !files.empty();
    for (const fs::path& path : files)
        allRead = runFile(path) && allRead;
    std::printf("%zu inputs\n", files.size());
    return allRead ? 0 : 1;
}
