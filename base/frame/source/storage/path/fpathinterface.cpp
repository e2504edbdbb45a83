#include "storage/path/fpath.h"

// A path as other components see it.

namespace
{
int32 handOut(const FString& text, char16* buffer)
{
    if (!buffer)
        return kPathInvalidArgument;
    buffer[0] = 0;
    if (text.length() >= static_cast<unsigned>(kPathBufferSize))
        return kPathFailed;
    FString wide(text);
    wide.toWideString();
    wide.copyTo16(buffer);
    return kPathOk;
}

int32 resultOf(bool success)
{
    return success ? kPathOk : kPathFailed;
}
} // namespace

int32 FPath::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IPath::iid))
        return offerInterface<IPath>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

int32 FPath::setFullPath(const char16* text, int newType)
{
    return text ? resultOf(fromString(text, newType)) : kPathInvalidArgument;
}

int32 FPath::setFileName(const char16* text)
{
    if (!text)
        return kPathInvalidArgument;
    setName(text);
    return kPathOk;
}

int32 FPath::getType(int* result)
{
    if (!result)
        return kPathInvalidArgument;
    *result = type;
    return kPathOk;
}

int32 FPath::goDown(const char16* childName, int childType)
{
    return childName ? resultOf(descend(childName, childType)) : kPathInvalidArgument;
}

int32 FPath::goUp()
{
    return resultOf(ascend());
}

int32 FPath::getFullPath(char16* buffer)
{
    FString text;
    getFullPath(text);
    return handOut(text, buffer);
}

int32 FPath::getFileName(char16* buffer)
{
    return handOut(getName(), buffer);
}

int32 FPath::getPathName(char16* buffer)
{
    return handOut(path, buffer);
}

int32 FPath::getFileExtension(char16* buffer)
{
    FString extension;
    const bool hasExtension = getExtension(extension);
    const int32 result = handOut(extension, buffer);
    return hasExtension ? result : buffer ? kPathFailed : kPathInvalidArgument;
}

int32 FPath::getNameWithoutExt(char16* buffer)
{
    FString text;
    getNameWithoutExtension(text, false);
    return handOut(text, buffer);
}

int32 FPath::getFileType(FFileTypeInfo* info)
{
    if (!info)
        return kPathInvalidArgument;
    fromFrameworkFileType(getFileType(), *info);
    return kPathOk;
}

int32 FPath::setFileType(FFileTypeInfo* info)
{
    if (!info)
        return kPathInvalidArgument;
    FFileType newType;
    toFrameworkFileType(*info, newType);
    setFileType(newType);
    return kPathOk;
}

int32 FPath::updateFileExtension()
{
    return resultOf(updateExtension(true));
}

int32 FPath::newCopy(IPath** copy)
{
    if (!copy)
        return kPathInvalidArgument;
    *copy = FCast(FPath, newCopy());
    return resultOf(*copy != nullptr);
}
