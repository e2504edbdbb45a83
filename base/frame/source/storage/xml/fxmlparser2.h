#pragma once

#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"
#include "storage/xml/inewxmlhandler.h"
#include "storage/xml/inewxmlparser.h"
#include "storage/xml/xmlparsermemory.h"

struct XML_ParserStruct;

/// The newer parser: reads a stream in blocks and tells its handler of elements, text and comments.
///
/// Refused, like a document that a handler stopped, is one that is nested deeper than `kMaxDepth`, that has more than
/// `kMaxPrologBytes` of declarations in front of its root, or one tag, comment or the like longer than
/// `kMaxTokenBytes`: no input may take memory or time out of all proportion. One whose names take more than
/// `kMaxKeptBytes` ends with the error that memory ran out. Declarations add no more than `kMaxAddedBytes` of attributes to
/// the elements, and entities can't blow a document up to many times its size. One thread at a time.
class FXmlParser2 : public FObject, public INewXmlParser
{
    DECLARE_TYPE(FXmlParser2, FObject)
    FORWARD_FUNKNOWN(FObject)

    /// A null `encoding` believes the document.
    explicit FXmlParser2(INewXmlHandler* handler = nullptr, const char* encoding = nullptr);
    FXmlParser2(const FXmlParser2&) = delete;
    ~FXmlParser2() override;

    int32 queryInterface(const char* interfaceID, void** object) override;

    void setHandler(INewXmlHandler* newHandler) override;
    bool process(IBStream* stream) override;
    void stop() override;
    void suspend() override;
    bool resume(IBStream* stream) override;
    bool reset(const char* encoding) override;
    bool setEncoding(const char* encoding) override;
    bool getErrorContext(IStringResult& text) override;
    int64 getCurrentLineNumber() override;

    static constexpr int kMaxDepth = 5000;
    static constexpr int64 kMaxTokenBytes = 1 << 20;
    static constexpr int64 kMaxPrologBytes = 1 << 20;
    static constexpr size_t kMaxKeptBytes = 64 << 20;
    static constexpr int64 kMaxAddedBytes = 4 << 20;

private:
    struct Callbacks;

    enum class Outcome
    {
        kMore,
        kDone,
        kFailed
    };

    XML_ParserStruct* makeParser(const char* encoding);
    void install();
    Outcome parseBlock(IBStream& stream);
    Outcome judge(int status, IBStream& stream);
    bool isTooLong();
    void countAdded(const char** attributes);
    int errorCode() const;

    XmlParserMemory memory{kMaxKeptBytes};
    XML_ParserStruct* parser;
    IPtr<INewXmlHandler> handler;
    /// Where in the stream the document begins; -1 before it has begun.
    int64 documentStart = -1;
    int64 bytesFed = 0;
    int64 tokenStart = 0;
    int64 bytesAdded = 0;
    int depth = 0;
    /// Whether the root has begun.
    bool begun = false;
    bool refused = false;
};
