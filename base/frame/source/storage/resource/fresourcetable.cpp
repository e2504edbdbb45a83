#include "storage/resource/archivename.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/stream/fcompressionengine.h"
#include "storage/stream/fmemorystream.h"

#include <cstring>

// The table of a resource file: reading and writing.

namespace
{
constexpr int64 kFirstTableSize = 4096;
constexpr const char16* kEndOfFolder = u"..";

bool closesFolder(const FResourceEntry& entry)
{
    return entry.isFolder() && entry.getName() == ConstString(kEndOfFolder);
}
} // namespace

// Reading

bool FResourceArchive::readTable(const ResourceFileEnding& ending)
{
    const IPtr<FResourceEntry> top = adopt(new FResourceEntry(u"", FResourceEntry::kFolder));
    root = top.get();
    unclaimed = contentEnd - kResourceHeaderSize;
    if (ending.tableSize == 0)
    {
        damage = ending.entryCount == 0 ? 0 : 1;
        return true;
    }
    // No more than the file has.
    FMemoryStream table;
    if (!table.setSize(ending.tableSize) || stream->seek(contentEnd, kSeekStart) != contentEnd ||
        stream->readRaw(table.getData(), ending.tableSize) != ending.tableSize)
        return false;
    if (unpackContentTable(*top, table, ending.entryCount, 0) != ending.entryCount ||
        table.tell() != table.getSize())
        damage++;
    return true;
}

uint32 FResourceArchive::unpackContentTable(FResourceEntry& parent, FStream& table, uint32 count, int depth)
{
    uint32 used = 0;
    while (used < count)
    {
        const IPtr<FResourceEntry> entry = readEntry(table);
        if (!entry)
            break;
        used++;
        if (closesFolder(*entry))
            break;
        if (!claimContent(*entry))
        {
            damage++;
            continue;
        }
        parent.appendChild(entry);
        if (!entry->isFolder())
            continue;
        if (depth == kMaxDepth)
        {
            table.seek(0, kSeekEnd);
            break;
        }
        used += unpackContentTable(*entry, table, count - used, depth + 1);
    }
    parent.sortChildren();
    return used;
}

IPtr<FResourceEntry> FResourceArchive::readEntry(FStream& table)
{
    uint32 entryFlags = 0;
    int64 offset = 0;
    int64 stored = 0;
    if (!table.readInt32u(entryFlags) || !readNumber(table, offset) || !readNumber(table, stored))
        return nullptr;
    int64 plain = stored;
    const bool isCompressed = (entryFlags & FResourceEntry::kCompressed) != 0;
    if (isCompressed && !readNumber(table, plain))
        return nullptr;
    char16 name[ArchiveName::kMaxName];
    table.readStringUtf8(name, ArchiveName::kMaxName);
    IPtr<FResourceEntry> entry = adopt(new FResourceEntry(name, entryFlags));
    entry->setDataOffset(offset);
    if (isCompressed)
        entry->setCompressed(stored, plain);
    else
        entry->setPlain(stored);
    return entry;
}

bool FResourceArchive::readNumber(FStream& table, int64& number) const
{
    if (formatVersion >= kWideVersion)
        return table.readInt64(number);
    uint32 narrow = 0;
    const bool isRead = table.readInt32u(narrow);
    number = narrow;
    return isRead;
}

bool FResourceArchive::claimContent(const FResourceEntry& entry)
{
    if (!isPlausible(entry))
        return false;
    if (entry.isFolder())
        return true;
    // Without this, a small file could name the same bytes again and again and be extracted without end.
    if (entry.getDataSize() > unclaimed)
        return false;
    unclaimed -= entry.getDataSize();
    return true;
}

bool FResourceArchive::isPlausible(const FResourceEntry& entry) const
{
    if (entry.isFolder())
        return true;
    const int64 offset = entry.getDataOffset();
    const int64 size = entry.getDataSize();
    if (size < 0 ||
        (size > 0 && (offset < kResourceHeaderSize || offset > contentEnd || size > contentEnd - offset)))
        return false;
    if (!entry.isCompressed())
        return true;
    return engine && size > 0 && entry.getFileSize() >= 0 &&
           entry.getFileSize() <= engine->getMaxUncompressedSize(size);
}

// Writing

int FResourceArchive::chooseVersion() const
{
    if (gFormatVersion > kWideVersion)
        return gFormatVersion;
    constexpr int64 kMaxNarrow = 0xFFFFFFFF;
    return engine || findEndOfDataSection() > kMaxNarrow ? kWideVersion : kFirstVersion;
}

bool FResourceArchive::writeContent()
{
    formatVersion = chooseVersion();
    contentEnd = findEndOfDataSection();
    const IPtr<FMemoryStream> table = adopt(new FMemoryStream);
    table->setSize(kFirstTableSize);
    table->reset();
    ResourceFileEnding ending;
    ending.entryCount = packContentTable(*table, *root);
    constexpr int64 kMaxTable = 0xFFFFFFFF;
    if (table->tell() > kMaxTable)
        return false;
    fillId(ending);
    ending.tableSize = static_cast<uint32>(table->tell());
    ending.endingSize = static_cast<uint32>(getVersionSize(formatVersion));
    ending.magic = getVersionMagic(formatVersion);
    const int64 size = ending.tableSize + int64{ending.endingSize};
    if (!ending.write(*table, formatVersion) || !table->verify() ||
        stream->seek(contentEnd, kSeekStart) != contentEnd ||
        stream->writeRaw(table->getData(), size) != size)
        return false;
    // Content that was first written compressed may have reached beyond the end.
    const IPtr<ISizeableStream> file =
        adopt(askInterface<ISizeableStream>(static_cast<IBStream*>(stream.get())));
    return !file || file->setStreamSize(contentEnd + size) == kResultOk;
}

uint32 FResourceArchive::packContentTable(FStream& table, const FFileArchiveNode& folder) const
{
    uint32 count = 0;
    for (const IPtr<FFileArchiveNode>& child : folder.getChildren())
    {
        const auto& entry = static_cast<const FResourceEntry&>(*child);
        writeEntry(table, entry);
        count++;
        if (!entry.isFolder())
            continue;
        count += packContentTable(table, entry);
        writeEntry(table, FResourceEntry(kEndOfFolder, FResourceEntry::kFolder));
        count++;
    }
    return count;
}

// The table is in memory, which tells at the end whether all went well.
void FResourceArchive::writeEntry(FStream& table, const FResourceEntry& entry) const
{
    table.writeInt32u(entry.getFlags() | FResourceEntry::kUtf8Name);
    writeNumber(table, entry.getDataOffset());
    writeNumber(table, entry.getDataSize());
    if (entry.isCompressed())
        writeNumber(table, entry.getFileSize());
    table.writeStringUtf8(entry.getName().text16());
}

void FResourceArchive::writeNumber(FStream& table, int64 number) const
{
    if (formatVersion >= kWideVersion)
        table.writeInt64(number);
    else
        table.writeInt32u(static_cast<uint32>(number));
}

void FResourceArchive::fillId(ResourceFileEnding& ending) const
{
    if (!engine)
        return;
    FUID format;
    engine->getFormat(format);
    char text[ResourceFileEnding::kIdSize + 1];
    format.toString(text);
    memcpy(ending.compressionId, text, ResourceFileEnding::kIdSize);
}
