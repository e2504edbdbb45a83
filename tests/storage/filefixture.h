#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"
#include "storage/path/istandardfolders.h"
#include "storage/stream/fstream.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <string>

/// The bytes of a text in UTF-8, so that a failed comparison can be read.
inline std::string utf8(const ConstString& text)
{
    return FileNameText::toBytes(text);
}

inline std::string fullPathOf(const FPath& path)
{
    FString text;
    path.getFullPath(text);
    return utf8(text);
}

/// Standard folders that a test sets.
class TestFolders : public IStandardFolders
{
public:
    const char16* getUserPath() override { return user.text16(); }
    const char16* getTempPath() override { return temp.text16(); }
    const char16* getAppPath() override { return app.text16(); }
    const char16* getSystemPath() override { return system.text16(); }

    FString user;
    FString temp;
    FString app;
    FString system;
};

/// Gives each test a file system, an empty folder, and a user folder below it that doesn't exist yet.
class FileTest : public testing::Test
{
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "files-XXXXXX").string();
        root = mkdtemp(pattern.data());
        gFileSystem = files;
        folders.user.fromUTF8((root + "/config/user").c_str());
        folders.temp.fromUTF8((root + "/temp").c_str());
        IStandardFolders::setInstance(&folders);
    }

    void TearDown() override
    {
        IStandardFolders::setInstance(nullptr);
        gFileSystem = nullptr;
        std::filesystem::remove_all(root);
    }

    /// A path below the test's folder, from its bytes.
    IPtr<FNPath> at(const std::string& name, int type = FPath::kFile) const
    {
        IPtr<FNPath> path = adopt(new FNPath(type));
        path->fromPlatformPath((root + "/" + name).c_str());
        return path;
    }

    void put(const std::string& name, const std::string& content) const
    {
        std::ofstream(root + "/" + name, std::ios::binary) << content;
    }

    std::string contentOf(const std::string& name) const
    {
        std::ifstream file(root + "/" + name, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(file), {});
    }

    bool exists(const std::string& name) const { return std::filesystem::exists(root + "/" + name); }

    int rightsOf(const std::string& name) const
    {
        return static_cast<int>(std::filesystem::status(root + "/" + name).permissions());
    }

    /// Creates a file through the file system; true where all went well.
    bool write(FPath* path, const std::string& content, int flags = kFileWrite)
    {
        FStream* stream = files->createFile(path, flags, nullptr);
        if (!stream)
            return false;
        const auto size = static_cast<int64>(content.size());
        const bool isWritten = stream->writeRaw(content.data(), size) == size;
        return files->closeFile(stream) && isWritten;
    }

    IPtr<FNFileSystem> files = adopt(new FNFileSystem);
    TestFolders folders;
    std::string root;
};
