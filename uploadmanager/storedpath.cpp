#include "uploadmanager/storedpath.h"

#include "storage/attribute/fattributes.h"
#include "storage/path/filenametext.h"
#include "uploadmanager/wiretext.h"

void storePath(FAttributes& attributes, const char* key, const FString& fullPath)
{
    const std::string bytes = FileNameText::toBytes(fullPath);
    const bool isText = bytes == toWireText(fullPath).text8();
    if (isText)
        attributes.set(key, fullPath, true);
    else
        attributes.setString8(key, bytes.c_str());
}

IPtr<FNPath> restorePath(const FAttributes& attributes, const char* key)
{
    FString text;
    attributes.get(key, text);
    if (text.isWideString())
        return adopt(new FNPath(text.text16(), FPath::kFile));
    IPtr<FNPath> path = adopt(new FNPath(FPath::kFile));
    path->fromPlatformPath(text.text8());
    return path;
}
