#pragma once

#include "containers/keyed/cmhashtable.h"
#include "containers/value/buffer.h"
#include "storage/archive/archivedobject.h"
#include "storage/archive/binarchiveforms.h"

#include <vector>

class FStream;

/// Writes the binary archive's form. Each operation gives false at the first failure; a text that is longer than can
/// be read again is one. One thread at a time.
class BinArchiveWriter
{
public:
    /// The buffers are the caller's: one collects what goes to the stream next, one is room for a text.
    BinArchiveWriter(FStream& target, Buffer& collected, Buffer& room);

    bool writeRoots(const FStringAttributeArray& roots, const FStringAttributeArray& globalRoots);
    bool writeTree(const FAttributes& attributes);
    /// Hands the rest to the stream.
    bool finish();

private:
    bool writeGlobalRoot(const FStringIDAttribute& root);
    bool writeRoot(const FStringIDAttribute& root);
    bool writeAttributes(const FAttributes& attributes);
    bool writeEntry(FStringIDAttribute& entry);
    bool writeObjectEntry(CmObject* object);
    void writeBlock(const CmObject* object);
    bool writeObjects(const CmObject* list);
    bool writeTrees(const CmObject* list);
    void writeNumbers(const CmObject* list, ArchivedKind kind);
    void writeStrings(const CmObject* list);
    bool writeReference(CmObject* object);
    bool writeObject(CmObject* object);

    void writeKind(BinaryKind kind);
    void writeText8(const char* text);
    void writeText16(const char16* text);
    void writeStored(const char* text, uint32 length, bool isUtf8);
    template <class T>
    void writeNumber(T value);
    void writeBytes(const void* data, uint32 size);
    void flush();

    FStream& stream;
    Buffer& block;
    Buffer& text;
    bool isWhole = true;
    int nesting = 0;
    /// What was written, by identity; held to the end, so that no other object gets the address of one.
    CmHashTable seen{50};
};
