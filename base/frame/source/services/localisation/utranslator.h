#pragma once

#include "containers/sequence/cmarray.h"
#include "containers/typed/tassociationarray.h"
#include "containers/typed/thashdictionary.h"
#include "foundation/object/fobject.h"
#include "foundation/text/fstring.h"
#include "services/localisation/itranslationreceiver.h"
#include "services/localisation/itranslator.h"
#include "services/localisation/transconststring.h"

class FNPath;
class UResource;
class UTranslator;

/// The first translator built, until it goes; null before.
extern UTranslator* gTranslator;

/// The texts of the selected language by their English texts, which are the keys.
///
/// Until one of the `initialize` operations has run, and while it is silenced, it gives texts back as they are. It
/// answers every UTranslatedString; those keep their first answer. Reading is thread-safe while nothing is added;
/// all else is for the *main thread* during start-up.
class UTranslator : public FObject, public ITranslator, public ITranslationReceiver
{
    DECLARE_TYPE(UTranslator, FObject)
    FORWARD_FUNKNOWN(FObject)

    UTranslator();
    UTranslator(const UTranslator&) = delete;
    ~UTranslator() override;

    int32 queryInterface(const char* interfaceID, void** object) override;

    // Texts
    const char16* translate(const char16* text) override;
    const char16* translate2(const char16* text) override;
    bool translate(const char16* text, char16* buffer, int size) override;
    const char16* untranslate(const char16* text) override;
    /// Whether `translate` gives null for a text without translation.
    void setEmptyIfMissing(bool state) { emptyIfMissing = state; }

    // Start
    /// With `disable` the translator is silent. Otherwise the user's language is found out and its texts are read.
    void initialize(bool disable);
    /// Reads the texts of this language, which is copied.
    void initialize(const char* languageCode);
    /// Reads them from this file only; null reads nothing.
    void initialize(const char* languageCode, FNPath* file);
    /// Adds the texts of a file. False where it can't be read, is empty or damaged, and while silenced; a fault in it
    /// is shown to the user on demand.
    bool addFile(FNPath* file, bool reportErrors);
    bool addResource(UResource& resource, bool reportErrors);
    /// Selects a language, if one is given, and adds the texts of the built-in block of that name and kind. `module`
    /// belongs to platforms on which blocks are part of a loaded module, and may be null.
    bool loadResource(void* module, const char16* name, const char* languageCode);

    // Languages
    /// Chooses a row of the languages for the next start, and tells the user to restart.
    void selectLanguage(int index);
    /// Takes the language from "lang.cfg" in the user folder or from the locale.
    void detectUserLanguage();
    /// Falls back on English where no file offers the language, and tells the locale.
    void verifyUserLanguage();
    /// The selected code; never null.
    const char* getUserLanguageCode() const { return language; }
    /// Copies the first two letters of the selected code with a terminator.
    void getLanguage(char* code) const;
    int countAvailableLanguages() const { return languages.total(); }
    /// Null beyond the rows.
    const char* getLanguageCode(int index) const;
    const char16* getLanguageName(int index) const;
    /// -1 where no row is selected.
    int getSelectedLanguageIndex() const;

    // Rows, as the parsers find them
    void addLanguage(const char* code, const char16* name) override;
    int addTranslation(const char16* key, const char* languageCode, const char16* text) override;
    /// Forgets the texts held for the language in this row.
    void removeTranslations(int languageIndex);
    int countTranslations() const { return translations.total(); }
    int countExtraTranslations() const { return extraTranslations.total(); }

    /// Whether a translation file is sound, printf places included. Where not, `message` tells the fault and `line`
    /// where it is.
    static bool verifySyntax(const char* data, int size, FString& message, int& line);

private:
    const char16* find(const char16* text) const;
    bool addData(const char* data, int64 size, bool reportErrors);
    void addStandardTexts();
    void addLanguagePreference();
    void addLanguageDefine();
    void chooseLanguage(const char* code);
    bool writeLanguageFile(const char* code) const;
    void* allocate(uint32 bytes);
    const char16* remember(const char16* text);
    const char* rememberCode(const char* code);

    THashDictionary<TransConstString, TransConstString, &hashConstString> translations{2048};
    TAssociationArray<TransLanguageCode, TransConstString> languages;
    TAssociationArray<TransConstString, TransConstString> extraTranslations;
    const char* language = "";
    char languageBuffer[3] = {};
    CmArray memory{0, 10};
    bool ready = false;
    bool disabled = false;
    bool emptyIfMissing = false;
};
