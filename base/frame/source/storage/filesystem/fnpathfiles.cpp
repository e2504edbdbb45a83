#include "storage/filesystem/diskname.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/fnpath.h"
#include "storage/path/istandardfolders.h"
#include "storage/stream/fstream.h"

// What paths ask the disk.

namespace
{
// Folders that count as one thing.
constexpr const char16* kBundleExtensions[] = {u"app", u"bundle", u"component", u"framework", u"plugin"};

bool isFileOf(FPath& path, void* fileSystem)
{
    return static_cast<FFileSystem*>(fileSystem)->fileExists(&path);
}

bool isOnDisk(FPath& path, void*)
{
    return gFileSystem->fileExists(&path) || gFileSystem->dirExists(FCast(FNPath, &path));
}

bool isBundleExtension(const FString& extension)
{
    for (const char16* known : kBundleExtensions)
        if (extension.compare(known, kCaseInsensitive) == 0)
            return true;
    return false;
}

ConstString standardFolder(int which)
{
    IStandardFolders* folders = IStandardFolders::instance();
    if (!folders)
        return {};
    switch (which)
    {
    case FNPath::kUserFolder:
        return folders->getUserPath();
    case FNPath::kTempFolder:
        return folders->getTempPath();
    case FNPath::kAppFolder:
        return folders->getAppPath();
    case FNPath::kSystemFolder:
        return folders->getSystemPath();
    default:
        return {};
    }
}
} // namespace

bool FPath::makeUnique(FFileSystem& fileSystem)
{
    return numberName(isFileOf, &fileSystem);
}

bool FPath::uniqueName()
{
    return gFileSystem && makeUnique(*gFileSystem);
}

bool FNPath::uniqueName()
{
    return gFileSystem && numberName(isOnDisk, nullptr);
}

bool FNPath::isRoot(const char16* text) const
{
    return FNFileSystem::isRoot(text);
}

bool FNPath::makeValidName(char16 replacement)
{
    const bool isNameChanged = FNFileSystem::replaceInvalid(name, replacement, false);
    return FNFileSystem::makeValidPath(path, replacement) || isNameChanged;
}

int64 FNPath::getSize() const
{
    FNPath own(*this);
    const int64 size = gFileSystem ? gFileSystem->getFileSize(&own) : 0;
    return size < 0 ? 0 : size;
}

// File type

bool FNPath::detectFileType(bool lookIntoFile)
{
    fileType.reset();
    if (isFolder())
        return false;
    const FFileType* found = typeOfExtension();
    if (!found && lookIntoFile)
        found = typeOfContent();
    const bool isFound = assignType(found);
    if (!name.isEmpty())
        askPlatform();
    return isFound;
}

// Files that a stream goes through once, as pipes, would have lost their beginning.
FFileType* FNPath::typeOfContent()
{
    if (!gFileSystem || PlatformFiles::look(DiskName::find(*this)).kind != PlatformFiles::Kind::kFile)
        return nullptr;
    FStream* stream = gFileSystem->openFile(this, kFileRead | kFileShare, nullptr);
    if (!stream)
        return nullptr;
    FFileType* found = FFileType::getTypeByStream(stream);
    gFileSystem->closeFile(stream);
    return found;
}

// Files have no code and no flags of their own here: a name that begins with a dot is hidden, and a folder
// with the right extension is a bundle.
void FNPath::askPlatform()
{
    const PlatformFiles::Facts facts = PlatformFiles::look(DiskName::find(*this));
    if (facts.kind != PlatformFiles::Kind::kMissing)
        platformState = static_cast<int32>(facts.mode);
    FString extension;
    if (facts.kind == PlatformFiles::Kind::kFolder && getExtension(extension) && isBundleExtension(extension))
        type = kBundle;
    setVisible(!name.testChar16(0, u'.'));
}

bool FNPath::updateExtension(bool replace)
{
    platformState = -1;
    return FPath::updateExtension(replace);
}

// Standard folders

bool FNPath::getStandardFolder(int which, const char16* subFolder, bool create)
{
    const FNPath folder(standardFolder(which).text16(), kFolder);
    FString text;
    if (!folder.getFullPath(text))
        return false;
    platformState = -1;
    return enterFolder(text, create) && (!subFolder || !*subFolder || enterSubFolder(subFolder, create));
}

// The folder part becomes `folder` in any case, so that the path names the place where it would be.
bool FNPath::enterFolder(const FString& folder, bool create)
{
    setPathName(folder.text16());
    FNPath place(folder.text16(), kFolder);
    if (!gFileSystem)
        return false;
    return gFileSystem->dirExists(&place) || (create && gFileSystem->createDir(&place));
}

bool FNPath::enterSubFolder(const char16* subFolder, bool create)
{
    FString text(path);
    text.append(subFolder);
    const FNPath folder(text.text16(), kFolder);
    folder.getFullPath(text);
    return enterFolder(text, create);
}

FNPath* createUserFolderPath()
{
    FNPath folder(FPath::kFolder);
    if (!folder.getStandardFolder(FNPath::kUserFolder, nullptr, true))
        return nullptr;
    return new FNPath(folder.getPathName().text16(), FPath::kFolder);
}
