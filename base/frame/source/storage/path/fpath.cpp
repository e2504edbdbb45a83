#include "storage/path/fpath.h"

#include "foundation/text/utranslatedstring.h"
#include "storage/path/fpathcompare.h"

#include <string>
#include <vector>

DEFINE_CLASS(FPath, CmObject)
DEFINE_INTERFACE_ID(IPath, 0xB3C41E6A, 0x90F74D0B, 0x8A52C71E, 0x3D66F9A4)

namespace
{
const UTranslatedString stringDirectory("directory");

bool endsInDelimiter(const ConstString& text)
{
    return !text.isEmpty() && text.testChar16(text.length() - 1, PATH_DELIMITER);
}

using Components = std::vector<std::u16string>;

// Empty components, as in "a//b", don't count.
Components componentsOf(const FPath& path)
{
    FString text;
    path.getFullPath(text);
    Components components;
    std::u16string component;
    for (const char16* next = text.text16(); *next; next++)
    {
        if (*next != PATH_DELIMITER)
            component += *next;
        else if (!component.empty())
            components.push_back(std::move(component)), component.clear();
    }
    if (!component.empty())
        components.push_back(std::move(component));
    return components;
}

bool isAbsoluteText(const FPath& path)
{
    const FString& text = path.getPathName();
    return text.testChar16(0, PATH_DELIMITER);
}
} // namespace

FPath::FPath(const char16* fullPath, int newType)
{
    FPath::fromString(fullPath, newType);
}

FPath::FPath(const char16* newName, const FPath* folder, int newType) : type(static_cast<int16>(newType))
{
    if (folder)
        folder->getFullPath(path);
    if (!path.isEmpty() && !endsInDelimiter(path))
        path.append(PATH_DELIMITER);
    FPath::setName(newName);
}

FPath::FPath(const char16* newName, const char16* folder, int newType) : type(static_cast<int16>(newType))
{
    FPath::setPathName(folder);
    FPath::setName(newName);
}

FPath::FPath(IPath* other)
{
    const FPath* known = FCast(FPath, toCmObject(other));
    if (known)
        takeParts(*known);
    else if (other)
        takeInterface(*other);
}

void FPath::takeParts(const FPath& other)
{
    name = other.name;
    fileType = other.fileType;
    flags = other.flags;
    type = other.type;
    path = other.path;
}

void FPath::takeInterface(IPath& other)
{
    char16 text[kPathBufferSize] = {};
    int otherType = kFile;
    if (other.getType(&otherType) != kPathOk || other.getFullPath(text) != kPathOk)
        return;
    fromString(text, otherType);
    FFileTypeInfo info;
    if (other.getFileType(&info) == kPathOk)
        toFrameworkFileType(info, fileType);
}

bool FPath::fromString(const char16* text, int newType)
{
    type = static_cast<int16>(newType);
    path.assign(text ? text : u"");
    name.assign(u"");
    if (isRoot(path.text16()))
    {
        type = kFolder;
        return true;
    }
    if (path.isEmpty())
        return false;
    if (endsInDelimiter(path))
        path.remove(path.length() - 1);
    const int last = path.findPrev(-1, PATH_DELIMITER);
    if (last < 0)
        return true;
    path.extract(name, static_cast<unsigned>(last) + 1);
    path.remove(static_cast<unsigned>(last) + 1);
    return true;
}

bool FPath::getFullPath(FString& result) const
{
    FString text(path);
    text.append(name);
    result.take(text);
    return !result.isEmpty();
}

// Parts

void FPath::setName(const char16* text)
{
    name.assign(text ? text : u"");
    // A name with a delimiter would lead somewhere else as soon as the path becomes a text.
    const char16 delimiter[] = {PATH_DELIMITER, 0};
    name.replaceChars16(delimiter, u'_');
}

void FPath::setPathName(const char16* text)
{
    path.assign(text ? text : u"");
    if (!path.isEmpty() && !endsInDelimiter(path))
        path.append(PATH_DELIMITER);
}

void FPath::setVisible(bool state)
{
    flags = static_cast<uint16>(state ? flags & ~kHidden : flags | kHidden);
}

// File type

FFileType& FPath::getFileType()
{
    if (isFolder())
        fileType.setName(stringDirectory.text());
    else if (!fileType.isValid())
        detectFileType(true);
    return fileType;
}

bool FPath::detectFileType(bool)
{
    fileType.reset();
    return !isFolder() && assignType(typeOfExtension());
}

FFileType* FPath::typeOfExtension() const
{
    FString extension;
    return getExtension(extension) ? FFileType::getTypeByString(extension.text16()) : nullptr;
}

bool FPath::assignType(const FFileType* found)
{
    if (found)
    {
        fileType = *found;
        return true;
    }
    FString extension;
    if (!getExtension(extension))
        extension.assign(u"???");
    fileType.setDosType(extension);
    fileType.setUnixType(extension);
    return false;
}

void FPath::toFrameworkFileType(const FFileTypeInfo& info, FFileType& result)
{
    FString extension;
    extension.fromUTF8(info.extension);
    FString typeName;
    typeName.fromUTF8(info.name);
    result.reset();
    result.setMacType(info.macType);
    result.setDosType(extension);
    result.setUnixType(extension);
    result.setName(typeName);
}

void FPath::fromFrameworkFileType(const FFileType& fileType, FFileTypeInfo& result)
{
    FString extension(fileType.getExtension());
    extension.toMultiByte(kEncodingUtf8);
    FString typeName(fileType.getName());
    typeName.toMultiByte(kEncodingUtf8);
    result.set(fileType.getMacType(), extension.text8(), typeName.text8());
}

// Moving

bool FPath::isRoot(const char16* text) const
{
    return text && text[0] == PATH_DELIMITER && text[1] == 0;
}

bool FPath::isRootDir() const
{
    return name.isEmpty() && isRoot(path.text16());
}

bool FPath::descend(const char16* childName, int childType)
{
    if (!endsInDelimiter(path))
        path.append(PATH_DELIMITER);
    if (!name.isEmpty())
        path.append(name).append(PATH_DELIMITER);
    setName(childName);
    type = static_cast<int16>(childType);
    return true;
}

bool FPath::ascend()
{
    if (isRoot(path.text16()))
        return ascendFromRoot();
    if (path.isEmpty())
        return false;
    // In place: whoever goes up many levels would copy the path as often.
    int end = static_cast<int>(path.length());
    while (end > 0 && path.testChar16(static_cast<unsigned>(end) - 1, PATH_DELIMITER))
        end--;
    const int last = end > 0 ? path.findPrev(end - 1, PATH_DELIMITER) : -1;
    if (last < 0)
        return false;
    name.assign(u"");
    path.extract(name, static_cast<unsigned>(last) + 1, end - last - 1);
    path.remove(static_cast<unsigned>(last) + 1);
    type = kFolder;
    return true;
}

bool FPath::ascendFromRoot()
{
    if (name.isEmpty())
        return false;
    name.assign(u"");
    if (endsInDelimiter(path) && !path.testChar16(0, PATH_DELIMITER))
        path.remove(path.length() - 1);
    type = kFolder;
    return true;
}

bool FPath::isInDir(const FPath* folder) const
{
    if (!folder || isAbsoluteText(*this) != isAbsoluteText(*folder))
        return false;
    const Components own = componentsOf(*this);
    const Components leading = componentsOf(*folder);
    if (leading.size() >= own.size())
        return false;
    const CompareMode mode = isCaseSensitive() ? kCaseSensitive : kCaseInsensitive;
    for (size_t i = 0; i < leading.size(); i++)
        if (ConstString(own[i].c_str()).compare(leading[i].c_str(), mode) != 0)
            return false;
    return true;
}

// Comparison

unsigned FPath::hash(unsigned size) const
{
    if (size == 0)
        return 0;
    unsigned result = 0;
    for (const FString* part : {&path, &name})
        for (const char16* next = part->text16(); *next; next++)
            result = (*next + result * 64) % size;
    return result;
}

int FPath::compare(const CmObject* other) const
{
    const FPath* otherPath = FCast(FPath, other);
    return otherPath ? FPathCompare::compareTreeStyle(this, otherPath, true) : -1;
}

bool FPath::isEqual(const CmObject* other) const
{
    const FPath* otherPath = FCast(FPath, other);
    return otherPath && FPath::operator==(*otherPath);
}

bool FPath::operator==(const FPath& other) const
{
    const CompareMode mode = isCaseSensitive() ? kCaseSensitive : kCaseInsensitive;
    return name.compare(other.name, mode) == 0 && path.compare(other.path, mode) == 0;
}

bool FPath::internalize(FArchive&)
{
    return true;
}

bool FPath::externalize(FArchive&) const
{
    return true;
}
