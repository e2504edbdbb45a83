#pragma once

#include "foundation/object/funknown.h"

class INewXmlParser;

/// Hears what a newer parser finds. All text is UTF-8, entities decoded, and valid during the call only. One thread at a
/// time.
class INewXmlHandler : public FUnknown
{
public:
    /// `attributes` alternates names and values and ends with a null pointer.
    virtual void startTag(INewXmlParser* parser, const char* name, const char** attributes) = 0;
    virtual void endTag(INewXmlParser* parser, const char* name) = 0;
    /// One piece of text, not terminated; a text may come in any number of pieces.
    virtual void charData(INewXmlParser* parser, const char* data, int length) = 0;
    virtual void comment(INewXmlParser* parser, const char* text) = 0;

    DECLARE_INTERFACE_ID
};
