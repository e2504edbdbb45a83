#include "fuzz/driver/options.h"
#include "fuzz/fuzztree.h"
#include "storage/archive/fxmlarchive.h"

#include <algorithm>

// What the XML archive reads and writes, it reads again.

namespace
{
constexpr const char* kRoot = "r";

bool loadTree(const std::string& text, FAttributes& tree)
{
    FMemoryStream stream(const_cast<char*>(text.data()), static_cast<int64>(text.size()));
    FXmlArchive archive(&stream, false);
    return archive.loadAttributes(kRoot, tree);
}

/// Empty where the tree isn't saved: a character that is written by number may make a text too long to be read.
std::string saveTree(const FAttributes& tree)
{
    FMemoryStream stream;
    FXmlArchive archive(&stream, true);
    return archive.saveAttributes(kRoot, tree) ? bytesOf(stream) : std::string();
}

void loadRoots(const std::string& text, bool windowsEntities)
{
    FMemoryStream stream(const_cast<char*>(text.data()), static_cast<int64>(text.size()));
    FXmlArchive archive(&stream, false);
    archive.load(kRoot, nullptr, windowsEntities);
    askForRoots(archive);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const LeaksAllowed allowed(data, size);
    FuzzText input(data, size);
    const uint8_t choice = input.takeByte();
    const size_t begin = std::min<size_t>(size, 1);
    const std::string text(reinterpret_cast<const char*>(data) + begin, size - begin);
    if (choice % 2 == 0)
        loadRoots(text, choice % 4 == 0);
    FAttributes tree;
    if (!loadTree(text, tree))
        return 0;
    const std::string saved = saveTree(tree);
    FAttributes second;
    require(saved.empty() || (loadTree(saved, second) && second.total() == tree.total()));
    touchObjects(tree);
    return 0;
}
