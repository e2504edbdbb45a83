#include "storage/path/fpath.h"

// Extensions of paths, and the names that are numbered in front of them.

namespace
{
constexpr char16 kDot = u'.';
constexpr int kLastNumber = 9999;
// More digits than these are a name of their own, not a count to go on from.
constexpr unsigned kMostDigits = 6;

// Takes "-05" off the end of a name; gives 5, or 0 where there is no such end.
int cutNumber(FString& name)
{
    const int digits = name.getTrailingNumberIndex();
    if (digits < 1 || !name.testChar16(static_cast<unsigned>(digits) - 1, u'-'))
        return 0;
    int32 number = 0;
    if (name.length() - static_cast<unsigned>(digits) > kMostDigits ||
        !name.scanInt32(number, static_cast<unsigned>(digits), false))
        return 0;
    name.remove(static_cast<unsigned>(digits) - 1);
    return number;
}

void printNumberedName(const FString& base, int number, const FString* extension, FString& result)
{
    FString ending;
    ending.printf(extension ? "-%02d." : "-%02d", number);
    result = base;
    result.append(ending);
    if (extension)
        result.append(*extension);
}
} // namespace

int FPath::getExtensionIndex(bool useFileType) const
{
    const int dot = name.findPrev(-1, kDot);
    if (dot <= 0)
        return -1;
    const unsigned begin = static_cast<unsigned>(dot) + 1;
    if (useFileType && !fileType.getExtension().isEmpty())
        return fileType.hasExtension(ConstString(name.text16() + begin)) ? dot : -1;
    return name.findNext(static_cast<int>(begin), u' ') >= 0 ? -1 : dot;
}

bool FPath::getExtension(FString& result) const
{
    result.assign(u"");
    const int dot = getExtensionIndex(false);
    if (dot < 0)
        return false;
    name.extract(result, static_cast<unsigned>(dot) + 1);
    return true;
}

void FPath::getNameWithoutExtension(FString& result, bool useFileType) const
{
    result = name;
    const int dot = getExtensionIndex(useFileType);
    if (dot >= 0)
        result.remove(static_cast<unsigned>(dot));
}

// Also of types whose extension has a dot of its own.
bool FPath::endsInTypeExtension() const
{
    for (const FString* extension : {&fileType.getDosType(), &fileType.getUnixType()})
    {
        if (extension->isEmpty() || name.length() < extension->length() + 2)
            continue;
        const unsigned begin = name.length() - extension->length();
        if (name.testChar16(begin - 1, kDot) && name.compareAt(begin, *extension, -1, kCaseInsensitive) == 0)
            return true;
    }
    return false;
}

bool FPath::updateExtension(bool replace)
{
    const FString& extension = fileType.getExtension();
    if (isFolder() || name.isEmpty() || extension.isEmpty())
        return false;
    if (endsInTypeExtension())
        return true;
    const int dot = replace ? getExtensionIndex(false) : -1;
    if (dot >= 0)
        name.remove(static_cast<unsigned>(dot));
    name.append(kDot).append(extension);
    return true;
}

void FPath::setFileType(const FFileType& newType)
{
    fileType = newType;
    updateExtension(true);
}

bool FPath::numberName(bool (*isTaken)(FPath& path, void* context), void* context)
{
    if (!isTaken(*this, context))
        return true;
    const FString former(name);
    FString extension;
    const bool hasExtension = getExtension(extension);
    FString base;
    getNameWithoutExtension(base, false);
    int number = cutNumber(base);
    if (base.isEmpty())
        base.assign(u"file");
    FString numbered;
    for (number++; number <= kLastNumber; number++)
    {
        printNumberedName(base, number, hasExtension ? &extension : nullptr, numbered);
        setName(numbered.text16());
        if (!isTaken(*this, context))
            return true;
    }
    setName(former.text16());
    return false;
}
