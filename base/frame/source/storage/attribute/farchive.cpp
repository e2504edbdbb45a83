#include "storage/attribute/farchive.h"

#include "foundation/object/cmobject.h"
#include "storage/stream/fstream.h"

#include <algorithm>

namespace
{
using PreSaveFunctions = std::vector<void (*)()>;

PreSaveFunctions& preSaveFunctions()
{
    static PreSaveFunctions functions;
    return functions;
}
} // namespace

FArchive::FArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook)
    : stream(archiveStream),
      isWriting(writing),
      errorHook(hook)
{
}

FArchive::~FArchive() = default;

CmObject* FArchive::load(const char* className)
{
    return readObject(className, true);
}

bool FArchive::save(CmObject* object)
{
    beforeSave();
    return writeObject(object, true);
}

bool FArchive::writeCount(int count)
{
    return stream->writeInt32(count);
}

bool FArchive::readCount(int& count)
{
    if (stream->readInt32(count) && count >= 0)
        return true;
    count = 0;
    setError(kBadObject);
    return false;
}

int32 FArchive::getLastError()
{
    if (lastError != kBadStream && !stream->verify())
        setError(kBadStream);
    return lastError;
}

void FArchive::setError(int32 error)
{
    if (lastError != kBadStream)
        lastError = error;
    if (std::find(errors.begin(), errors.end(), error) == errors.end())
        errors.push_back(error);
    if (errorHook)
        errorHook->onArchiveError(*this, error);
}

void FArchive::forgetLater(CmObject* object)
{
    forgotten.push_back(adopt(object));
}

void FArchive::registerPreSaveFunction(void (*function)())
{
    preSaveFunctions().push_back(function);
}

void FArchive::beforeSave()
{
    // By index: a function may register another.
    for (size_t i = 0; i < preSaveFunctions().size(); i++)
        preSaveFunctions()[i]();
}
