#include "storage/path/fnpath.h"

#include "foundation/object/iptr.h"
#include "storage/path/filenametext.h"

#include <cstring>

DEFINE_CLASS(FNPath, FPath)
DEFINE_INTERFACE_CLASS(IPath, FNPath)

bool FNPath::storeAttrFileType = false;

namespace
{
constexpr char16 kForeignDelimiter = PATH_DELIMITER == kUnixDelimiter ? kWindowsDelimiter : kUnixDelimiter;
constexpr char16 kUpwards[] = {u'.', u'.', PATH_DELIMITER, 0};
constexpr unsigned kUpwardsLength = 3;

bool leadsUpwards(const FString& text, unsigned index)
{
    return text.compareAt(index, kUpwards, static_cast<int>(kUpwardsLength)) == 0;
}

bool isLetter(char16 c)
{
    return (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z');
}

// Drive letters of foreign paths are upper case.
void raiseDriveLetter(String& text)
{
    if (text.testChar16(1, u':') && isLetter(text.getChar16(0)))
        text.toUpper(0u);
}

/// What a folder part holds from `index` on, without empty components.
std::u16string foldersOf(const FString& path, int index)
{
    std::u16string folders;
    const int end = path.findPrev(-1, PATH_DELIMITER);
    for (; index <= end; index++)
    {
        const char16 character = path.getChar16(static_cast<unsigned>(index));
        if (character != PATH_DELIMITER || (!folders.empty() && folders.back() != PATH_DELIMITER))
            folders += character;
    }
    return folders;
}

bool isPlainInUrl(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
           (c != 0 && strchr("-._~/", c));
}
} // namespace

FNPath::FNPath(int newType)
{
    type = static_cast<int16>(newType);
}

FNPath::FNPath(const char16* text, int newType)
{
    FNPath::fromString(text, newType);
}

FNPath::FNPath(const char16* newName, const FNPath* folder, int newType) : FPath(newName, folder, newType) {}

FNPath::FNPath(FNPath* base, FNPath* relative)
{
    if (!relative)
        return;
    IPtr<FNPath> place = adopt(relative->createAbsolutePath(base));
    takeParts(place ? *place : *relative);
}

FNPath::FNPath(IPath* other)
{
    const FNPath* known = FCast(FNPath, toCmObject(other));
    if (known)
        takeParts(*known);
    else if (other)
        takeInterface(*other);
}

FNPath::FNPath(const char16* newName, int standardFolder, int newType, const char16* subFolder, bool create)
{
    getStandardFolder(standardFolder, subFolder, create);
    if (path.isEmpty())
        return;
    setName(newName);
    type = static_cast<int16>(newType);
}

// Text

bool FNPath::fromString(const char16* text, int newType)
{
    type = static_cast<int16>(newType);
    return fromPlatformPath(FileNameText::toBytes(ConstString(text)).c_str());
}

bool FNPath::fromPlatformPath(const void* utf8Text)
{
    if (!utf8Text)
        return false;
    String text;
    FileNameText::fromBytes(static_cast<const char*>(utf8Text), text);
    text.normalize(kUnicodeNormC);
    const char16 foreign[] = {kForeignDelimiter, 0};
    text.replaceChars16(foreign, PATH_DELIMITER);
    raiseDriveLetter(text);
    if (text.testChar16(0, u'.') && text.testChar16(1, PATH_DELIMITER))
        text.remove(0, 2);
    if (text.length() >= 2 && text.testChar16(text.length() - 1, PATH_DELIMITER))
        text.remove(text.length() - 1);
    platformState = -1;
    splitText(text);
    return true;
}

void FNPath::splitText(const String& text)
{
    path.assign(u"");
    name.assign(u"");
    if (isRoot(text.text16()))
    {
        path = text;
        type = kFolder;
        return;
    }
    const int last = text.findPrev(-1, PATH_DELIMITER);
    if (last >= 0)
        text.extract(path, 0, last + 1);
    text.extract(name, static_cast<unsigned>(last + 1));
}

std::string FNPath::platformPath() const
{
    FString text;
    getFullPath(text);
    return FileNameText::toBytes(text);
}

bool FNPath::toPlatformPath(void* buffer) const
{
    char* target = static_cast<char*>(buffer);
    if (path.length() + name.length() >= static_cast<unsigned>(kMaxPathLength))
    {
        target[0] = target[1] = 0;
        return false;
    }
    const std::string bytes = platformPath();
    memcpy(target, bytes.c_str(), bytes.size() + 1);
    return true;
}

bool FNPath::createURL(FString& url) const
{
    if (!isAbsolute())
        return false;
    std::string text("file://");
    for (const char c : platformPath())
    {
        char escaped[4] = {c};
        if (!isPlainInUrl(c))
            snprintf(escaped, sizeof(escaped), "%%%02X", static_cast<unsigned char>(c));
        text += escaped;
    }
    url.assign(text.c_str());
    return true;
}

bool FNPath::isAbsolute() const
{
    return path.testChar16(0, PATH_DELIMITER);
}

// Relative paths

bool FNPath::assignRelative(const FNPath* absolute, const FNPath* base)
{
    if (!absolute || !base || !absolute->isTypeOf("FNPath", true) || !base->isTypeOf(absolute->isA(), true))
        return false;
    if (*base == *absolute)
    {
        const FNPath target(*absolute);
        path.assign(u"");
        name.assign(u".");
        type = target.type;
        fileType = target.fileType;
        return true;
    }
    // Kept apart, since either argument may be this path itself.
    FNPath result(*absolute);
    FNPath folder(*base);
    FString upwards;
    do
    {
        FString left;
        FNPath walk(*absolute);
        bool isInLine = walk.ascend();
        while (isInLine && !(walk == folder))
        {
            FString component(walk.name);
            component.append(PATH_DELIMITER);
            left.insertAt(0, component);
            isInLine = walk.ascend();
        }
        if (isInLine)
        {
            result.path = upwards;
            result.path.append(left);
            break;
        }
        upwards.insertAt(0, kUpwards);
    } while (folder.ascend());
    *this = result;
    return true;
}

bool FNPath::makeRelative(const FNPath* base)
{
    return assignRelative(this, base);
}

FNPath* FNPath::createAbsolutePath(const FNPath* base) const
{
    if (!base || isAbsolute())
        return nullptr;
    FNPath* result = new FNPath(*base);
    result->fileType = fileType;
    const int levels = countAscendLevels();
    for (int i = 0; i < levels && result->ascend(); i++)
    {
    }
    if (name == ConstString(u"."))
        return result;
    if (name == ConstString(u".."))
    {
        result->ascend();
        return result;
    }
    // All folders at once: a path that grew by each of them would be copied as often.
    result->descend(u"", kFolder);
    result->path.append(foldersOf(path, levels * static_cast<int>(kUpwardsLength)).c_str());
    result->descend(name.text16(), type);
    return result;
}

bool FNPath::makeAbsolute(const FNPath* base)
{
    IPtr<FNPath> place = adopt(createAbsolutePath(base));
    if (!place)
        return false;
    takeParts(*place);
    return true;
}

int FNPath::countAscendLevels() const
{
    int levels = 0;
    while (leadsUpwards(path, static_cast<unsigned>(levels) * kUpwardsLength))
        levels++;
    return levels;
}
