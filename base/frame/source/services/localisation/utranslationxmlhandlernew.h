#pragma once

#include "containers/value/buffer.h"
#include "foundation/text/fstring.h"
#include "storage/xml/xmlhandler.h"

class ITranslationReceiver;

/// Follows the new format of translation files, in which the tag of a translation is its language code.
///
/// Unknown tags are passed over. *One thread at a time.*
class UTranslationXmlHandlerNew : public XmlHandler
{
    DECLARE_TYPE(UTranslationXmlHandlerNew, XmlHandler)

    /// `receiver` is borrowed.
    explicit UTranslationXmlHandlerNew(ITranslationReceiver& receiver);

    void startTag(INewXmlParser* parser, const char* name, const char** attributes) override;
    void endTag(INewXmlParser* parser, const char* name) override;
    void charData(INewXmlParser* parser, const char* data, int length) override;

    /// Replaces the two characters "\n" and "\t", as they stand in a file, by a line feed and a tab, from the left.
    static void removeCppCoding(FString& text);

private:
    enum class State
    {
        kOutside,
        kLanguageTable,
        kLanguage,
        kStringTable,
        kString
    };

    void beginLanguage(INewXmlParser* parser, const char** attributes);
    void beginString(const char** attributes);
    void endLanguage(INewXmlParser* parser, const char* name);
    void endTranslation(INewXmlParser* parser, const char* name);
    void takeText(FString& result);

    ITranslationReceiver& receiver;
    State state = State::kOutside;
    FString code;
    FString key;
    Buffer text;
};
