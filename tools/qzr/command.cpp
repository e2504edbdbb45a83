#include "tools/qzr/command.h"

#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"
#include "storage/resource/ffilearchiveiterator.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/resource/resourcecheck.h"
#include "storage/stream/fcompressionstream.h"
#include "storage/virtual/innerpath.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

namespace
{
constexpr int kDone = 0;
constexpr int kFailed = 1;
constexpr int kMisused = 2;

constexpr char kUsage[] =
    "qzr pack [--compress[=QUALITY]] FOLDER FILE   QUALITY is from 0 to 1, 0.6 if not given\n"
    "qzr list FILE\n"
    "qzr verify FILE\n"
    "qzr extract FILE FOLDER\n";

using Arguments = std::vector<std::string>;

/// A name from a file must not steer the terminal.
std::string printable(const FString& text)
{
    std::string result;
    for (const char byte : FileNameText::toBytes(text))
    {
        char escape[8];
        std::snprintf(escape, sizeof(escape), "\\x%02x",
                      static_cast<unsigned>(static_cast<unsigned char>(byte)));
        const bool steers = static_cast<unsigned char>(byte) < 0x20 || byte == 0x7f;
        result += steers ? std::string(escape) : std::string(1, byte);
    }
    return result;
}

FNPath pathOf(const std::string& bytes, int type)
{
    FNPath path(type);
    path.fromPlatformPath(bytes.c_str());
    return path;
}

int fail(const std::string& file, const char* reason)
{
    std::fprintf(stderr, "qzr: %s: %s\n", file.c_str(), reason);
    return kFailed;
}

int misuse()
{
    std::fputs(kUsage, stderr);
    return kMisused;
}

// Opening

IPtr<FResourceArchive> openArchive(const std::string& file)
{
    const FNPath path = pathOf(file, FPath::kFile);
    IPtr<FResourceArchive> archive =
        adopt(new FResourceArchive(&path, FFileArchive::kOwnHandles | FFileArchive::kBuffered));
    if (archive->open())
        return archive;
    FNPath asked(path);
    if (!gFileSystem->fileExists(&asked))
        fail(file, "there is no such file");
    else
        fail(file, "this is no resource file, it is damaged, or it is compressed in a way that this program "
                   "doesn't have");
    return nullptr;
}

int tellDamage(const std::string& file, const FResourceArchive& archive)
{
    return archive.getDamage() == 0 ? kDone
                                    : fail(file, "the table of files is damaged, and some are missing");
}

// Packing

struct Packing
{
    bool compress = false;
    float quality = FResourceArchive::kDefaultQuality;
};

bool readOption(const std::string& option, Packing& packing)
{
    constexpr char kWithQuality[] = "--compress=";
    packing.compress = true;
    if (option == "--compress")
        return true;
    if (option.rfind(kWithQuality, 0) != 0)
        return false;
    char* end = nullptr;
    packing.quality = std::strtof(option.c_str() + strlen(kWithQuality), &end);
    return *end == 0 && end[-1] != '=' && packing.quality >= 0 && packing.quality <= 1;
}

/// Whether the file would become a part of what it holds.
bool isInside(const std::string& file, const std::string& folder)
{
    const std::size_t slash = file.rfind('/');
    const std::string parent = slash == std::string::npos ? "." : file.substr(0, slash + 1);
    std::string realParent;
    std::string realFolder;
    if (!PlatformFiles::resolve(parent, realParent) || !PlatformFiles::resolve(folder, realFolder))
        return false;
    return (realParent + "/").rfind(realFolder == "/" ? realFolder : realFolder + "/", 0) == 0;
}

const char* reasonAgainst(const Packing& packing, const std::string& from, const std::string& to)
{
    FNPath folder = pathOf(from, FPath::kFolder);
    FNPath file = pathOf(to, FPath::kFile);
    if (!gFileSystem->dirExists(&folder))
        return "there is no such folder to pack";
    if (gFileSystem->dirExists(&file))
        return "it can't be packed into a file that is a folder";
    if (isInside(to, from))
        return "the file to write must not lie in the folder";
    const IPtr<FCompressionEngine> engine = adopt(FCompressionStream::createDefaultEngine());
    return packing.compress && !engine ? "compression is not available in this build" : nullptr;
}

template <class Tell>
void tellEach(const BoundedTexts& texts, Tell tell)
{
    for (const FString& text : texts.getTexts())
        tell(text);
    if (texts.getOmitted() > 0)
        std::fprintf(stderr, "qzr: and %lld more\n", static_cast<long long>(texts.getOmitted()));
}

int tellLeftOut(const FFileArchive& archive, const char* reason)
{
    tellEach(archive.getLeftOut(), [&](const FString& path) { fail(printable(path), reason); });
    return archive.getLeftOut().getCount() == 0 ? kDone : kFailed;
}

int pack(const Packing& packing, const std::string& from, const std::string& to)
{
    if (const char* reason = reasonAgainst(packing, from, to))
        return fail(from, reason);
    FNPath folder = pathOf(from, FPath::kFolder);
    FNPath file = pathOf(to, FPath::kFile);
    // A file that is there already stays until the new one is whole.
    FNPath half = pathOf(to + ".part", FPath::kFile);
    half.uniqueName();
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(&half, 0));
    const int createFlags = packing.compress ? FResourceArchive::kCompressContent : 0;
    if (!archive->create(&folder, static_cast<short>(createFlags), nullptr, nullptr, packing.quality))
        return fail(to, "the folder can't be read, or the file can't be written");
    if (!gFileSystem->moveFile(&half, &file, false))
    {
        gFileSystem->removeFile(&half);
        return fail(to, "the file can't be written");
    }
    return tellLeftOut(*archive,
                       "left out: it is no plain file or folder, or has a name that the file can't hold");
}

int runPack(const Arguments& arguments)
{
    Packing packing;
    std::size_t first = 1;
    if (arguments.size() > first && arguments[first].rfind("--", 0) == 0 &&
        !readOption(arguments[first++], packing))
        return misuse();
    if (arguments.size() != first + 2)
        return misuse();
    return pack(packing, arguments[first], arguments[first + 1]);
}

// Reading

int list(const std::string& file)
{
    const IPtr<FResourceArchive> archive = openArchive(file);
    if (!archive)
        return kFailed;
    FFileArchiveIterator walk(archive, archive->getRoot(), true);
    for (; !walk.done(); walk.next())
    {
        const FFileArchiveNode& node = *walk.currentNode();
        const std::string path = printable(InnerPath::textOf(*walk.current()));
        if (node.isFolder())
            std::printf("%12s %12s %s/\n", "", "", path.c_str());
        else
            std::printf("%12lld %12lld %s\n", static_cast<long long>(node.getFileSize()),
                        static_cast<long long>(node.getDataSize()), path.c_str());
    }
    return tellDamage(file, *archive);
}

int verify(const std::string& file)
{
    const IPtr<FResourceArchive> archive = openArchive(file);
    if (!archive)
        return kFailed;
    ResourceCheck check(*archive);
    const bool isWhole = check.run();
    tellEach(check.getProblems(), [&](const FString& problem) { fail(file, printable(problem).c_str()); });
    std::printf("%lld files, %lld bytes, %lld problems\n", static_cast<long long>(check.getFileCount()),
                static_cast<long long>(check.getByteCount()),
                static_cast<long long>(check.getProblems().getCount()));
    return isWhole ? kDone : kFailed;
}

int extract(const std::string& file, const std::string& folder)
{
    const IPtr<FResourceArchive> archive = openArchive(file);
    if (!archive)
        return kFailed;
    const bool isWhole = archive->extractAll(pathOf(folder, FPath::kFolder), nullptr);
    tellLeftOut(*archive, "not extracted: it is damaged, its name leads elsewhere, or its place is taken");
    if (!isWhole && archive->getLeftOut().getCount() == 0)
        return fail(folder, "the folder can't be written");
    const int damage = tellDamage(file, *archive);
    return isWhole ? damage : kFailed;
}

int run(const Arguments& arguments)
{
    const std::string command = arguments.empty() ? "" : arguments[0];
    if (command == "pack")
        return runPack(arguments);
    if (command == "list" && arguments.size() == 2)
        return list(arguments[1]);
    if (command == "verify" && arguments.size() == 2)
        return verify(arguments[1]);
    if (command == "extract" && arguments.size() == 3)
        return extract(arguments[1], arguments[2]);
    return misuse();
}
} // namespace

int runQzr(int argc, char** argv)
{
    const IPtr<FNFileSystem> files = adopt(new FNFileSystem);
    gFileSystem = files;
    FComponentRegistry::bringUp();
    const int result = run(Arguments(argv + 1, argv + argc));
    gComponentRegistry->release();
    gComponentRegistry = nullptr;
    gFileSystem = nullptr;
    return result;
}
