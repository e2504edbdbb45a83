#include "uploadmanager/wiretext.h"

#include "storage/filesystem/diskname.h"
#include "storage/path/fnpath.h"

FString toWireText(const ConstString& text)
{
    FString result(text);
    result.toMultiByte(kEncodingUtf8);
    return result;
}

FString toWirePath(const FNPath& path)
{
    return FString(DiskName::find(path).c_str());
}

FString getPathText(const FPath* path)
{
    FString text;
    if (path)
        path->getFullPath(text);
    return text;
}
