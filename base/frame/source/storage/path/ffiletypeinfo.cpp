#include "storage/path/ffiletypeinfo.h"

#include <cstring>

namespace
{
void copyText(char (&target)[FFileTypeInfo::kTextSize], const char* text)
{
    memset(target, 0, sizeof(target));
    if (text)
        memcpy(target, text, strnlen(text, sizeof(target) - 1));
}
} // namespace

void FFileTypeInfo::set(int newMacType, const char* newExtension, const char* newName)
{
    macType = newMacType;
    copyText(extension, newExtension);
    copyText(name, newName);
}
