#include "storage/filesystem/ffileiterator.h"

FFileIterator::FFileIterator(IFileIteratorImpl* implementation) : target(implementation) {}

FFileIterator::~FFileIterator()
{
    delete target;
}

void FFileIterator::first()
{
    if (target)
        target->first();
}

void FFileIterator::next()
{
    if (target)
        target->next();
}

bool FFileIterator::done()
{
    return !target || target->done();
}

IPtr<FPath> FFileIterator::current()
{
    return target ? target->current() : nullptr;
}
