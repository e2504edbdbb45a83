#pragma once

#include "storage/attribute/fxmllinker.h"
#include "storage/xml/fxmlparser.h"

#include <string>
#include <vector>

class FAttrList;
class FMemoryStream;

/// Reads an XML archive document into trees and placeholders. It takes what the archive writes; any other tag, a tag
/// in the wrong place and a missing or unreadable attribute end the reading. One thread at a time.
class FXmlArchiveParser : public FXmlParser
{
public:
    /// For a document of roots, which go into the lists.
    FXmlArchiveParser(FStream* source, const char* wantedRootTag, FStringAttributeArray& localRoots,
                      FStringAttributeArray& otherRoots);
    /// For a document of one tree.
    FXmlArchiveParser(FStream* source, const char* wantedRootTag, FAttributes& tree);
    ~FXmlArchiveParser() override;

    /// Reads the document and joins references and objects. False leaves what was read until the error.
    bool read();

    bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data) override;
    bool endTag(const char* name, void* data) override;
    void gotData(void* bytes, unsigned int count, void* data) override;

private:
    enum class Place
    {
        kDocument,
        kRootTag,
        kRootObjects,
        kTree,
        kList,
        kBinary,
        kValue
    };
    /// What an open tag is, and where that which it contains goes. Held by the target or the linker.
    struct Open
    {
        Place place;
        FAttributes* tree = nullptr;
        FAttrList* list = nullptr;
        FMemoryStream* block = nullptr;
        FXmlInstance* holder = nullptr;
    };
    struct Handler;

    static const Handler* findHandler(const char* name);

    bool startRootTag(CmContainer& attributes);
    bool startRootObjects(CmContainer& attributes);
    bool startRoot(CmContainer& attributes);
    bool startObject(CmContainer& attributes);
    bool startInstance(CmContainer& attributes, const char* className);
    bool startReference(CmContainer& attributes);
    bool startInt(CmContainer& attributes);
    bool startFloat(CmContainer& attributes);
    bool startString(CmContainer& attributes);
    bool startMember(CmContainer& attributes);
    bool startBinary(CmContainer& attributes);
    bool startList(CmContainer& attributes);
    bool startItem(CmContainer& attributes);
    bool addItem(FAttrList& list, CmContainer& attributes);
    bool openTree(FAttributes* tree, FXmlInstance* holder);
    FXmlReference* makeReference(uint64 id, FXmlInstance* holder);
    void close();

    std::string rootTag;
    FStringAttributeArray* roots = nullptr;
    FStringAttributeArray* globalRoots = nullptr;
    FAttributes* target = nullptr;
    FXmlLinker linker;
    std::vector<Open> open;
    /// The tag whose start is being handled.
    Open opened{Place::kValue};
    int nesting = 0;
    bool isRootClosed = false;
    /// The first digit of a byte whose second is still to come; -1 for none.
    int pendingDigit = -1;
};
