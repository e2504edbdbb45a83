#include "services/localisation/utranslator.h"

#include "containers/value/cmbuffer.h"
#include "foundation/text/iuseralert.h"
#include "foundation/text/utranslatedstring.h"
#include "services/localisation/ilanguagedependent.h"
#include "services/localisation/irealtimetranslator.h"
#include "services/localisation/ulocale.h"
#include "services/localisation/uresource.h"
#include "services/localisation/utranslationchecker.h"
#include "services/localisation/utranslationparser.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

#include <algorithm>
#include <climits>
#include <cstring>
#include <limits>
#include <string_view>

DEFINE_INTERFACE_ID(ITranslator, 0x8B93D05E, 0x21FC4C7A, 0xA4087E19, 0x6D52B3C0)

UTranslator* gTranslator = nullptr;

DEFINE_INTERFACE_HOST(ITranslator, gTranslator)

namespace
{
const UTranslatedString stringYouMustRestartTheApplication("You must restart the application.");

/// Texts are remembered in blocks of at least this size.
constexpr uint32 kMemoryBlock = 40960;
/// What a translation file may be; no real one comes near.
constexpr int64 kMaxFileSize = int64{64} << 20;
constexpr char kFileName[] = "translation.xml";
constexpr char16 kFileName16[] = u"translation.xml";
constexpr char16 kLanguageFile[] = u"lang.cfg";

/// Translated strings keep what they were given, so the blocks outlive the translator.
CmArray& outlivingMemory()
{
    static CmArray blocks(0, 10);
    blocks.takeElements();
    return blocks;
}

const char16* translateForStrings(const char16* key)
{
    return gTranslator ? gTranslator->translate(key) : key;
}

const char* englishCode()
{
    return __getLocale().getLanguageCode(kLanguageEnglish);
}

/// A stream that is closed when it goes.
class OpenFile
{
public:
    OpenFile(FNPath& path, int flags, bool create)
    {
        if (gFileSystem && path.isAbsolute())
            stream = create ? gFileSystem->createFile(&path, flags, nullptr)
                            : gFileSystem->openFile(&path, flags, nullptr);
    }
    OpenFile(const OpenFile&) = delete;
    ~OpenFile()
    {
        if (stream)
            gFileSystem->closeFile(stream);
    }
    FStream* get() const { return stream; }

private:
    FStream* stream = nullptr;
};

/// Reads all bytes. False where there are none, too many, or fewer than the file has.
bool readWhole(FStream& stream, CmBuffer& result)
{
    const int64 size = gFileSystem->getFileSize(&stream);
    if (size <= 0 || size > kMaxFileSize || !result.setSize(static_cast<uint32>(size)))
        return false;
    result.setFillSize(static_cast<uint32>(size));
    return stream.readRaw(result.ptr(), size) == size;
}
} // namespace

UTranslator::UTranslator()
{
    memory.takeElements();
    if (gTranslator)
        return;
    gTranslator = this;
    UTranslatedString::setTranslator(&translateForStrings);
}

UTranslator::~UTranslator()
{
    if (gTranslator == this)
    {
        gTranslator = nullptr;
        UTranslatedString::setTranslator(nullptr);
    }
    outlivingMemory().takeAllFrom(&memory, true);
    memory.removeAll();
}

int32 UTranslator::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, ITranslator::iid))
        return offerInterface<ITranslator>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

// Texts

const char16* UTranslator::translate(const char16* text)
{
    if (!text || !gTranslator || !ready)
        return text;
    const char16* translation = find(text);
    if (translation)
        return translation;
    return emptyIfMissing ? nullptr : text;
}

const char16* UTranslator::translate2(const char16* text)
{
    return text && ready ? find(text) : nullptr;
}

bool UTranslator::translate(const char16* text, char16* buffer, int size)
{
    if (!buffer || size < 1)
        return false;
    const char16* translation = translate(text);
    const std::u16string_view whole(translation ? translation : u"");
    const size_t count = whole.copy(buffer, static_cast<size_t>(size) - 1);
    buffer[count] = 0;
    return translation != nullptr;
}

const char16* UTranslator::find(const char16* text) const
{
    if (disabled)
        return nullptr;
    const TransConstString wanted{text};
    const TransConstString* found = translations.isEmpty() ? nullptr : translations.lookup(wanted);
    if (!found)
        found = extraTranslations.lookupKey(wanted);
    return found ? found->text : nullptr;
}

const char16* UTranslator::untranslate(const char16* text)
{
    if (!text || disabled)
        return text;
    const TransConstString wanted{text};
    for (auto iterator = translations.iterate(); !iterator.done(); iterator.next())
        if (iterator.current().value == wanted)
            return iterator.current().key.text;
    for (const auto& extra : extraTranslations)
        if (extra.value == wanted)
            return extra.key.text;
    return text;
}

// Start

void UTranslator::initialize(bool disable)
{
    ready = true;
    disabled = disable;
    if (disable)
        return;
    detectUserLanguage();
    addStandardTexts();
    verifyUserLanguage();
    addLanguagePreference();
    LanguageDependents::instance().languageChanged();
}

void UTranslator::initialize(const char* languageCode)
{
    ready = true;
    disabled = false;
    chooseLanguage(languageCode);
    addStandardTexts();
    LanguageDependents::instance().languageChanged();
}

void UTranslator::initialize(const char* languageCode, FNPath* file)
{
    ready = true;
    disabled = false;
    chooseLanguage(languageCode);
    if (file)
        addFile(file, true);
    LanguageDependents::instance().languageChanged();
}

void UTranslator::addStandardTexts()
{
    FNPath path(kFileName16, FNPath::kAppFolder, FNPath::kFile, nullptr, false);
    if (addFile(&path, true))
        return;
    UResource resource(UResource::kText, kFileName);
    addResource(resource, true);
}

// The pages of preferences will show a choice of all language names here, or "American English (built-in)" alone; until
// they exist, nothing is to be done.
void UTranslator::addLanguagePreference() {}

// The skins of languages with double bytes are told apart by the define "Language:Asia"; until there are skins, nothing
// is to be done.
void UTranslator::addLanguageDefine() {}

bool UTranslator::addFile(FNPath* path, bool reportErrors)
{
    if (disabled || !path)
        return false;
    OpenFile file(*path, kFileRead, false);
    CmBuffer content;
    return file.get() && readWhole(*file.get(), content) &&
           addData(content.ptr(), content.getFillSize(), reportErrors);
}

bool UTranslator::addResource(UResource& resource, bool reportErrors)
{
    return !disabled && addData(resource.getData(), resource.getSize(), reportErrors);
}

bool UTranslator::loadResource(void*, const char16* name, const char* languageCode)
{
    if (languageCode)
        chooseLanguage(languageCode);
    FString narrow(name);
    UResource resource(UResource::kText, narrow.text8());
    return addResource(resource, true);
}

bool UTranslator::addData(const char* data, int64 size, bool reportErrors)
{
    if (!data || size <= 0 || size > kMaxFileSize)
        return false;
    UTranslationParser parser(data, static_cast<int>(size), *this);
    return parser.go(reportErrors);
}

// Languages

void UTranslator::chooseLanguage(const char* code)
{
    language = rememberCode(code ? code : "");
}

void UTranslator::detectUserLanguage()
{
    memset(languageBuffer, 0, sizeof(languageBuffer));
    FNPath path(kLanguageFile, FNPath::kUserFolder, FNPath::kFile, nullptr, false);
    const OpenFile file(path, kFileRead, false);
    if (file.get())
        file.get()->readRaw(languageBuffer, sizeof(languageBuffer) - 1);
    language = languageBuffer;
    if (strlen(languageBuffer) != 2)
        language = __getLocale().getLanguageCode(__getLocale().getUserLanguage());
}

void UTranslator::verifyUserLanguage()
{
    if (getSelectedLanguageIndex() < 0)
    {
        translations.removeAll();
        language = englishCode();
    }
    const ULanguage chosen = __getLocale().getLanguageFromCode(language);
    __getLocale().setUserLanguage(chosen);
    if (__getLocale().isLeadByteLanguage(chosen))
        addLanguageDefine();
}

void UTranslator::selectLanguage(int index)
{
    const char* code = getLanguageCode(index);
    if (disabled || !code || strcmp(code, language) == 0 || !writeLanguageFile(code))
        return;
    IUserAlert* alert = IUserAlert::get();
    if (!IRealtimeTranslator::theInstance && alert)
        alert->run(stringYouMustRestartTheApplication.text(), 0, nullptr, nullptr, nullptr);
}

bool UTranslator::writeLanguageFile(const char* code) const
{
    const auto length = static_cast<int64>(strnlen(code, 2));
    FNPath path(kLanguageFile, FNPath::kUserFolder, FNPath::kFile, nullptr, true);
    const OpenFile file(path, kFileWrite, true);
    return file.get() && file.get()->writeRaw(code, length) == length;
}

void UTranslator::getLanguage(char* code) const
{
    memset(code, 0, sizeof(languageBuffer));
    memcpy(code, language, strnlen(language, 2));
}

const char* UTranslator::getLanguageCode(int index) const
{
    return index >= 0 && index < languages.total() ? languages[index].key.code : nullptr;
}

const char16* UTranslator::getLanguageName(int index) const
{
    return index >= 0 && index < languages.total() ? languages[index].value.text : nullptr;
}

int UTranslator::getSelectedLanguageIndex() const
{
    return languages.indexOfKey({language});
}

// Rows

void UTranslator::addLanguage(const char* code, const char16* name)
{
    if (!languages.containsKey({code}))
        languages.add({rememberCode(code)}, {remember(name)});
}

int UTranslator::addTranslation(const char16* key, const char* languageCode, const char16* text)
{
    const TransConstString wanted{key};
    if (strcmp(languageCode, language) == 0)
    {
        if (translations.contains(wanted))
            return kLeftOut;
        const char16* kept = remember(key);
        const bool isKeyItself = TransConstString{text} == TransConstString{u"="};
        translations.add({kept}, {isKeyItself ? kept : remember(text)});
        return kTaken;
    }
    if (strcmp(languageCode, englishCode()) != 0 || TransConstString{text} == wanted)
        return kLeftOut;
    extraTranslations.add({remember(key)}, {remember(text)});
    return kTaken;
}

void UTranslator::removeTranslations(int languageIndex)
{
    const char* code = getLanguageCode(languageIndex);
    if (!code)
        return;
    if (strcmp(code, language) == 0)
        translations.removeAll();
    if (strcmp(code, englishCode()) == 0)
        extraTranslations.removeAll();
}

// Memory is taken from the newest block; a text larger than a block gets one of its own.
void* UTranslator::allocate(uint32 bytes)
{
    auto* block = static_cast<CmBuffer*>(memory.at(memory.total() - 1));
    if (!block || block->getFree() < bytes)
    {
        block = new CmBuffer(std::max(bytes, kMemoryBlock));
        memory.add(block);
    }
    if (block->getFree() < bytes)
        return nullptr;
    void* result = *block + block->getFillSize();
    // The texts of 16 bits need even addresses.
    const uint32 filled = block->getFillSize() + bytes + (bytes & 1);
    block->setFillSize(std::min(filled, block->getSize()));
    return result;
}

const char16* UTranslator::remember(const char16* text)
{
    const size_t bytes = (std::u16string_view(text).size() + 1) * sizeof(char16);
    void* kept = allocate(static_cast<uint32>(bytes));
    return kept ? static_cast<char16*>(memcpy(kept, text, bytes)) : kEmptyString16;
}

const char* UTranslator::rememberCode(const char* code)
{
    const size_t bytes = strlen(code) + 1;
    void* kept = allocate(static_cast<uint32>(bytes));
    return kept ? static_cast<char*>(memcpy(kept, code, bytes)) : "";
}

bool UTranslator::verifySyntax(const char* data, int size, FString& message, int& line)
{
    UTranslationChecker checker;
    UTranslationParser parser(data, size, checker);
    if (parser.go(false))
        return true;
    line = parser.getLine();
    message = parser.getMessage();
    if (checker.hasMismatch())
        message.printf("printf mismatch at line %d", line);
    return false;
}
