#include "storage/virtual/ffileiteratorurlwrapper.h"

#include "storage/url/furl.h"
#include "storage/virtual/innerpath.h"

FFileIteratorUrlWrapper::FFileIteratorUrlWrapper(FFileIterator* inner, const FUrl& base)
    : FFileIterator(nullptr),
      walk(adopt(inner)),
      protocol(base.getProtocol()),
      host(base.getHost())
{
}

IPtr<FPath> FFileIteratorUrlWrapper::current()
{
    const IPtr<FPath> path = walk->current();
    if (!path)
        return nullptr;
    FString file = InnerPath::textOf(*path);
    if (file.testChar16(0, PATH_DELIMITER))
        file.remove(0, 1);
    const IPtr<FUrl> url = adopt(new FUrl(protocol.text8(), host.text8(), u""));
    url->setFile(file.text16(), true);
    url->setPathType(path->getPathType());
    return url;
}
