#pragma once

#include "containers/sequence/cmstack.h"
#include "containers/value/buffer.h"
#include "foundation/text/fstring.h"

class ITranslationReceiver;

/// Reads the old format of translation files: 8-bit text in the default encoding, and an element `Translation` that
/// names its language in an attribute.
///
/// Tags that it doesn't know are passed over; the known ones are expected in their places, and text only in a language
/// or a translation. *One thread at a time.*
class UTranslationParserOld
{
public:
    /// Both are borrowed.
    UTranslationParserOld(const char* data, int size, ITranslationReceiver& receiver);

    /// False at the first fault, and where the receiver stops; what was read until then has been handed over.
    bool parse();

    /// What the fault was; "" where there was none.
    const char* getError() const { return error; }
    /// The line of the fault, from 1.
    int getLine() const;
    /// The fault, and the text around its place with a mark.
    void makeErrorMessage(FString& message) const;

    static constexpr int kMaxAttributes = 8;
    static constexpr int kMaxComment = 32000;
    static constexpr int kMaxName = 127;
    static constexpr int kMaxValue = 32000;
    static constexpr int kMaxDepth = 100;

private:
    struct Tag
    {
        FString name;
        FString attributes[kMaxAttributes];
        FString values[kMaxAttributes];
        int count = 0;

        const FString* valueOf(const char* attribute) const;
    };

    enum class Place
    {
        kOutside,
        kLanguageTable,
        kLanguage,
        kStringTable,
        kString,
        kTranslation
    };

    bool fail(const char* message);

    // Text to tags
    bool readMarkup();
    bool readStartTag();
    bool readEndTag();
    bool readText();
    bool readAttributes(Tag& tag);
    bool readAttribute(Tag& tag);
    bool readName(FString& name);
    bool skipPast(const char* end, const char* tooLong, const char* notClosed);
    void skipSpace();
    bool startsWith(const char* text) const;
    int find(const char* wanted) const;
    bool decodeAttributeValue(FString& value);
    static void decodeCharData(const char* from, int length, Buffer& result);

    // Tags to rows
    bool beginElement(const Tag& tag);
    bool beginTable(const Tag& tag, Place table);
    bool beginLanguage(const Tag& tag);
    bool beginString(const Tag& tag);
    bool beginTranslation(const Tag& tag);
    bool endElement(const FString& name);
    bool endKnownElement(const FString& name);
    bool endTranslation();
    void takeText(FString& result);

    const char* data;
    int size;
    ITranslationReceiver& receiver;
    int position = 0;
    const char* error = "";
    CmStack openTags;
    Place place = Place::kOutside;
    FString key;
    FString language;
    Buffer text;
};
