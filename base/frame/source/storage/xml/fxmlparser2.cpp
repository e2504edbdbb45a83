#include "storage/xml/fxmlparser2.h"

#include "foundation/object/istring.h"
#include "storage/stream/ibstream.h"

#include <cstdio>
#include <cstring>
#include <expat.h>

DEFINE_INTERFACE_ID(INewXmlParser, 0x2C8F05B7, 0x4E714A1D, 0x9D36F0A8, 0x51C2E74B)

namespace
{
constexpr int kBlockSize = 32768;
/// The error codes that have a text for the user.
constexpr int kLastToldError = 40;
} // namespace

/// What expat calls.
struct FXmlParser2::Callbacks
{
    static FXmlParser2& parserOf(void* userData) { return *static_cast<FXmlParser2*>(userData); }

    static void XMLCALL startElement(void* userData, const char* name, const char** attributes)
    {
        FXmlParser2& self = parserOf(userData);
        self.begun = true;
        self.countAdded(attributes);
        if (++self.depth > kMaxDepth || self.bytesAdded > kMaxAddedBytes)
            return self.stop();
        if (self.handler)
            self.handler->startTag(&self, name, attributes);
    }
    static void XMLCALL endElement(void* userData, const char* name)
    {
        FXmlParser2& self = parserOf(userData);
        self.depth--;
        if (self.handler)
            self.handler->endTag(&self, name);
    }
    static void XMLCALL characterData(void* userData, const char* data, int length)
    {
        FXmlParser2& self = parserOf(userData);
        if (self.handler)
            self.handler->charData(&self, data, length);
    }
    static void XMLCALL comment(void* userData, const char* text)
    {
        FXmlParser2& self = parserOf(userData);
        if (self.handler)
            self.handler->comment(&self, text);
    }
};

FXmlParser2::FXmlParser2(INewXmlHandler* newHandler, const char* encoding)
    : parser(makeParser(encoding)),
      handler(newHandler)
{
    install();
}

FXmlParser2::~FXmlParser2()
{
    if (parser)
        XML_ParserFree(parser);
}

int32 FXmlParser2::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, INewXmlParser::iid))
        return offerInterface<INewXmlParser>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

XML_ParserStruct* FXmlParser2::makeParser(const char* encoding)
{
    static constexpr XML_Memory_Handling_Suite functions = {
        &XmlParserMemory::allocate, &XmlParserMemory::resize, &XmlParserMemory::release};
    const XmlParserMemory::Scope scope(memory);
    return XML_ParserCreate_MM(encoding, &functions, nullptr);
}

void FXmlParser2::install()
{
    if (!parser)
        return;
    XML_SetUserData(parser, this);
    XML_SetElementHandler(parser, Callbacks::startElement, Callbacks::endElement);
    XML_SetCharacterDataHandler(parser, Callbacks::characterData);
    XML_SetCommentHandler(parser, Callbacks::comment);
}

void FXmlParser2::setHandler(INewXmlHandler* newHandler)
{
    handler = newHandler;
}

bool FXmlParser2::process(IBStream* stream)
{
    if (!parser || !stream || refused)
        return false;
    if (documentStart < 0 && (stream->tell(&documentStart) != kResultOk || documentStart < 0))
        documentStart = 0;
    const XmlParserMemory::Scope scope(memory);
    Outcome outcome = Outcome::kMore;
    while (outcome == Outcome::kMore)
        outcome = parseBlock(*stream);
    return outcome == Outcome::kDone;
}

FXmlParser2::Outcome FXmlParser2::parseBlock(IBStream& stream)
{
    void* block = XML_GetBuffer(parser, kBlockSize);
    if (!block)
        return Outcome::kFailed;
    int count = 0;
    if (stream.read(block, kBlockSize, &count) != kResultOk || count < 0)
        count = 0;
    bytesFed += count;
    const Outcome outcome = judge(XML_ParseBuffer(parser, count, count == 0), stream);
    if (outcome != Outcome::kMore)
        return outcome;
    refused = isTooLong();
    if (refused)
        return Outcome::kFailed;
    return count == 0 ? Outcome::kDone : Outcome::kMore;
}

FXmlParser2::Outcome FXmlParser2::judge(int status, IBStream& stream)
{
    if (status == XML_STATUS_SUSPENDED)
        return Outcome::kDone;
    if (status == XML_STATUS_OK)
        return Outcome::kMore;
    if (XML_GetErrorCode(parser) != XML_ERROR_JUNK_AFTER_DOC_ELEMENT)
        return Outcome::kFailed;
    // Another document follows, or whatever the caller finds there.
    stream.seek(documentStart + XML_GetCurrentByteIndex(parser), 0, nullptr);
    return Outcome::kDone;
}

// While a token is incomplete expat may put off looking at it, and then tells no place: it is where it was.
bool FXmlParser2::isTooLong()
{
    const int64 place = XML_GetCurrentByteIndex(parser);
    if (place >= 0)
        tokenStart = place;
    return bytesFed - tokenStart > kMaxTokenBytes || (!begun && bytesFed > kMaxPrologBytes);
}

// Attributes that an element doesn't have itself but by declaration stand behind its own.
void FXmlParser2::countAdded(const char** attributes)
{
    constexpr size_t kEachCosts = 64;
    for (const char** added = attributes + XML_GetSpecifiedAttributeCount(parser); *added; added += 2)
        bytesAdded += static_cast<int64>(strlen(added[0]) + strlen(added[1]) + kEachCosts);
}

void FXmlParser2::stop()
{
    if (parser)
        XML_StopParser(parser, XML_FALSE);
}

void FXmlParser2::suspend()
{
    if (parser)
        XML_StopParser(parser, XML_TRUE);
}

bool FXmlParser2::resume(IBStream* stream)
{
    if (!parser || !stream || refused)
        return false;
    const XmlParserMemory::Scope scope(memory);
    const Outcome outcome = judge(XML_ResumeParser(parser), *stream);
    if (outcome != Outcome::kMore)
        return outcome == Outcome::kDone;
    XML_ParsingStatus status;
    XML_GetParsingStatus(parser, &status);
    return status.parsing == XML_FINISHED || process(stream);
}

bool FXmlParser2::reset(const char* encoding)
{
    const XmlParserMemory::Scope scope(memory);
    if (!parser || !XML_ParserReset(parser, encoding))
        return false;
    install();
    documentStart = -1;
    bytesFed = 0;
    bytesAdded = 0;
    tokenStart = 0;
    depth = 0;
    begun = false;
    refused = false;
    return true;
}

bool FXmlParser2::setEncoding(const char* encoding)
{
    const XmlParserMemory::Scope scope(memory);
    return parser && XML_SetEncoding(parser, encoding) == XML_STATUS_OK;
}

int FXmlParser2::errorCode() const
{
    if (!parser)
        return XML_ERROR_NO_MEMORY;
    return refused ? XML_ERROR_ABORTED : XML_GetErrorCode(parser);
}

bool FXmlParser2::getErrorContext(IStringResult& text)
{
    const int code = errorCode();
    if (code < 1 || code > kLastToldError)
        return false;
    char message[256];
    snprintf(message, sizeof(message), "Xml Error: %s \r\nLine: %lld",
             XML_ErrorString(static_cast<XML_Error>(code)), static_cast<long long>(getCurrentLineNumber()));
    text.setText(message);
    return true;
}

int64 FXmlParser2::getCurrentLineNumber()
{
    if (!parser)
        return 0;
    const auto line = static_cast<int64>(XML_GetCurrentLineNumber(parser));
    return errorCode() == XML_ERROR_ABORTED ? line - 1 : line;
}
