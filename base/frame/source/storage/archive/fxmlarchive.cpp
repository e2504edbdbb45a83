#include "storage/archive/fxmlarchive.h"

#include "containers/value/cmbufferpool.h"
#include "storage/archive/fxmlarchiveparser.h"
#include "storage/archive/xmlarchivewriter.h"
#include "storage/stream/fstream.h"

CmBufferPool& gXmlArchiveBuffers()
{
    static CmBufferPool pool;
    return pool;
}

bool FXmlArchive::save(const char* rootTag)
{
    return writing && stream && XmlArchiveWriter(*stream).writeRoots(rootTag, roots, globalRoots);
}

bool FXmlArchive::saveAttributes(const char* rootTag, const FAttributes& attributes)
{
    return writing && stream && XmlArchiveWriter(*stream).writeTree(rootTag, attributes);
}

bool FXmlArchive::load(const char* rootTag, const char*, bool windowsEntities)
{
    if (writing || !stream)
        return false;
    FXmlArchiveParser parser(stream, rootTag, roots, globalRoots);
    if (windowsEntities)
        parser.setFlags(parser.getFlags() | FXmlParser::kWindowsEntities);
    return parser.read();
}

bool FXmlArchive::loadAttributes(const char* rootTag, FAttributes& attributes)
{
    return !writing && stream && FXmlArchiveParser(stream, rootTag, attributes).read();
}

bool FXmlArchive::restoreObject(FStream* stream, const char* rootTag, CmObject* object)
{
    FXmlArchive archive(stream, false);
    if (!object || !archive.load(rootTag))
        return false;
    auto* tree = FCast(FAttributes, archive.getRoot(rootTag, "FAttributes"));
    return tree && object->restoreAttributes(*tree);
}
