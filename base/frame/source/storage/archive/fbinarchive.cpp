#include "storage/archive/fbinarchive.h"

#include "storage/archive/binarchivereader.h"
#include "storage/archive/binarchivewriter.h"
#include "storage/stream/fstream.h"

FBinArchive::FBinArchive(FStream* archiveStream, bool isWriting, FArchive* owningArchive)
    : FAttributeArchiveBase(archiveStream, isWriting),
      owner(owningArchive)
{
}

bool FBinArchive::save()
{
    if (!writing || !stream)
        return tell(false);
    BinArchiveWriter writer(*stream, block, text);
    return tell(writer.writeRoots(roots, globalRoots) && writer.finish());
}

bool FBinArchive::load()
{
    if (writing || !stream)
        return tell(false);
    BinArchiveReader reader(*stream, block, text);
    return tell(reader.readRoots(roots, globalRoots) && reader.finish());
}

bool FBinArchive::saveAttributes(const FAttributes& attributes)
{
    if (!writing || !stream)
        return tell(false);
    BinArchiveWriter writer(*stream, block, text);
    return tell(writer.writeTree(attributes) && writer.finish());
}

bool FBinArchive::loadAttributes(FAttributes& attributes)
{
    if (writing || !stream)
        return tell(false);
    BinArchiveReader reader(*stream, block, text);
    return tell(reader.readTree(attributes) && reader.finish());
}

bool FBinArchive::tell(bool success)
{
    if (!success && owner)
        owner->setError(FArchive::kBadObject);
    return success;
}
