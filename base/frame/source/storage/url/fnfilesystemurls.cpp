#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fstream.h"
#include "storage/url/furl.h"
#include "storage/url/furlhandler.h"
#include "storage/url/urlpathconverter.h"

// Where the file system meets URLs.

IPtr<FNPath> FNFileSystem::getNativePathFromPath(FPath* path)
{
    if (FNPath* native = FCast(FNPath, path))
        return native;
    if (!FCast(FUrl, path))
        return nullptr;
    const IPtr<FUnknown> converted =
        adopt(UrlPathConverter::instance()->convert(static_cast<CmObject*>(path), "FNPath"));
    return FCast(FNPath, toCmObject(converted));
}

FStream* FNFileSystem::openUrl(FPath* path)
{
    FUrl* url = FCast(FUrl, path);
    if (!url || !url->makeHandler() || !url->getHandler()->open())
        return nullptr;
    FStream* stream = url->getHandler()->getStream();
    if (stream)
        stream->addRef();
    return stream;
}

bool FNFileSystem::closeUrlStream(FStream* stream)
{
    const IPtr<IUrlStream> urlStream = adopt(askInterface<IUrlStream>(static_cast<CmObject*>(stream)));
    FUrl* url = urlStream ? urlStream->getUrl() : nullptr;
    return !url || !url->getHandler() || url->getHandler()->close();
}

bool FNFileSystem::pathFromURL(const char16* url, FNPath& result)
{
    FUrl parsed(url);
    const IPtr<FNPath> native = getNativePathFromPath(&parsed);
    if (!native)
        return false;
    result = *native;
    return true;
}
