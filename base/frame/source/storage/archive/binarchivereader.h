#pragma once

#include "containers/value/buffer.h"
#include "storage/archive/binarchiveforms.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fxmllinker.h"

#include <string>

class FAttrList;
class FObjectList;
class FStream;
class FStringList;
class FSubList;

/// Reads the binary archive's form into trees and placeholders. Each operation gives false at the first failure.
///
/// No number of the stream is trusted: memory grows only with the bytes that really come, and nesting has a limit.
/// One thread at a time.
class BinArchiveReader
{
public:
    /// The buffers are the caller's: one holds what was read ahead, one is room for a text.
    BinArchiveReader(FStream& source, Buffer& readAhead, Buffer& room);

    bool readRoots(FStringAttributeArray& roots, FStringAttributeArray& globalRoots);
    bool readTree(FAttributes& attributes) { return readAttributes(attributes, nullptr); }
    /// Joins references and objects and leaves the stream behind the last byte used.
    bool finish();

private:
    // `holder` is the object in whose tree things stand; null outside of all.
    bool readGlobalRoot(FStringAttributeArray& globalRoots);
    bool readRoot(FStringAttributeArray& roots);
    bool readInstance(uint64& id);
    bool readAttributes(FAttributes& attributes, FXmlInstance* holder);
    bool readEntries(FAttributes& attributes, FXmlInstance* holder);
    bool readEntry(FAttributes& attributes, FXmlInstance* holder);
    bool readText(FAttributeValue& value, unsigned type);
    bool readObjectEntry(FAttributeValue& value, unsigned type, FXmlInstance* holder);
    bool readBlock(FAttributeValue& value);
    template <class List, class Stored, class Value>
    bool readNumbers(FAttributeValue& value);
    bool readStrings(FAttributeValue& value);
    bool readTrees(FAttributeValue& value, FXmlInstance* holder);
    bool readObjects(FAttributeValue& value, FXmlInstance* holder);
    IPtr<FXmlReference> readReference(BinaryKind kind, FXmlInstance* holder);
    IPtr<FXmlReference> makeReference(uint64 id, FXmlInstance* holder);

    bool readStored(uint32& length, bool& isUtf8);
    bool readKey();
    bool readClassName(std::string& name);
    bool readCount(int32& count);
    template <class T>
    bool readNumber(T& value);
    bool readBytes(void* data, uint32 size);
    bool refill(uint32 wanted);
    uint32 available() const { return block.getFillSize() - used; }

    FStream& stream;
    Buffer& block;
    Buffer& text;
    /// Where the stream can't go back, nothing is read ahead.
    const bool canReadAhead;
    uint32 used = 0;
    int nesting = 0;
    std::string key;
    FXmlLinker linker;
};
