#include "foundation/text/iuseralert.h"
#include "foundation/text/utranslatedstring.h"
#include "services/localisation/ilanguagedependent.h"
#include "services/localisation/irealtimetranslator.h"
#include "services/localisation/ulocale.h"
#include "services/localisation/uresource.h"
#include "services/localisation/utranslator.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fnpath.h"
#include "storage/path/istandardfolders.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <string>

namespace
{
std::string narrow(const ConstString& text)
{
    String copy(text);
    copy.toMultiByte(kEncodingUtf8);
    return copy.text8();
}

constexpr char kTexts[] =
    "\xEF\xBB\xBF<T><LanguageTable><language key='us'>American English</language><language "
    "key='de'>Deutsch</language>"
    "<language key='fr'>Fran\u00E7ais</language><language "
    "key='de2'>again</language></LanguageTable><StringTable>"
    "<String Key='Yes'><de>Ja</de><fr>Oui</fr></String><String Key='OK'><de>=</de></String>"
    "<String Key='Yes'><de>Jawohl</de></String><String "
    "Key='colour'><us>color</us></String></StringTable></T>";

const char* builtIn = nullptr;

const char* findBuiltIn(int type, const char* name, int64& size)
{
    const bool isWanted = builtIn && type == 3 && std::string(name) == "translation.xml";
    size = isWanted ? static_cast<int64>(strlen(builtIn)) : 0;
    return isWanted ? builtIn : nullptr;
}

class Alert : public IUserAlert
{
public:
    int run(const char16* text, int, const char16*, const char16*, const char16*) override
    {
        shown += narrow(text) + "|";
        return 1;
    }
    std::string shown;
};

/// A home with the user folder and the application folder, a file system, and somebody to alert.
class TranslatorTest : public testing::Test, public IStandardFolders
{
protected:
    void SetUp() override
    {
        std::string pattern = (std::filesystem::temp_directory_path() / "translatorXXXXXX").string();
        home = mkdtemp(pattern.data());
        userPath.fromUTF8((home / "user").c_str());
        appPath.fromUTF8((home / "app").c_str());
        std::filesystem::create_directories(home / "user");
        std::filesystem::create_directories(home / "app");
        IStandardFolders::setInstance(this);
        formerFileSystem = gFileSystem;
        gFileSystem = &fileSystem;
        IUserAlert::set(&alert);
        UResource::setLookup(&findBuiltIn);
        formerLanguage = __getLocale().getUserLanguage();
    }
    void TearDown() override
    {
        __getLocale().setUserLanguage(formerLanguage);
        UResource::setLookup(nullptr);
        builtIn = nullptr;
        IUserAlert::set(nullptr);
        gFileSystem = formerFileSystem;
        IStandardFolders::setInstance(nullptr);
        std::filesystem::remove_all(home);
    }

    const char16* getUserPath() override { return userPath.text16(); }
    const char16* getTempPath() override { return nullptr; }
    const char16* getAppPath() override { return appPath.text16(); }
    const char16* getSystemPath() override { return nullptr; }

    void write(const char* file, const std::string& content) { std::ofstream(home / file) << content; }
    std::string read(const char* file)
    {
        std::ifstream stream(home / file);
        return std::string(std::istreambuf_iterator<char>(stream), {});
    }

    std::filesystem::path home;
    FString userPath;
    FString appPath;
    FNFileSystem fileSystem;
    FNFileSystem* formerFileSystem = nullptr;
    Alert alert;
    ULanguage formerLanguage = 0;
    UTranslator translator;
};
} // namespace

TEST_F(TranslatorTest, GivesTextsBackBeforeItIsReadyAndWhileSilent)
{
    write("app/translation.xml", kTexts);
    EXPECT_EQ(gTranslator, &translator);
    EXPECT_EQ(translator.translate(nullptr), nullptr);
    const char16* text = u"Yes";
    EXPECT_EQ(translator.translate(text), text);
    translator.setEmptyIfMissing(true);
    EXPECT_EQ(translator.translate(text), text) << "it isn't ready";
    translator.setEmptyIfMissing(false);
    translator.initialize(true);
    EXPECT_EQ(translator.translate(text), text);
    EXPECT_EQ(translator.countTranslations(), 0);
    FNPath file(u"translation.xml", FNPath::kAppFolder, FNPath::kFile, nullptr, false);
    EXPECT_FALSE(translator.addFile(&file, true));
}

TEST_F(TranslatorTest, TranslatesIntoTheGivenLanguage)
{
    write("app/translation.xml", kTexts);
    std::string code = "de";
    translator.initialize(code.c_str());
    code = "xx";
    EXPECT_STREQ(translator.getUserLanguageCode(), "de");
    EXPECT_EQ(narrow(translator.translate(u"Yes")), "Ja") << "a second translation doesn't replace the first";
    EXPECT_EQ(narrow(translator.translate(u"OK")), "OK");
    EXPECT_EQ(translator.countTranslations(), 2);
    EXPECT_EQ(narrow(translator.translate(u"colour")), "color") << "English rows serve all languages";
    EXPECT_EQ(translator.countExtraTranslations(), 1);
    EXPECT_EQ(translator.translate(nullptr), nullptr);
    const char16* unknown = u"yes";
    EXPECT_EQ(translator.translate(unknown), unknown);
    EXPECT_EQ(translator.translate2(unknown), nullptr);
    translator.setEmptyIfMissing(true);
    EXPECT_EQ(translator.translate(unknown), nullptr);
    EXPECT_EQ(alert.shown, "");
}

TEST_F(TranslatorTest, CopiesAndTurnsBack)
{
    builtIn = kTexts;
    translator.initialize("fr");
    char16 buffer[3] = {};
    EXPECT_TRUE(translator.translate(u"Yes", buffer, 3));
    EXPECT_EQ(narrow(buffer), "Ou");
    EXPECT_FALSE(translator.translate(nullptr, buffer, 3));
    EXPECT_EQ(buffer[0], 0);
    EXPECT_EQ(narrow(translator.untranslate(u"Oui")), "Yes");
    EXPECT_EQ(narrow(translator.untranslate(u"color")), "colour");
    EXPECT_EQ(narrow(translator.untranslate(u"x")), "x");
}

TEST_F(TranslatorTest, LoadsAndForgetsBlocks)
{
    builtIn = kTexts;
    translator.initialize("de", nullptr);
    EXPECT_FALSE(translator.loadResource(nullptr, u"other.xml", nullptr));
    EXPECT_TRUE(translator.loadResource(nullptr, u"translation.xml", "fr"));
    EXPECT_EQ(narrow(translator.translate(u"Yes")), "Oui");
    translator.removeTranslations(1);
    EXPECT_EQ(translator.countTranslations(), 1) << "German isn't held";
    translator.removeTranslations(2);
    EXPECT_EQ(translator.countTranslations(), 0);
    EXPECT_EQ(translator.countExtraTranslations(), 1);
    translator.removeTranslations(0);
    translator.removeTranslations(9);
    EXPECT_EQ(translator.countExtraTranslations(), 0);
    translator.initialize(true);
    EXPECT_FALSE(translator.loadResource(nullptr, u"translation.xml", "fr"));
}

TEST_F(TranslatorTest, IsTheFirstOneBuilt)
{
    UTranslator other;
    other.initialize("de", nullptr);
    other.addTranslation(u"Yes", "de", u"Ja");
    EXPECT_EQ(gTranslator, &translator);
    const UTranslatedString string("Yes"), missing("No");
    EXPECT_EQ(narrow(string.text()), "Yes") << "translated strings ask the first";
    translator.initialize("de", nullptr);
    translator.setEmptyIfMissing(true);
    EXPECT_EQ(missing.text()[0], 0);
    translator.setEmptyIfMissing(false);
    EXPECT_EQ(missing.text()[0], 0) << "the empty text is kept too";
}

TEST_F(TranslatorTest, AnswersTranslatedStringsOnce)
{
    builtIn = kTexts;
    const UTranslatedString early("Yes"), late("Yes");
    translator.initialize(true);
    EXPECT_EQ(narrow(early.text()), "Yes");
    translator.initialize("de");
    EXPECT_EQ(narrow(early.text()), "Yes");
    EXPECT_EQ(narrow(late.text()), "Ja");
}

TEST(UTranslatedStringOfATranslator, OutlivesIt)
{
    static const UTranslatedString string("Yes");
    {
        UTranslator translator;
        translator.initialize("de", nullptr);
        translator.addTranslation(u"Yes", "de", u"Ja");
        EXPECT_EQ(narrow(string.text()), "Ja");
    }
    EXPECT_EQ(gTranslator, nullptr);
    EXPECT_EQ(narrow(string.text()), "Ja");
}

TEST_F(TranslatorTest, FindsTheLanguageInTheUserFolder)
{
    write("user/lang.cfg", "frx");
    write("app/translation.xml", kTexts);
    translator.initialize(false);
    EXPECT_STREQ(translator.getUserLanguageCode(), "fr");
    EXPECT_EQ(__getLocale().getUserLanguage(), 2);
    EXPECT_EQ(narrow(translator.translate(u"Yes")), "Oui");
    EXPECT_EQ(translator.countAvailableLanguages(), 3) << "two letters decide";
    EXPECT_STREQ(translator.getLanguageCode(2), "fr");
    EXPECT_EQ(narrow(translator.getLanguageName(2)), "Fran\u00E7ais");
    EXPECT_EQ(translator.getLanguageName(3), nullptr);
    EXPECT_EQ(translator.getSelectedLanguageIndex(), 2);
    char code[3] = "";
    translator.getLanguage(code);
    EXPECT_STREQ(code, "fr");
}

TEST_F(TranslatorTest, FallsBackOnTheLocaleAndThenOnEnglish)
{
    write("user/lang.cfg", "f");
    write("app/translation.xml", kTexts);
    __getLocale().setUserLanguage(1);
    translator.initialize(false);
    EXPECT_STREQ(translator.getUserLanguageCode(), "de") << "one letter is no language";
    EXPECT_EQ(narrow(translator.translate(u"Yes")), "Ja");

    write("user/lang.cfg", "it");
    UTranslator other;
    other.initialize(false);
    EXPECT_STREQ(other.getUserLanguageCode(), "us") << "the file offers no Italian";
    EXPECT_EQ(other.countTranslations(), 0);
    EXPECT_EQ(__getLocale().getUserLanguage(), 0);
}

TEST_F(TranslatorTest, ShowsFaultsOfTheFileOnceAndKeepsWhatItRead)
{
    write("app/translation.xml", "\xEF\xBB\xBF<T><StringTable><String Key='Yes'><de>Ja</de>\n<x></String>");
    translator.initialize("de");
    EXPECT_EQ(alert.shown, "Xml Error: mismatched tag \r\nLine: 2|");
    EXPECT_EQ(narrow(translator.translate(u"Yes")), "Ja");

    alert.shown.clear();
    write("app/translation.xml", "<StringTable>\n<String>");
    UTranslator other;
    other.initialize("de");
    EXPECT_EQ(alert.shown, "The key is not set!\n<StringTable>\n<String>  <====== HERE ======  \nLine: 2|");
}

TEST_F(TranslatorTest, StaysEmptyWithoutAFile)
{
    translator.initialize("de");
    EXPECT_EQ(translator.countTranslations(), 0);
    EXPECT_EQ(alert.shown, "");
    FNPath missing(u"none.xml", FNPath::kAppFolder, FNPath::kFile, nullptr, false);
    EXPECT_FALSE(translator.addFile(&missing, true));
    write("app/none.xml", "");
    EXPECT_FALSE(translator.addFile(&missing, true));
}

TEST_F(TranslatorTest, ReadsAGivenFileOnly)
{
    write("app/translation.xml", kTexts);
    write("user/other.xml",
          "\xEF\xBB\xBF<T><StringTable><String Key='No'><de>Nein</de></String></StringTable></T>");
    FNPath file(u"other.xml", FNPath::kUserFolder, FNPath::kFile, nullptr, false);
    translator.initialize("de", &file);
    EXPECT_EQ(translator.countTranslations(), 1);
    EXPECT_EQ(narrow(translator.translate(u"No")), "Nein");
    translator.initialize("fr", nullptr);
    EXPECT_STREQ(translator.getUserLanguageCode(), "fr");
}

TEST_F(TranslatorTest, KeepsTheChoiceOfALanguageForTheNextStart)
{
    builtIn = kTexts;
    translator.selectLanguage(1);
    EXPECT_EQ(read("user/lang.cfg"), "") << "no languages are known yet";
    translator.initialize("de");
    translator.selectLanguage(1);
    EXPECT_EQ(read("user/lang.cfg"), "") << "it is selected already";
    translator.selectLanguage(2);
    EXPECT_EQ(read("user/lang.cfg"), "fr");
    EXPECT_EQ(alert.shown, "You must restart the application.|");

    struct Realtime : IRealtimeTranslator
    {
        const char16* translateForDrawing(const char16* text) override { return text; }
    } realtime;
    IRealtimeTranslator::theInstance = &realtime;
    translator.selectLanguage(0);
    IRealtimeTranslator::theInstance = nullptr;
    EXPECT_EQ(read("user/lang.cfg"), "us");
    EXPECT_EQ(alert.shown, "You must restart the application.|");
    translator.initialize(true);
    translator.selectLanguage(2);
    EXPECT_EQ(read("user/lang.cfg"), "us") << "a silent translator chooses nothing";
}

TEST_F(TranslatorTest, TellsLanguageDependents)
{
    struct Dependent : ILanguageDependent
    {
        void languageChanged() override { changes++; }
        int changes = 0;
    };
    Dependent first;
    {
        const Dependent second;
        EXPECT_EQ(LanguageDependents::instance().total(), 2);
    }
    EXPECT_EQ(LanguageDependents::instance().total(), 1);
    translator.initialize("de");
    EXPECT_EQ(first.changes, 1);

    struct Leaving : ILanguageDependent
    {
        void languageChanged() override { other.reset(); }
        std::unique_ptr<Dependent> other;
    } leaving;
    leaving.other = std::make_unique<Dependent>();
    LanguageDependents::instance().languageChanged();
    EXPECT_EQ(LanguageDependents::instance().total(), 2) << "one that went meanwhile is not told";
    EXPECT_EQ(first.changes, 2);
}

TEST_F(TranslatorTest, RemembersThousandsOfTexts)
{
    translator.initialize("de", nullptr);
    const std::u16string longText(30000, u'x');
    for (int i = 0; i < 5000; i++)
    {
        FString key, text;
        key.printf("key %d", i).toWideString();
        text.printf("text %d", i).toWideString();
        translator.addTranslation(key.text16(), "de", text.text16());
    }
    EXPECT_EQ(translator.addTranslation(u"long", "de", longText.c_str()), 0);
    EXPECT_EQ(translator.addTranslation(u"long", "de", u"x"), 1);
    EXPECT_EQ(translator.addTranslation(u"long", "it", u"x"), 1);
    EXPECT_EQ(translator.addTranslation(u"same", "us", u"same"), 1);
    EXPECT_EQ(translator.countTranslations(), 5001);
    EXPECT_EQ(translator.translate(u"long"), longText);
    EXPECT_EQ(narrow(translator.translate(u"key 4321")), "text 4321");
}
