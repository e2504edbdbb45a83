#include "containers/typed/tarray.h"
#include "storage/path/stdfiletype.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fstream.h"

namespace
{
constexpr int kGrowStep = 10;
constexpr int kHeaderSize = 1024;

// Neither is ever freed: types are looked up until the last moment of the process.
TArray<FFileType*>* fileTypes = nullptr;
TArray<FFileType::Identifier>* fileTypeIdentifiers = nullptr;

TArray<FFileType*>& allTypes()
{
    if (!fileTypes)
    {
        fileTypes = new TArray<FFileType*>(0, kGrowStep);
        fileTypes->add(&StdFileType::getTextFileType());
    }
    return *fileTypes;
}

TArray<FFileType::Identifier>& allIdentifiers()
{
    if (!fileTypeIdentifiers)
        fileTypeIdentifiers = new TArray<FFileType::Identifier>(0, kGrowStep);
    return *fileTypeIdentifiers;
}
} // namespace

FFileType& StdFileType::getTextFileType()
{
    static FFileType* const type =
        new FFileType("text/plain", "txt", "txt", fourCharCode("TEXT"), "Text File");
    return *type;
}

void FFileType::registerType(FFileType* type)
{
    if (type && allTypes().index(type) < 0)
        allTypes().add(type);
}

void FFileType::unregisterType(FFileType* type)
{
    allTypes().remove(type);
}

void FFileType::registerTypeIdentifier(Identifier identify)
{
    if (identify)
        allIdentifiers().add(identify);
}

FFileType* FFileType::getTypeByString(const char16* extension)
{
    FFileType wanted;
    wanted.dosType.assign(extension);
    wanted.unixType.assign(extension);
    for (FFileType* type : allTypes())
        if (*type == wanted)
            return type;
    return nullptr;
}

FFileType* FFileType::getTypeByStream(FStream* stream)
{
    if (!stream)
        return nullptr;
    unsigned char header[kHeaderSize] = {};
    stream->rewind();
    const int64 length = stream->readRaw(header, kHeaderSize);
    stream->rewind();
    if (length <= 0)
        return nullptr;
    for (Identifier identify : allIdentifiers())
        if (FFileType* type = identify(header, static_cast<int>(length)))
            return type;
    return nullptr;
}
