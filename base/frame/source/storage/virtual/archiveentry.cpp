#include "storage/virtual/archiveentry.h"

#include "foundation/object/stringhash.h"

FString ArchiveEntry::keyOf(const FString& text)
{
    FString key(text);
    key.toWideString();
    key.toUpper();
    return key;
}

unsigned ArchiveEntry::hashKey(const FString& wideText, unsigned size)
{
    return hashString16(wideText.text16(), size);
}

ArchiveEntry* ArchiveEntry::create(FFileSystem* files, const FString& entryName, const FString& entryKey)
{
    if (!files || entryName.isEmpty() || entryKey.isEmpty())
        return nullptr;
    IPtr<ArchiveEntry> entry = adopt(new ArchiveEntry);
    entry->key = keyOf(entryKey);
    if (entry->key.isEmpty())
        return nullptr;
    entry->name = entryName;
    entry->fileSystem = files;
    return entry.take();
}
