#pragma once

#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"
#include "storage/xml/inewxmlhandler.h"
#include "storage/xml/inewxmlparser.h"

struct XML_ParserStruct;

/// The newer parser: reads a stream in blocks and tells its handler of elements, text and comments.
///
/// Refused, like a document that a handler stopped, is one that is nested deeper than `kMaxDepth`, that has more than
/// `kMaxPrologBytes` of declarations in front of its root, or one tag, comment or the like longer than
/// `kMaxTokenBytes`: no input may take memory or time out of all proportion. One thread at a time.
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

private:
    struct Callbacks;

    enum class Outcome
    {
        kMore,
        kDone,
        kFailed
    };

    void install();
    Outcome parseBlock(IBStream& stream);
    Outcome judge(int status, IBStream& stream);
    bool isTooLong();
    int errorCode() const;

    XML_ParserStruct* parser;
    IPtr<INewXmlHandler> handler;
    /// Where in the stream the document begins; -1 before it has begun.
    int64 documentStart = -1;
    int64 bytesFed = 0;
    int64 tokenStart = 0;
    int depth = 0;
    /// Whether the root has begun.
    bool begun = false;
    bool refused = false;
};
