#include "storage/url/urlpathconverter.h"

#include "containers/typed/tarray.h"
#include "storage/path/fnpath.h"
#include "storage/url/furl.h"

#include <cstring>

DEFINE_CLASS(UrlPathConverter, CmObject)

namespace
{
TArray<IObjectConverter*>& allConverters()
{
    static auto* const converters = new TArray<IObjectConverter*>;
    return *converters;
}

bool isWanted(const char* className, const char* wanted)
{
    return className && strcmp(className, wanted) == 0;
}

FUnknown* urlOf(const FNPath& path)
{
    FString text;
    path.getFullPath(text);
    return static_cast<CmObject*>(new FUrl("file", "", text.text16()));
}

FUnknown* pathOf(const FUrl& url)
{
    if (!(url.getProtocol() == ConstString("file")))
        return nullptr;
    FString text(url.getFile());
    FUrl::urlDecode(text);
    return static_cast<CmObject*>(new FNPath(text.text16(), FPath::kFile));
}
} // namespace

void IObjectConverter::add(IObjectConverter* converter)
{
    if (converter && allConverters().index(converter) < 0)
        allConverters().add(converter);
}

FUnknown* IObjectConverter::convertObject(FUnknown* object, const char* className)
{
    for (IObjectConverter* converter : allConverters())
        if (converter->canConvert(object, className))
            return converter->convert(object, className);
    return nullptr;
}

UrlPathConverter* UrlPathConverter::instance()
{
    static auto* const converter = new UrlPathConverter;
    return converter;
}

bool UrlPathConverter::canConvert(FUnknown* object, const char* className)
{
    const CmObject* known = toCmObject(object);
    return (FCast(FNPath, known) && isWanted(className, "FUrl")) ||
           (FCast(FUrl, known) && isWanted(className, "FNPath"));
}

FUnknown* UrlPathConverter::convert(FUnknown* object, const char* className)
{
    if (!canConvert(object, className))
        return nullptr;
    const CmObject* known = toCmObject(object);
    if (const FNPath* path = FCast(FNPath, known))
        return urlOf(*path);
    return pathOf(*FCast(FUrl, known));
}
