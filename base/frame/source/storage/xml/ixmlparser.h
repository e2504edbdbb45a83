#pragma once

#include "foundation/object/funknown.h"

class IBStream;

/// Results of the plug-in's parser beside `kResultOk`.
inline constexpr int32 kXmlAlreadyInitialized = 1;
inline constexpr int32 kXmlInvalidStream = 2;
inline constexpr int32 kXmlNotInitialized = 5;

/// A plug-in's ear: hears what the parser reads. A false result ends the parsing with an error. One
/// thread at a time.
class IXmlParserDef : public FUnknown
{
public:
    virtual bool startTag(const char* name, int attributeCount, const char** names, const char** values,
                          bool isEmpty, void* data) = 0;
    virtual bool endTag(const char* name, void* data) = 0;
    /// One piece of text, not terminated; a count of 0 ends the text.
    virtual void gotData(void* bytes, unsigned int count, void* data) = 0;
    virtual void gotComment(const char* text, void* data, bool endOfComment) = 0;

    DECLARE_INTERFACE_ID
};

/// The older parser as a plug-in sees it. One thread at a time.
class IXmlParser : public FUnknown
{
public:
    /// Takes references on both. 1 if already initialised, 2 if the stream is none of the framework's own.
    virtual int32 initialize(IBStream* stream, IXmlParserDef* definition) = 0;
    /// 0, or the parser's error; 5 before `initialize`.
    virtual int32 process(void* data) = 0;
    /// Ends the parsing with the error "Unexpected tag" for 1 and "malformed" for any other reason.
    virtual int32 stop(int reason) = 0;

    DECLARE_INTERFACE_ID
};

/// The further operations that came later. One thread at a time.
class IXmlParser2 : public IXmlParser
{
public:
    virtual int32 keepSpaces(bool keep) = 0;
    virtual int32 stopAfterMainTag() = 0;
    /// Seeks the stream to the byte behind the last one used, since the parser reads ahead.
    virtual int32 repositionStream() = 0;
    /// The innermost open element, or null outside of all; valid until it ends.
    virtual int32 getCurrentStartTag(const char** name) = 0;

    DECLARE_INTERFACE_ID
};
