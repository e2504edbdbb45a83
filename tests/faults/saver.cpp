#include "tests/faults/faultrun.h"

#include "application/outofmemory.h"
#include "services/defaults/fdefaultpool.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/istandardfolders.h"
#include "uploadmanager/storednames.h"

#include <cstdio>
#include <cstring>
#include <string>

#include <unistd.h>

// Saves or loads one file of the user folder, as the program does, and nothing else:
//
//     saver FOLDER save|load tokens|cache|settings VALUE
//
// Only calls between the marks count. Exit code 0: done; 3: failed, and told so by the operation.

namespace
{
constexpr int kDone = 0;
constexpr int kFailed = 3;
constexpr int kMisused = 2;

// More than one block of the file's buffer.
constexpr int kSettings = 600;

class Folders : public IStandardFolders
{
public:
    explicit Folders(const char* path) { folder.fromUTF8(path); }
    const char16* getUserPath() override { return folder.text16(); }
    const char16* getTempPath() override { return nullptr; }
    const char16* getAppPath() override { return nullptr; }
    const char16* getSystemPath() override { return nullptr; }

private:
    FString folder;
};

/// Lets calls count as long as it lives.
class Counting
{
public:
    Counting() { static_cast<void>(getpgid(kBeginCounting)); }
    ~Counting() { static_cast<void>(getpgid(kEndCounting)); }
    Counting(const Counting&) = delete;
    Counting& operator=(const Counting&) = delete;
};

struct File
{
    const char* word;
    const char16* name;
    const char* root;
    const char* key;
};

constexpr File kFiles[] = {{"tokens", kTokenFile, kTokenRoot, "Loomrit"},
                           {"cache", kCacheFile, kCacheRoot, kCacheKey}};

bool saveFile(const File& file, const char* value)
{
    FAttributes tree;
    tree.setString8(file.key, value, true);
    Counting counting;
    return FXmlArchive::saveAttributes(file.name, file.root, tree);
}

bool loadFile(const File& file, const char* value)
{
    FAttributes tree;
    Counting counting;
    const char* stored =
        FXmlArchive::loadAttributes(file.name, file.root, tree) ? tree.getString8(file.key) : nullptr;
    return stored && std::strcmp(stored, value) == 0;
}

std::string keyOf(int number)
{
    return "key " + std::to_string(number);
}

bool saveSettings(const char* value)
{
    const auto pool = adopt(new FDefaultPool);
    for (int i = 0; i < kSettings; i++)
        pool->setString8("group", keyOf(i).c_str(), value);
    Counting counting;
    return FXmlArchive::storeObject(u"Defaults", "Defaults", pool, false);
}

bool loadSettings(const char* value)
{
    const auto pool = adopt(new FDefaultPool);
    {
        Counting counting;
        pool->load();
    }
    for (int i = 0; i < kSettings; i++)
    {
        const char* stored = pool->getString8("group", keyOf(i).c_str());
        if (!stored || std::strcmp(stored, value) != 0)
            return false;
    }
    return true;
}

bool isDone(const std::string& what, const std::string& word, const char* value)
{
    for (const File& file : kFiles)
        if (word == file.word)
            return what == "save" ? saveFile(file, value) : loadFile(file, value);
    return what == "save" ? saveSettings(value) : loadSettings(value);
}
} // namespace

int main(int argc, char** argv)
{
    if (argc != 5)
        return kMisused;
    endInWordsWithoutMemory();
    const auto files = adopt(new FNFileSystem);
    gFileSystem = files;
    Folders folders(argv[1]);
    IStandardFolders::setInstance(&folders);
    const bool result = isDone(argv[2], argv[3], argv[4]);
    IStandardFolders::setInstance(nullptr);
    gFileSystem = nullptr;
    return result ? kDone : kFailed;
}
