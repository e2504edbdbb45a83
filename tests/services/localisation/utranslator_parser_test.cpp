#include "services/localisation/itranslationreceiver.h"
#include "services/localisation/utranslationchecker.h"
#include "services/localisation/utranslationparser.h"
#include "services/localisation/utranslationparserold.h"
#include "services/localisation/utranslationxmlhandlernew.h"
#include "services/localisation/utranslator.h"

#include <gtest/gtest.h>

#include <string>

namespace
{
std::string narrow(const ConstString& text)
{
    String copy(text);
    copy.toMultiByte(kEncodingUtf8);
    return copy.text8();
}

/// Writes down what a parser finds: "de=Deutsch;", "Yes>de:Ja;".
class Receiver : public ITranslationReceiver
{
public:
    void addLanguage(const char* code, const char16* name) override
    {
        record += std::string(code) + "=" + narrow(name) + ";";
    }
    int addTranslation(const char16* key, const char* language, const char16* text) override
    {
        record += narrow(key) + ">" + language + ":" + narrow(text) + ";";
        return narrow(text) == stopText ? kStop : kLeftOut;
    }

    std::string record;
    std::string stopText;
};

/// What is found, and behind "!" the message of a failure.
std::string found(const std::string& file, const char* stopText = "")
{
    Receiver receiver;
    receiver.stopText = stopText;
    UTranslationParser parser(file.data(), static_cast<int>(file.size()), receiver);
    if (parser.go(false))
        return receiver.record;
    const std::string message = narrow(parser.getMessage());
    return receiver.record + "!" + message.substr(0, message.find('\n'));
}

std::string newFile(const std::string& content)
{
    return "\xEF\xBB\xBF<T>" + content + "</T>";
}

bool isSound(const std::string& file, std::string& message, int& line)
{
    FString text;
    const bool result = UTranslator::verifySyntax(file.data(), static_cast<int>(file.size()), text, line);
    message = narrow(text);
    return result;
}
} // namespace

TEST(UTranslationParser, ReadsTheNewFormat)
{
    EXPECT_EQ(found(newFile("<LanguageTable><language key='de'>Deutsch</language>\n"
                            "<language key='jp'>\u65E5\u672C</language></LanguageTable>\n"
                            "<StringTable><String Key='Yes'><de>Ja</de> <jp>\u306F\u3044</jp></String>\n"
                            "<String Key='a\\nb\\t'><de>x\\n\u00E4&amp;</de></String></StringTable>")),
              "de=Deutsch;jp=\u65E5\u672C;Yes>de:Ja;Yes>jp:\u306F\u3044;a\nb\t>de:x\n\u00E4&;");
    EXPECT_EQ(found(newFile(
                  "<Other/><StringTable><Other/><String Key=''><de>x</de></String>"
                  "<String><de>x</de></String><String Key='k'><de></de><fr>y</fr></String></StringTable>")),
              "k>fr:y;")
        << "without key or text there is nothing to take";
    EXPECT_EQ(found(newFile("<StringTable><Other/><String Key='a'><de>x</de></String>"
                            "<String Key='b'>y<de>z</de>y<fr>z</fr></String></StringTable>")),
              "b>de:z;b>fr:z;")
        << "a foreign element ends the table, and the end of a text begins it again";
}

TEST(UTranslationParser, StopsAtFaultsOfTheNewFormat)
{
    const std::string stopped = "!Xml Error: parsing aborted \r";
    EXPECT_EQ(found(newFile("<LanguageTable><language>x</language></LanguageTable>")), stopped);
    EXPECT_EQ(found(newFile("<LanguageTable><language key='de'>x<b/></language></LanguageTable>")), stopped);
    EXPECT_EQ(
        found(newFile("<StringTable><String Key='k'><de>x</de><fr>y</fr><it>z</it></String></StringTable>"),
              "y"),
        "k>de:x;k>fr:y;" + stopped);
    EXPECT_EQ(found(newFile("<StringTable><String Key='k'><de>x</de><fr>y</String></StringTable>")),
              "k>de:x;!Xml Error: mismatched tag \r");
}

TEST(UTranslationParser, TellsTheFormatsApart)
{
    const std::string content = "<StringTable><String Key='k'><Translation language='de'>\u00E9</Translation>"
                                "</String></StringTable>";
    EXPECT_EQ(found("\xEF\xBB\xBF" + content), "k>Translation:\u00E9;");
    EXPECT_EQ(found("<?xml version='1.0' encoding=\"UTF-8\"?>" + content), "k>Translation:\u00E9;");
    EXPECT_EQ(found(content), "k>de:\u221A\u00A9;") << "8-bit text in the default encoding";
    EXPECT_EQ(found("<!--" + std::string(127, ' ') + "encoding=\"utf-8\"-->" + content),
              "k>de:\u221A\u00A9;");
    EXPECT_EQ(found(""), "!");
}

TEST(UTranslationParser, ReadsTheOldFormat)
{
    EXPECT_EQ(
        found("<?xml version='1.0'?><!-- note -->\n<Root a='1'>\n<LanguageTable>\n"
              "<language key=\"de\">Deutsch</language></LanguageTable>\n<StringTable>\n"
              "<String Key='Say &quot;a\\n&quot;'>\n <Translation language='de'>x &lt; y\\n</Translation>\n"
              "<Translation language='fr'/></String><String Key='b'/></StringTable></Root>\n"),
        "de=Deutsch;Say \"a\n\">de:x < y\n;");
}

TEST(UTranslationParserOld, NamesEachFault)
{
    const std::string text(32001, 'x');
    const std::string string = "<StringTable><String Key='k'>";
    const struct
    {
        std::string file;
        const char* message;
    } faults[] = {
        {"<a 1='x'>", "Attribute field not valid"},
        {"<a b>", "Attribute field not valid"},
        {"<a></b>", "Non expected end tag"},
        {"</a>", "Non expected end tag"},
        {"<a></ a>", "syntax error at end tag"},
        {"<a></a", "syntax error at end tag"},
        {"<a>", "syntax error at end tag"},
        {"<!DOCTYPE a>", "Non supported '<!' tag"},
        {"<!--" + text + "-->", "Too int32 comment"},
        {"<!--", "Non closed comment"},
        {"<a a='1' b='1' c='1' d='1' e='1' f='1' g='1' h='1' i='1'/>", "Too many attribute/value pairs"},
        {"<?" + text + "?>", "Too int32 processing instruction"},
        {"<?xml >", "Non closed processing instruction ( '<? ... ?>')"},
        {"<1>", "Name is not legal"},
        {"<" + text + ">", "Name too int32"},
        {"<a b=c>", "Attribute value invalid (or too int32)"},
        {"<a b='c", "Attribute value invalid (or too int32)"},
        {"<a b='" + text + "'/>", "Attribute value invalid (or too int32)"},
        {"text", "The context is not valid for raw text yet!"},
        {string + "x", "The context is not valid for raw text yet!"},
        {"<StringTable><String></String>", "The key is not set!"},
        {"<LanguageTable><language>x", "The language code is not set! Can't read a language name yet!"},
        {string + "<Translation>x", "The language is not set!"},
        {"<StringTable a='1'/>", "Attribute/value pairs are not supported"},
        {"<StringTable><Translation language='de'>", "You must set the string key first!"},
        {string + "<Translation language='de'>x<Translation language='fr'>",
         "You haven't finished the previous translation!"},
        {string + "<Translation language='de'>x<String Key='l'>",
         "You haven't finished the previous translation!"},
        {string + "<String Key='l'>", "The string key is already set!"},
    };
    for (const auto& fault : faults)
        EXPECT_EQ(found(fault.file), std::string("!") + fault.message) << fault.file.substr(0, 60);
}

TEST(UTranslationParserOld, MarksThePlaceOfAFault)
{
    Receiver receiver;
    const std::string file = "<a>\n<b c=d/></a>";
    UTranslationParserOld parser(file.data(), static_cast<int>(file.size()), receiver);
    EXPECT_FALSE(parser.parse());
    EXPECT_EQ(parser.getLine(), 2);
    FString message;
    parser.makeErrorMessage(message);
    EXPECT_EQ(narrow(message),
              "Attribute value invalid (or too int32)\n<a>\n<b c=  <====== HERE ======  d/></a>");
}

TEST(UTranslationParser, SurvivesDamagedFiles)
{
    for (const std::string intro : {"\xEF\xBB\xBF", "<?xml?>"})
    {
        const std::string file =
            intro + "<T><LanguageTable><language key='de'>D</language></LanguageTable><StringTable>"
                    "<String Key='&lt;'><Translation language='de'>x&amp;</Translation>"
                    "<!-- c --></String></StringTable></T>";
        for (size_t i = 0; i < file.size(); i++)
        {
            EXPECT_EQ(found(file.substr(0, i)).find('!') == std::string::npos,
                      i == intro.size() && intro[0] == '<')
                << i;
            for (const char byte : {'\0', '<', '"', '&', '\xFF'})
            {
                std::string damaged = file;
                damaged[i] = byte;
                found(damaged);
            }
        }
    }
}

TEST(UTranslationXmlHandlerNew, RemovesCodingFromTheLeft)
{
    FString text(u"\\n\\\\n\\tx\\y\\");
    UTranslationXmlHandlerNew::removeCppCoding(text);
    EXPECT_EQ(narrow(text), "\n\\\n\tx\\y\\");
}

TEST(UTranslationChecker, ComparesPrintfPlaces)
{
    const auto same = &UTranslationChecker::takeSameArguments;
    EXPECT_TRUE(same(u"%s of %i", u"%s von %d"));
    EXPECT_TRUE(same(u"100%% %5.2f", u"%f %%"));
    EXPECT_FALSE(same(u"%s of %i", u"%i von %s"));
    EXPECT_FALSE(same(u"%s", u"s"));
    EXPECT_FALSE(same(u"%s", u"%s %s"));
    EXPECT_FALSE(same(u"%lld", u"%d"));
    EXPECT_FALSE(same(u"%*d", u"%d"));
    EXPECT_TRUE(same(u"50 %", u"50"));
}

TEST(UTranslator, VerifiesFiles)
{
    std::string message;
    int line = 0;
    const std::string begin = "\xEF\xBB\xBF<T>\n<StringTable>\n<String Key='%s'>\n";
    const std::string end = "</String></StringTable></T>";
    EXPECT_TRUE(isSound(begin + "<de>%s!</de><fr>=</fr>" + end, message, line));
    EXPECT_FALSE(isSound(begin + "<de>x %i</de>" + end, message, line));
    EXPECT_EQ(message, "printf mismatch at line " + std::to_string(line));
    EXPECT_EQ(line, 3) << "a stopped parser counts from 0";
    EXPECT_FALSE(isSound(begin, message, line));
    EXPECT_EQ(message, "Xml Error: no element found \r\nLine: 4");

    EXPECT_FALSE(isSound("<StringTable>\n<String Key='%s'>\n<Translation language='de'>x</Translation>",
                         message, line));
    EXPECT_EQ(message, "printf mismatch at line 3");
}
