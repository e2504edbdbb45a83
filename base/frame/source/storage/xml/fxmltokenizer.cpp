#include "storage/stream/fstream.h"
#include "storage/xml/fxmlscan.h"
#include "storage/xml/fxmltokentext.h"
#include "storage/xml/xmltext.h"

#include "foundation/text/cmstring.h"

#include <algorithm>

using Xml::isXmlSpace;

// Bytes

bool FXmlParser::nextChar(char& c)
{
    settleLookAhead();
    if (!hasByte())
        return false;
    c = buffer.ptr()[bufferPos++];
    return true;
}

bool FXmlParser::peekChar(char& c)
{
    if (!nextChar(c))
        return false;
    ungetChar(c);
    return true;
}

void FXmlParser::ungetChar(char c)
{
    settleLookAhead();
    // A zero in `lookAhead` would mean that there is none.
    if (bufferPos == 0 && c != 0)
        lookAhead = c;
    else
        pushFront(c);
}

void FXmlParser::pushFront(char c)
{
    if (bufferPos > 0)
        buffer.ptr()[--bufferPos] = c;
    else if (buffer.grow(buffer.getFillSize() + 1 + FXmlScan::kStep) && buffer.move(1, static_cast<uint8>(c)))
        closeBuffer();
}

int64 FXmlParser::getStreamPosition() const
{
    if (!stream)
        return 0;
    return stream->tell() - (buffer.getFillSize() - bufferPos) - (lookAhead != 0 ? 1 : 0);
}

// Reads one more block behind the bytes that are still unread.
bool FXmlParser::refill()
{
    const uint32 unread = buffer.getFillSize() - bufferPos;
    if (!stream || !buffer.grow(unread + blockSize + FXmlScan::kStep))
        return false;
    memmove(buffer.ptr(), buffer + bufferPos, unread);
    bufferPos = 0;
    const int64 count = stream->readRaw(buffer + unread, blockSize);
    buffer.setFillSize(unread + (count > 0 ? static_cast<uint32>(count) : 0));
    closeBuffer();
    isBlockWhole = count == static_cast<int64>(blockSize);
    return count > 0;
}

void FXmlParser::dropBuffer()
{
    buffer.setFillSize(0);
    closeBuffer();
    bufferPos = 0;
    lookAhead = 0;
}

// Puts the zeros behind the data at which each search ends; there is room for them, unless there was no memory at all.
void FXmlParser::closeBuffer()
{
    if (buffer.getSize() > 0)
        memset(buffer + buffer.getFillSize(), 0, FXmlScan::kStep);
}

bool FXmlParser::hasBytes(uint32 count)
{
    while (buffer.getFillSize() - bufferPos < count)
        if (!refill())
            return false;
    return true;
}

// Looks at no byte beyond the first that differs: without a buffer nothing may be read ahead.
bool FXmlParser::startsWith(const char* text, uint32 length)
{
    for (uint32 i = 0; i < length; i++)
        if (!hasBytes(i + 1) || buffer.ptr()[bufferPos + i] != text[i])
            return false;
    return true;
}

namespace
{
bool isBlank(char c)
{
    return c == ' ' || c == '\t';
}

bool isLineEnd(char c)
{
    return c == '\r' || c == '\n';
}

constexpr auto endsBlanks = [](uint8 c) -> bool { return (c != ' ') & (c != '\t'); };

/// The byte that ends a run, where there is only one.
struct Is
{
    bool operator()(char c) const { return c == wanted; }
    char wanted;
};

template <class Predicate>
const char* findEnd(const char* begin, const char* limit, Predicate ends)
{
    return std::find_if(begin, limit, ends);
}

const char* findEnd(const char* begin, const char* limit, Is end)
{
    const void* found = memchr(begin, end.wanted, static_cast<size_t>(limit - begin));
    return found ? static_cast<const char*>(found) : limit;
}
} // namespace

template <class Predicate>
FXmlParser::Run FXmlParser::copyUntil(TokenText& token, Predicate ends)
{
    while (hasByte())
    {
        const char* begin = buffer + bufferPos;
        const size_t count = std::min<size_t>(buffer.getFillSize() - bufferPos, kMaxToken - token.length);
        const char* limit = begin + count;
        const char* place = findEnd(begin, limit, ends);
        token.add(begin, static_cast<size_t>(place - begin));
        bufferPos += static_cast<uint32>(place - begin);
        if (place != limit)
            return Run::kStopped;
        if (token.isFull())
            return hasByte() && ends(frontByte()) ? Run::kStopped : Run::kFull;
    }
    return Run::kEnded;
}

// What getNextToken would give as tokens that nobody looks at.
void FXmlParser::skipLayout(bool areBlanksData)
{
    settleLookAhead();
    while (hasByte())
    {
        const char* place = buffer + bufferPos;
        const char* const limit = buffer + buffer.getFillSize();
        while (true)
        {
            if (!areBlanksData && isBlank(*place))
                place = FXmlScan::findEnd(place + 1, endsBlanks);
            if (!isLineEnd(*place) || place + 1 == limit || isLineEnd(place[1]))
                break;
            line++;
            place++;
        }
        bufferPos = static_cast<uint32>(place - buffer.ptr());
        if (place == limit)
            continue;
        if (!isLineEnd(*place))
            return;
        skipLineEnd();
    }
}

/// Whether it has two characters.
bool FXmlParser::skipLineEnd()
{
    const char partner = frontByte() == '\r' ? '\n' : '\r';
    bufferPos++;
    line++;
    const bool isPair = hasByte() && frontByte() == partner;
    bufferPos += isPair ? 1 : 0;
    return isPair;
}

void FXmlParser::skipSpace()
{
    for (; hasByte() && isXmlSpace(frontByte()); bufferPos++)
        countLines(buffer + bufferPos, 1);
}

// For line ends that are no tokens. Each pair of two different ones counts once, also where it comes in two pieces.
void FXmlParser::countLines(const char* text, size_t length)
{
    const bool hasLineEnd = lastLineEnd != 0 || memchr(text, '\n', length) || memchr(text, '\r', length);
    if (!hasLineEnd)
        return;
    for (size_t i = 0; i < length; i++)
    {
        const bool isLineEnd = text[i] == '\n' || text[i] == '\r';
        const bool isSecondHalf = isLineEnd && lastLineEnd != 0 && lastLineEnd != text[i];
        const bool isNew = isLineEnd && !isSecondHalf;
        line += isNew ? 1 : 0;
        lastLineEnd = isNew ? text[i] : '\0';
    }
}

// Tokens

FXmlParser::Token FXmlParser::getNextToken(char* token, long long* size, bool insideTag)
{
    settleLookAhead();
    lastLineEnd = 0;
    TokenText text(token);
    const Token kind = readToken(text, insideTag);
    text.terminate();
    if (size)
        *size = static_cast<long long>(text.length);
    if (kind == kData || kind == kAttribute)
        countLines(text.text, text.length);
    return kind;
}

FXmlParser::Token FXmlParser::readToken(TokenText& token, bool insideTag)
{
    if (!hasByte())
        return kEndOfData;
    const char c = frontByte();
    // Inside a tag blanks only part the attributes, so they are folded there in any case.
    if (isBlank(c) && (insideTag || !(flags & kKeepSpaces)))
    {
        copyUntil(token, [](char next) { return !isBlank(next); });
        return kSpace;
    }
    if (c == '\r' || c == '\n')
        return readLineEnd(token);
    if (insideTag)
        return readTagPart(token);
    return c == '<' ? readMarkup(token) : readData(token);
}

FXmlParser::Token FXmlParser::readLineEnd(TokenText& token)
{
    const char c = frontByte();
    token.add(c);
    if (skipLineEnd())
        token.add(c == '\r' ? '\n' : '\r');
    return kLineEnd;
}

FXmlParser::Token FXmlParser::readTagPart(TokenText& token)
{
    const char c = frontByte();
    if (c != '/' && c != '>' && c != '?')
        return readAttribute(token);
    token.add(c);
    bufferPos++;
    if (c == '>')
        return kTagEnd;
    if (!hasByte() || frontByte() != '>')
        return kMalformed;
    token.add('>');
    bufferPos++;
    return c == '/' ? kEmptyTagEnd : kInstructionEnd;
}

FXmlParser::Token FXmlParser::readAttribute(TokenText& token)
{
    if (copyUntil(token, [](char c) { return c == '='; }) != Run::kStopped || !token.add('='))
        return kMalformed;
    bufferPos++;
    skipSpace();
    if (!hasByte())
        return kMalformed;
    const char quote = frontByte();
    if ((quote != '"' && quote != '\'') || !token.add(quote))
        return kMalformed;
    bufferPos++;

    while (copyValue(token, quote) == Run::kStopped)
    {
        const char c = frontByte();
        if (!token.add(c))
            return kMalformed;
        bufferPos++;
        if (c == quote)
            return kAttribute;
        if (hasByte() && frontByte() == quote)
        {
            if (!token.add(quote))
                return kMalformed;
            bufferPos++;
        }
    }
    return kMalformed;
}

FXmlParser::Run FXmlParser::copyValue(TokenText& token, char quote)
{
    if (flags & kBackslashProtects)
        return copyUntil(token, [quote](char c) { return c == quote || c == '\\'; });
    return copyUntil(token, Is{quote});
}

// A '<' that doesn't begin the end of the innermost element is part of the data, whatever follows it.
FXmlParser::Token FXmlParser::readData(TokenText& token)
{
    while (copyUntil(token, Is{'<'}) == Run::kStopped)
    {
        if (endsData() || !token.add('<'))
            break;
        bufferPos++;
    }
    return kData;
}

bool FXmlParser::endsData()
{
    const char* name = getCurrentStartTag();
    if (!name)
        return true;
    const auto length = static_cast<uint32>(strlen(name));
    if (!startsWith("</", 2))
        return false;
    for (uint32 i = 0; i < length; i++)
        if (!hasBytes(i + 3) || buffer.ptr()[bufferPos + 2 + i] != name[i])
            return false;
    return true;
}

FXmlParser::Token FXmlParser::readMarkup(TokenText& token)
{
    token.add('<');
    bufferPos++;
    const char c = hasByte() ? frontByte() : '\0';
    if (c == '!')
        return readDeclaration(token);
    if (c == '/')
        return readEndTag(token);
    const bool isInstruction = c == '?';
    const Run run =
        copyUntil(token, [isInstruction](char next)
                  { return isXmlSpace(next) || (!isInstruction && (next == '>' || next == '/')); });
    if (run == Run::kFull)
        return kMalformed;
    return isInstruction ? kInstruction : kStartTag;
}

FXmlParser::Token FXmlParser::readDeclaration(TokenText& token)
{
    constexpr uint32 kKeywordLength = 7;
    bufferPos++;
    const char c = hasByte() ? frontByte() : '\0';
    if (c == '-')
    {
        const bool isComment = startsWith("--", 2);
        bufferPos += isComment ? 2 : 1;
        return isComment ? kComment : kMalformed;
    }
    if (c != 'D' && c != 'd' && c != '[')
        return kMalformed;
    // "DOCTYPE" or "[CDATA["; what really stands there is not looked at.
    if (!hasBytes(kKeywordLength))
        return kMalformed;
    token.add(buffer + bufferPos, kKeywordLength);
    bufferPos += kKeywordLength;
    return c == '[' ? kCData : kDocType;
}

FXmlParser::Token FXmlParser::readEndTag(TokenText& token)
{
    const Run run = copyUntil(token, [](char c) { return c == '>' || isXmlSpace(c); });
    if (run != Run::kStopped || frontByte() != '>' || !token.add('>'))
        return kMalformed;
    bufferPos++;
    return kEndTag;
}

// What handlers of the kinds do with the text themselves

// Gives the text between tags in pieces. The first one came as a token, by whose rule a '<' may be data.
void FXmlParser::handleData(int64 size, void* data)
{
    if (!skipping)
        gotData(tokenBuffer.ptr(), static_cast<unsigned>(size), data);
    const auto beginsMarkup = [](char c)
    { return c == '!' || c == '/' || c == '?' || CmString::isCharAlpha(c); };
    bool ended = false;
    while (!ended && !stopRequested && error == kNoError)
    {
        TokenText piece(tokenBuffer.ptr());
        Run run = Run::kStopped;
        while ((run = copyUntil(piece, Is{'<'})) == Run::kStopped)
        {
            ended = hasBytes(2) && beginsMarkup(buffer.ptr()[bufferPos + 1]);
            if (ended || !piece.add('<'))
                break;
            bufferPos++;
        }
        if (run == Run::kEnded)
            fail(kErrorUnexpectedEnd);
        countLines(piece.text, piece.length);
        if (!skipping && piece.length > 0)
            gotData(piece.text, static_cast<unsigned>(piece.length), data);
    }
    if (!skipping)
        gotData(tokenBuffer.ptr(), 0, data);
}

void FXmlParser::handleComment(void* data)
{
    readComment(true, data);
}

void FXmlParser::skipComment()
{
    readComment(false, nullptr);
}

void FXmlParser::readComment(bool report, void* data)
{
    TokenText text(tokenBuffer.ptr());
    int nesting = 0;
    while (true)
    {
        const Run run = copyUntil(text, [](char c) { return c == '-' || c == '<'; });
        if (run == Run::kEnded)
            return fail(kErrorUnexpectedEnd);
        if (run == Run::kFull || text.isFull())
        {
            tellComment(text, report, data, false);
            continue;
        }
        if (startsWith("-->", 3) && nesting-- == 0)
        {
            bufferPos += 3;
            return tellComment(text, report, data, true);
        }
        const bool isNested = startsWith("<!--", 4);
        if (isNested && (flags & kSplitComments))
        {
            bufferPos += 4;
            tellComment(text, report, data, false);
            continue;
        }
        nesting += isNested ? 1 : 0;
        text.add(frontByte());
        bufferPos++;
    }
}

// Tells what has been collected and begins anew.
void FXmlParser::tellComment(TokenText& text, bool report, void* data, bool endOfComment)
{
    countLines(text.text, text.length);
    text.terminate();
    if (report)
        gotComment(text.text, data, endOfComment);
    text.length = 0;
}

void FXmlParser::skipCData()
{
    if (!skipPast("]]>"))
        fail(kErrorUnexpectedEnd);
}

// Declarations, comments and texts in quotes may hold the character that ends the whole.
void FXmlParser::skipDocType()
{
    for (int depth = 1; depth > 0;)
    {
        char c = 0;
        if (!nextChar(c))
            return fail(kErrorUnexpectedEnd);
        const bool isComment = c == '<' && startsWith("!--", 3);
        const char quote[2] = {c, 0};
        if ((c == '"' || c == '\'' || isComment) && !skipPast(isComment ? "-->" : quote))
            return fail(kErrorUnexpectedEnd);
        if (!isComment)
            depth += (c == '<' ? 1 : 0) - (c == '>' ? 1 : 0);
        countLines(&c, 1);
    }
}

// False at the end of the data.
bool FXmlParser::skipPast(const char* end)
{
    const auto length = static_cast<uint32>(strlen(end));
    while (!startsWith(end, length))
    {
        if (!hasByte())
            return false;
        countLines(buffer + bufferPos, 1);
        bufferPos++;
    }
    bufferPos += length;
    return true;
}
