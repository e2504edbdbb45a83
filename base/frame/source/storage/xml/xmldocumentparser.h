#pragma once

#include "storage/xml/fxmlparser2.h"
#include "storage/xml/xmlelement.h"
#include "storage/xml/xmlhandler.h"

namespace Xml
{
/// Builds the tree of a document from the calls of a parser.
///
/// The first element is the root; once it has ended, all further calls are ignored. One thread at a time.
class DocumentParser : public XmlHandler
{
    DECLARE_TYPE(DocumentParser, XmlHandler)

    DocumentParser();
    ~DocumentParser() override;

    /// Reads one document. False where it isn't well-formed or its tree would pass `maxTreeBytes`.
    bool parse(IBStream* stream, int64 maxTreeBytes);
    /// The root that was read, whole or in part; null where there was none. Borrowed.
    Node* getRoot() const { return root; }

    void startTag(INewXmlParser* from, const char* name, const char** attributes) override;
    void endTag(INewXmlParser* from, const char* name) override;
    void charData(INewXmlParser* from, const char* data, int length) override;
    void comment(INewXmlParser* from, const char* text) override;

private:
    /// Stops the parser once the tree is too large.
    void charge(INewXmlParser* from, size_t bytes);

    IPtr<FXmlParser2> parser;
    IPtr<Node> root;
    Element* current = nullptr;
    bool finished = false;
    int64 bytesLeft = 0;
};
} // namespace Xml
