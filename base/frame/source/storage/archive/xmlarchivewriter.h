#pragma once

#include "containers/keyed/cmhashtable.h"
#include "containers/value/cmbuffer.h"
#include "storage/archive/archivedobject.h"

#include <string_view>
#include <vector>

class FStream;

/// Writes one XML archive document. Each operation gives false at the first failure.
///
/// Lines are put together in a pooled buffer and end in a single CR. A text whose encoded form is longer than the
/// parser takes is a failure: the file could not be read again. One thread at a time.
class XmlArchiveWriter
{
public:
    explicit XmlArchiveWriter(FStream& target);
    XmlArchiveWriter(const XmlArchiveWriter&) = delete;
    XmlArchiveWriter& operator=(const XmlArchiveWriter&) = delete;
    ~XmlArchiveWriter();

    bool writeRoots(const char* rootTag, const FStringAttributeArray& roots,
                    const FStringAttributeArray& globalRoots);
    bool writeTree(const char* rootTag, const FAttributes& attributes);

private:
    struct Waiting
    {
        IPtr<CmObject> object;
        const char* name;
    };

    void beginDocument(const char* rootTag);
    bool finishDocument(const char* rootTag);
    bool writeGlobalRoot(const FStringIDAttribute& root);
    bool writeRoot(const FStringIDAttribute& root);
    bool writeObject(const Waiting& waiting);
    void enlist(CmObject* object, const char* name);

    bool writeAttributes(const FAttributes& attributes, int depth);
    bool writeEntry(FStringIDAttribute& entry, int depth);
    void writeString(FStringIDAttribute& entry);
    bool writeObjectEntry(const char* name, CmObject* object, int depth);
    bool writeMember(const char* name, const FAttributes& attributes, int depth);
    void writeBinary(const char* name, const CmObject* object, int depth);
    bool writeList(const char* name, const CmObject* object, ArchivedKind kind, int depth);
    bool writeItems(const CmObject* object, ArchivedKind kind, int depth);
    bool writeTrees(const CmObject* list, int depth);
    void writeReference(CmObject* object);

    void indent(int depth);
    void append(std::string_view text);
    void appendName(const char* text);
    void appendText8(const char* text);
    void appendText16(const char16* text);
    void appendEncoded(const Buffer& text);
    void appendInteger(long long value);
    void appendID(uint64 id);
    void appendFloat(double value);
    void endLine(std::string_view text);
    void line(int depth, std::string_view text);
    void flush();

    FStream& stream;
    bool isWhole = true;
    int nesting = 0;
    CmBuffer* buffer;
    uint32 filled = 0;
    Buffer encoded;
    /// What was met, by identity.
    CmHashTable seen{50};
    /// All objects met, in the order in which they are written. They are held to the end, so that no other object
    /// gets the address of one and passes for it.
    std::vector<Waiting> objects;
};
