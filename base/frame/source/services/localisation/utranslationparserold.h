#pragma once

#include "foundation/text/fstring.h"

class ITranslationReceiver;

/// Reads the old format of translation files: 8-bit text, and an element `Translation` with the code of its language.
///
/// It knows its few tags by name and refuses everything else it doesn't expect at a place. *One thread at a time.*
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
    /// The fault with the text around its place, marked.
    void makeErrorMessage(FString& message) const;

    static constexpr int kMaxAttributes = 8;
    static constexpr int kMaxComment = 32000;
    static constexpr int kMaxName = 127;

private:
    struct Attribute
    {
        char name[kMaxName + 1];
        FString value;
    };
    struct Tag
    {
        char name[kMaxName + 1];
        Attribute attributes[kMaxAttributes];
        int attributeCount;
        bool isEmpty;
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
    bool readDeclaration();
    bool readInstruction();
    bool readStartTag();
    bool readEndTag();
    bool readText();
    bool readAttributes(Tag& tag);
    bool readAttribute(Tag& tag);
    bool readName(char* name);
    bool skipTo(const char* end, const char* tooLong, const char* notClosed);
    void skipSpace();
    bool atEnd() const { return position >= size; }
    bool startsWith(const char* text) const;
    bool decodeAttributeValue(char quote, FString& value);
    void decodeCharData(int from, int to, FString& text) const;
    int decodeReference(int from, int to, FString& text) const;

    // Tags to rows
    bool beginElement(const Tag& tag);
    bool beginLanguage(const Tag& tag);
    bool beginString(const Tag& tag);
    bool beginTranslation(const Tag& tag);
    bool endElement(const char* name);
    bool takeText(const FString& text);

    const char* data;
    int size;
    ITranslationReceiver& receiver;
    int position = 0;
    const char* error = "";
    Place place = Place::kOutside;
    FString key;
    FString language;
    FString text;
};
