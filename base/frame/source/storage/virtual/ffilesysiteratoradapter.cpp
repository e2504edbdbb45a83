#include "storage/virtual/ffilesysiteratoradapter.h"

#include "foundation/text/stringobject.h"

IPtr<FPath> FFileSysIteratorAdapter::current()
{
    StringObject text;
    bool isFolder = false;
    if (walk->done() || walk->current(&text, &isFolder) != kResultOk)
        return nullptr;
    return adopt(new FPath(text.getText16(), isFolder ? FPath::kFolder : FPath::kFile));
}
