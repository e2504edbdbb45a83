#include "fuzz/driver/options.h"
#include "fuzz/fuzztree.h"
#include "storage/archive/fbinarchive.h"

#include <algorithm>

// What the binary archive reads it can write, and reads again at the same size.

namespace
{
bool loadTree(const std::string& bytes, bool bigEndian, FAttributes& tree)
{
    FMemoryStream stream(const_cast<char*>(bytes.data()), static_cast<int64>(bytes.size()));
    stream.setByteOrder(bigEndian ? 1 : 0);
    FBinArchive archive(&stream, false);
    return archive.loadAttributes(tree);
}

std::string saveTree(const FAttributes& tree)
{
    FMemoryStream stream;
    FBinArchive archive(&stream, true);
    require(archive.saveAttributes(tree));
    return bytesOf(stream);
}

void loadRoots(const std::string& bytes)
{
    FMemoryStream stream(const_cast<char*>(bytes.data()), static_cast<int64>(bytes.size()));
    FBinArchive archive(&stream, false);
    archive.load();
    askForRoots(archive);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const LeaksAllowed allowed(data, size);
    FuzzText input(data, size);
    const uint8_t choice = input.takeByte();
    const size_t begin = std::min<size_t>(size, 1);
    const std::string bytes(reinterpret_cast<const char*>(data) + begin, size - begin);
    if (choice % 2 == 0)
        return loadRoots(bytes), 0;
    FAttributes tree;
    if (!loadTree(bytes, choice % 4 == 3, tree))
        return 0;
    const std::string saved = saveTree(tree);
    FAttributes second;
    // Objects are numbered by their addresses.
    require(loadTree(saved, false, second) && saveTree(second).size() == saved.size());
    touchObjects(tree);
    return 0;
}
