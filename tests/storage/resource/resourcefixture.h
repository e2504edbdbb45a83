#pragma once

#include "services/components/fcomponentregistry.h"
#include "storage/filesystem/ffileiterator.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/stream/fmemorystream.h"
#include "tests/storage/filefixture.h"

/// Gives each test the engines that the program brings along, and a folder "src" with a few files.
class ResourceTest : public FileTest
{
protected:
    void SetUp() override
    {
        FileTest::SetUp();
        FComponentRegistry::bringUp();
        std::filesystem::create_directories(root + "/src/b");
        std::filesystem::create_directories(root + "/src/empty");
        put("src/b.txt", longText());
        put("src/b/two", "22");
        put("src/b/one", "1");
        put("src/zero", "");
        put("src/\u00FCml\u00E4ut", "u");
    }
    void TearDown() override
    {
        gComponentRegistry->release();
        gComponentRegistry = nullptr;
        FileTest::TearDown();
    }

    static std::string longText()
    {
        std::string text;
        for (int i = 0; i < 20000; i++)
            text += std::to_string(i);
        return text;
    }

    bool pack(const std::string& file, int createFlags = 0, UProgressHook* hook = nullptr)
    {
        const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(at(file), 0));
        return archive->create(at("src", FPath::kFolder), static_cast<short>(createFlags), hook);
    }

    /// Open, or null.
    IPtr<FResourceArchive> opened(const std::string& file, int flags = 0)
    {
        IPtr<FResourceArchive> archive = adopt(new FResourceArchive(at(file), flags));
        return archive->open() ? archive : nullptr;
    }

    static std::string read(FFileSystem& from, const char16* text)
    {
        FPath path(text, FPath::kFile);
        FStream* stream = from.openFile(&path, kFileRead | kFileShare, nullptr);
        if (!stream)
            return "null";
        std::string content;
        char piece[4000];
        for (int64 got = 0; (got = stream->readRaw(piece, 4000)) > 0;)
            content.append(piece, static_cast<std::size_t>(got));
        from.closeFile(stream);
        return content;
    }

    /// The paths of all files and folders in their order.
    static std::string listing(FResourceArchive& archive)
    {
        std::string list;
        FPath top(u"/", FPath::kFolder);
        const IPtr<FFileIterator> walk = adopt(archive.newIterator(&top, true));
        for (walk->first(); !walk->done(); walk->next())
            list += fullPathOf(*walk->current()) + (walk->current()->isFolder() ? "/ " : " ");
        return list;
    }
};

/// Writes a resource file byte by byte, right or wrong.
struct ForgedFile
{
    ForgedFile() { data.writeString8(kResourceHeader, false); }

    /// Version 1.
    void entry(uint32 flags, uint32 offset, uint32 size, const char16* name)
    {
        table.writeInt32u(flags);
        table.writeInt32u(offset);
        table.writeInt32u(size);
        table.writeStringUtf8(name);
        count++;
    }
    void file(const char16* name, const char* content)
    {
        entry(FResourceEntry::kFile, static_cast<uint32>(data.tell()), static_cast<uint32>(strlen(content)),
              name);
        data.writeString8(content, false);
    }
    void folder(const char16* name) { entry(FResourceEntry::kFolder, 0, 0, name); }
    void endFolder() { folder(u".."); }

    std::string bytes()
    {
        FMemoryStream end;
        end.writeInt32u(static_cast<uint32>(table.getSize()));
        end.writeInt32u(count);
        end.writeInt32u(16);
        end.writeString8("QZRF", false);
        std::string all;
        for (const FMemoryStream* part : {&data, &table, &end})
            all.append(part->getData() ? part->getData() : "", static_cast<std::size_t>(part->getSize()));
        return all;
    }

    FMemoryStream data;
    FMemoryStream table;
    uint32 count = 0;
};
