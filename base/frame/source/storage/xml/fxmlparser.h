#pragma once

#include "containers/sequence/cmstack.h"
#include "containers/value/cmbuffer.h"
#include "foundation/object/iptr.h"
#include "storage/xml/fxmlattributelist.h"

#include <string_view>
#include <utility>

class CmString;
class FStream;
class FString;

/// The older parser: a tokenizer over 8-bit text that calls virtual handlers and checks only that tags nest.
///
/// A handler may call `process` or `skip` itself, which then reads exactly the element whose start tag it was told
/// of. The text may lack a root: it is a sequence of elements. It stops at the first error; nesting beyond
/// `kMaxDepth` is one. One thread at a time.
class FXmlParser
{
public:
    /// Bits of `setFlags`.
    enum Flags : uint32
    {
        kReportComments = 1,
        /// A backslash in an attribute value protects the next quote character.
        kBackslashProtects = 2,
        /// A comment mark inside a comment sends the text so far to `gotComment`, instead of counting as nested.
        kSplitComments = 4,
        /// Tabs and blanks between tokens belong to the data.
        kKeepSpaces = 8,
        kStopAfterMainTag = 16,
        /// A value in which entities gave a byte of 0x80 or more comes in 16 bits.
        kWidenValues = 32,
        kWindowsEntities = 64
    };

    /// What `getNextToken` gives.
    enum Token
    {
        kEndOfData = 0,
        kMalformed = 1,
        kStartTag = 2,
        kEndTag = 3,
        kEmptyTagEnd = 4,
        kAttribute = 5,
        kTagEnd = 6,
        kData = 7,
        kLineEnd = 8,
        kSpace = 9,
        kInstruction = 10,
        kInstructionEnd = 11,
        kComment = 12,
        kCData = 14,
        kDocType = 16
    };

    enum Error
    {
        kNoError = 0,
        kErrorMalformed = 1,
        kErrorUnexpectedTag = 2,
        kErrorUnexpectedEnd = 3,
        kErrorMissingAttributes = 4,
        kErrorOtherTagExpected = 5
    };

    /// Takes a reference on the stream. Without `bufferIt` nothing is read ahead, so that whoever stops finds the
    /// stream right behind the last byte used.
    FXmlParser(FStream* stream, bool bufferIt);
    FXmlParser(const FXmlParser&) = delete;
    FXmlParser& operator=(const FXmlParser&) = delete;
    virtual ~FXmlParser();

    // What was read, told to the derived class, in slot order. `data` is the argument of `process`. A false result
    // ends the parsing with `kErrorUnexpectedTag`, unless the handler set another error.
    /// `attributes` holds FXmlAttribute objects, the parser's own: copy what is to be kept.
    virtual bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data);
    /// Not called for an empty element.
    virtual bool endTag(const char* name, void* data);
    /// One piece of text, not terminated; a count of 0 ends the text.
    virtual void gotData(void* bytes, unsigned int count, void* data);
    virtual void gotComment(const char* text, void* data, bool endOfComment);

    /// Reads to the end of the data or, called by a handler, to the end of its element. True where no error is
    /// pending.
    bool process(void* data);
    /// As `process`, calling no handler.
    bool skip();
    /// Ends `process` behind the present token; this is no error.
    void stop() { stopRequested = true; }

    uint32 getFlags() const { return flags; }
    void setFlags(uint32 bits) { flags = bits; }
    /// 0 or, after an instruction that says so, 65001 for UTF-8.
    uint32 getCodePage() const { return codePage; }
    /// Counted from 1.
    int32 getLine() const { return line; }
    int32 getError() const { return error; }
    /// "" for `kNoError`.
    const char16* errorMessage() const;
    /// Tells the line.
    void getErrorContext(FString& text) const;
    /// The name of the innermost open element; null outside of all. Borrowed, until the element ends.
    const char* getCurrentStartTag() const;

    // The input, for handlers that read on their own.
    FStream* getStream() const { return stream; }
    /// Begins with another stream: what was read ahead, the open tags, the line and the error are forgotten.
    void setStream(FStream* newStream);
    /// The position in the stream of the next byte to be handed out.
    int64 getStreamPosition() const;
    /// False at the end of the data.
    bool nextChar(char& c);
    /// The byte that `nextChar` will give.
    bool peekChar(char& c);
    /// Puts a byte back in front of the data; any number may be put back.
    void ungetChar(char c);
    /// Reads one token. `token` holds `kMaxToken` + 1 bytes and is terminated; `size` gets its length.
    Token getNextToken(char* token, long long* size, bool insideTag);

    /// Decodes the entity references in `text` in place. What isn't known stays as it is. `sawHighBit`, where not
    /// null, is set (never cleared) when a reference gave a byte of 0x80 or more.
    ///
    /// | text                   | result                            |
    /// |------------------------|-----------------------------------|
    /// | a&lt;b                 | a<b                               |
    /// | &#65;&#x41;            | AA                                |
    /// | &nosuch; &#0; a & b    | the same                          |
    /// | &eacute;               | the same; byte 0xE9 by `windowsTable` |
    static void removeEntities(char* text, bool* sawHighBit, bool windowsTable);

    static constexpr int kMaxToken = 4096;
    static constexpr int kMaxAttributeName = 47;
    static constexpr int kMaxAttributeValue = 2047;
    static constexpr int kMaxDepth = 5000;

protected:
    /// Forgets what was read ahead.
    void dropBuffer();

    IPtr<FStream> stream;
    int32 line = 1;
    bool skipping = false;
    bool stopRequested = false;
    uint32 bufferPos = 0;
    char lookAhead = 0;
    int32 error = kNoError;
    /// A block, with zeros behind the data that end every search.
    CmBuffer buffer;
    CmStack tagStack;
    /// Objects for reuse, each with one reference.
    FXmlAttributeList attributePool;
    uint32 flags = 0;
    uint32 codePage = 0;

private:
    /// How far a run of bytes went: to the byte that ends it, to the end of the data, or to the token's limit.
    enum class Run
    {
        kStopped,
        kEnded,
        kFull
    };
    struct TokenText;

    // Bytes: `lookAhead` is empty while these work
    bool refill();
    void closeBuffer();
    bool hasByte() { return bufferPos < buffer.getFillSize() || refill(); }
    bool hasBytes(uint32 count);
    char frontByte() const { return buffer.ptr()[bufferPos]; }
    bool startsWith(const char* text, uint32 length);
    void pushFront(char c);
    void settleLookAhead()
    {
        if (lookAhead != 0)
            pushFront(std::exchange(lookAhead, '\0'));
    }
    template <class Predicate>
    Run copyUntil(TokenText& token, Predicate ends);
    void skipLayout(bool areBlanksData);
    bool skipLineEnd();
    void skipSpace();
    void countLines(const char* text, size_t length);

    // Tokens
    Token readToken(TokenText& token, bool insideTag);
    Token readTagPart(TokenText& token);
    Token readMarkup(TokenText& token);
    Token readAttribute(TokenText& token);
    Run copyValue(TokenText& token, char quote);
    Token readLineEnd(TokenText& token);
    Token readData(TokenText& token);
    Token readDeclaration(TokenText& token);
    Token readEndTag(TokenText& token);
    bool endsData();

    // Tokens to handlers
    bool processToken(int startDepth, void* data);
    bool isElementDone(int startDepth) const;
    Token nextToken(long long& size);
    void handleStartTag(void* data);
    bool readAttributes(FXmlAttributeList& attributes, Token& ending);
    void tellStartTag(FXmlAttributeList& attributes, bool isEmpty, void* data);
    CmString* newTagName();
    void handleEndTag(void* data);
    void endElement(void* data);
    void handleData(int64 size, void* data);
    void handlePI();
    void handleComment(void* data);
    void skipComment();
    void readComment(bool report, void* data);
    void skipCData();
    void skipDocType();
    bool skipPast(const char* end);
    void tellComment(TokenText& text, bool report, void* data, bool endOfComment);
    FXmlAttribute* tokenToAttribute(char* token, int64 size);
    FXmlAttribute* makeAttribute(std::string_view name, std::string_view value);
    FXmlAttribute* decodeAttribute(std::string_view name, std::string_view value, char* target);
    static size_t decodeReferences(std::string_view text, char* target, bool* sawHighBit, bool windowsTable);
    void recycle(FXmlAttributeList& attributes);
    void fail(Error code);

    // What lies whole in the buffer; false, with nothing taken, where it doesn't
    bool takePlainTagName();
    bool takePlainTagEnd(Token& ending)
    {
        const char* const begin = buffer + bufferPos;
        const bool isEmpty = begin[0] == '/';
        ending = isEmpty ? kEmptyTagEnd : kTagEnd;
        const bool isEnd = begin[isEmpty ? 1 : 0] == '>';
        if (isEnd)
            passPlain(begin + (isEmpty ? 2 : 1));
        return isEnd;
    }
    bool takePlainEndTag();
    void takePlainAttributes(FXmlAttributeList& attributes);
    bool readOnInsideTag();
    void passPlain(const char* end)
    {
        bufferPos = static_cast<uint32>(end - buffer.ptr());
        lastLineEnd = 0;
    }
    bool isAtEndTag() const
    {
        const char* const begin = buffer + bufferPos;
        return bufferPos < buffer.getFillSize() && begin[0] == '<' && begin[1] == '/';
    }
    bool mayProtectQuote(std::string_view value) const
    {
        return (flags & kBackslashProtects) && value.find('\\') != value.npos;
    }

    const uint32 blockSize;
    /// Whether the last block that was read had all bytes that it can have.
    bool isBlockWhole = false;
    Buffer tokenBuffer;
    Buffer tagName;
    /// That of the last tag, for the next one. Null while in use.
    IPtr<FXmlAttributeList> spareAttributes;
    /// The names of elements that ended, each with the only reference.
    CmArray spareNames;
    /// The line end that was counted last, while the next byte may still belong to it.
    char lastLineEnd = 0;
};
