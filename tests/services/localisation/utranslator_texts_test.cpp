#include "foundation/text/fstring.h"
#include "services/localisation/itranslationreceiver.h"
#include "services/localisation/utranslationparser.h"
#include "services/localisation/utranslator.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
#include <set>
#include <string>

// The texts that are shipped with the program, compared with those that its sources have.

namespace
{
const std::set<std::string> kLanguages = {"de", "es", "fr", "it", "jp", "zh"};

std::string narrow(const ConstString& text)
{
    String copy(text);
    copy.toMultiByte(kEncodingUtf8);
    return copy.text8();
}

std::string contentOf(const std::filesystem::path& file)
{
    std::ifstream stream(file, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(stream), {});
}

std::string shippedTexts()
{
    return contentOf(std::filesystem::path(SOURCE_FOLDER) / "uploadmanager/resources/translation.xml");
}

std::string unescaped(const std::string& literal)
{
    std::string result;
    for (size_t i = 0; i < literal.size(); i++)
    {
        if (literal[i] == '\\' && literal[++i] == 'n')
            result += '\n';
        else
            result += literal[i];
    }
    return result;
}

/// The English texts of one source: each literal, or row of them, that a UTranslatedString is made of.
void collectKeys(const std::string& source, std::set<std::string>& keys)
{
    static const std::regex object(
        "UTranslatedString\\s*\\w*\\s*[({]\\s*((?:\"(?:[^\"\\\\]|\\\\.)*\"\\s*)+)");
    static const std::regex literal("\"((?:[^\"\\\\]|\\\\.)*)\"");
    for (std::sregex_iterator found(source.begin(), source.end(), object), end; found != end; ++found)
    {
        const std::string literals = (*found)[1];
        std::string key;
        for (std::sregex_iterator part(literals.begin(), literals.end(), literal); part != end; ++part)
            key += unescaped((*part)[1]);
        keys.insert(key);
    }
}

std::set<std::string> keysOfSources()
{
    std::set<std::string> keys;
    for (const char* folder : {"base", "uploadmanager"})
        for (const auto& entry :
             std::filesystem::recursive_directory_iterator(std::filesystem::path(SOURCE_FOLDER) / folder))
            if (entry.path().extension() == ".cpp" || entry.path().extension() == ".h")
                collectKeys(contentOf(entry.path()), keys);
    return keys;
}

class Collector : public ITranslationReceiver
{
public:
    void addLanguage(const char* code, const char16* name) override { languages[code] = narrow(name); }
    int addTranslation(const char16* key, const char* language, const char16* text) override
    {
        EXPECT_TRUE(translations[narrow(key)].emplace(language, narrow(text)).second)
            << narrow(key) << " twice";
        return kTaken;
    }

    std::map<std::string, std::string> languages;
    std::map<std::string, std::map<std::string, std::string>> translations;
};

Collector collect()
{
    const std::string file = shippedTexts();
    Collector collector;
    UTranslationParser parser(file.data(), static_cast<int>(file.size()), collector);
    EXPECT_TRUE(parser.go(false)) << narrow(parser.getMessage());
    return collector;
}
} // namespace

TEST(ShippedTexts, AreSound)
{
    const std::string file = shippedTexts();
    ASSERT_EQ(file.substr(0, 3), "\xEF\xBB\xBF");
    FString message;
    int line = 0;
    EXPECT_TRUE(UTranslator::verifySyntax(file.data(), static_cast<int>(file.size()), message, line))
        << narrow(message);
}

TEST(ShippedTexts, OfferSixLanguagesAndEnglish)
{
    const Collector shipped = collect();
    EXPECT_EQ(shipped.languages.size(), 7u);
    EXPECT_EQ(shipped.languages.count("us"), 1u);
    for (const std::string& language : kLanguages)
        EXPECT_EQ(shipped.languages.count(language), 1u) << language;
}

TEST(ShippedTexts, TranslateEveryTextOfTheSources)
{
    const Collector shipped = collect();
    const std::set<std::string> keys = keysOfSources();
    EXPECT_GT(keys.size(), 40u);
    for (const std::string& key : keys)
    {
        const auto found = shipped.translations.find(key);
        ASSERT_NE(found, shipped.translations.end()) << key;
        for (const std::string& language : kLanguages)
            EXPECT_EQ(found->second.count(language), 1u) << language << " of " << key;
    }
    for (const auto& [key, texts] : shipped.translations)
        EXPECT_EQ(keys.count(key), 1u) << "no source has " << key;
}

// A text keeps its lines and the blank at its end, to which something is joined.
TEST(ShippedTexts, KeepTheShapeOfTheirKeys)
{
    for (const auto& [key, texts] : collect().translations)
        for (const auto& [language, text] : texts)
        {
            if (text == "=")
                continue;
            EXPECT_EQ(std::count(key.begin(), key.end(), '\n'), std::count(text.begin(), text.end(), '\n'))
                << text;
            // Chinese and Japanese need no blank behind their punctuation.
            const bool hasBlanks = language != "zh" && language != "jp";
            EXPECT_TRUE(!hasBlanks || (key.back() == ' ') == (text.back() == ' ')) << text;
            EXPECT_NE(text, key) << "\"=\" says that";
        }
}
