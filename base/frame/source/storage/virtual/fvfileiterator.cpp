#include "storage/virtual/fvfileiterator.h"

FVFileIterator::FVFileIterator(FVFileSystem* mounted, FFileIterator* targetWalk)
    : FFileIterator(nullptr),
      files(mounted),
      walk(adopt(targetWalk))
{
}

IPtr<FPath> FVFileIterator::current()
{
    const IPtr<FPath> inner = walk->current();
    return inner ? files->reverseTranslate(inner) : nullptr;
}
