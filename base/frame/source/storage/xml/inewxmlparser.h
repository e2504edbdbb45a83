#pragma once

#include "foundation/object/funknown.h"

class IBStream;
class INewXmlHandler;
class IStringResult;

/// A parser that reads a document block by block and can rest between two of its handler's calls. One thread at a time.
class INewXmlParser : public FUnknown
{
public:
    /// Takes a reference; null makes the parser only check.
    virtual void setHandler(INewXmlHandler* handler) = 0;
    /// Reads to the end of the stream or of the document. True where the text was well-formed so far, also when
    /// `suspend` ended the call; where more follows behind the document, the stream is left right behind it.
    virtual bool process(IBStream* stream) = 0;
    /// Called by a handler: `process` ends with false.
    virtual void stop() = 0;
    /// Called by a handler: `process` ends with true, and `resume` goes on.
    virtual void suspend() = 0;
    virtual bool resume(IBStream* stream) = 0;
    /// Makes the parser ready for another document. `encoding` is null or overrides what the document says.
    virtual bool reset(const char* encoding) = 0;
    /// False, without effect, in the middle of a document.
    virtual bool setEncoding(const char* encoding) = 0;
    /// The reason and the line of the last failure, for the user. False where there was none to tell.
    virtual bool getErrorContext(IStringResult& text) = 0;
    /// Counted from 1, but from 0 when the parser was stopped.
    virtual int64 getCurrentLineNumber() = 0;

    DECLARE_INTERFACE_ID
};
