#include "foundation/object/stringhash.h"

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

namespace
{
/// What has the remainder taken behind every character.
template <class Character>
unsigned hashByTheRule(const std::basic_string<Character>& text, unsigned size)
{
    unsigned hash = 0;
    for (const Character c : text)
        hash = ((hash << 6) + (sizeof(c) == 1 ? static_cast<unsigned>(static_cast<signed char>(c))
                                              : static_cast<unsigned>(c))) %
               size;
    return hash;
}

unsigned hashOf(const std::vector<char>& text, unsigned size)
{
    return hashString8(text.data(), text.size(), size);
}

unsigned hashOf(const std::vector<char16>& text, unsigned size)
{
    return hashString16(text.data(), text.size(), size);
}

/// Asks for as many buckets again and again, with texts that end where their memory does; every fourth isn't plain.
template <class Character>
void askOften(std::mt19937& random, unsigned size)
{
    for (unsigned i = 0; i < 1000; i++)
    {
        std::vector<Character> text(i % 41);
        const unsigned mask = i % 4 == 0 ? 0xFFFF : 0x7F;
        for (Character& character : text)
            character = static_cast<Character>(random() & mask);
        const std::basic_string<Character> copy(text.begin(), text.end());
        ASSERT_EQ(hashOf(text, size), hashByTheRule(copy, size)) << text.size() << " characters of " << size;
    }
}
} // namespace

TEST(StringHash, MultipliesBy64WithTheCharactersSign)
{
    EXPECT_EQ(hashString8("ab", 1000003), 97u * 64 + 98);
    EXPECT_EQ(hashString16(u"ab", 1000003), 97u * 64 + 98);
    EXPECT_EQ(hashString8("ab", 50), (97u % 50 * 64 + 98) % 50);
    EXPECT_EQ(hashString8("\xE4", 1000), (0xFFFFFFE4u) % 1000);
    EXPECT_EQ(hashString16(u"\u00E4", 1000), 0xE4u);
    EXPECT_EQ(hashString8(nullptr, 50), 0u);
    EXPECT_EQ(hashString16(u"", 50), 0u);
    EXPECT_EQ(hashString8("a name of some length", 0), 0u) << "no bucket at all";
}

TEST(StringHash, TakesTheRemainderBehindEveryCharacter)
{
    const std::string narrow[] = {"a longer name of forty characters or so", std::string(40, '\x7F'),
                                  "Gr\xC3\xB6\xC3\x9F", "mostly plain, one is not \xFF", "\x80"};
    const std::u16string wide[] = {u"a longer name of forty characters or so", std::u16string(40, u'\xFFFF'),
                                   u"Gr\u00F6\u00DFe"};
    for (const unsigned size : {1u, 2u, 50u, 1021u, 10007u, 1u << 25, (1u << 25) + 1, 0xFFFFFFFFu})
    {
        for (const std::string& text : narrow)
            for (size_t start = 0; start < text.size(); start++)
                EXPECT_EQ(hashString8(text.c_str() + start, size), hashByTheRule(text.substr(start), size))
                    << text << " from " << start << " of " << size;
        for (const std::u16string& text : wide)
            for (size_t start = 0; start < text.size(); start++)
                EXPECT_EQ(hashString16(text.c_str() + start, size), hashByTheRule(text.substr(start), size))
                    << "wide text from " << start << " of " << size;
    }
}

TEST(StringHash, StaysTheSameHoweverOftenANumberOfBucketsIsAskedFor)
{
    std::mt19937 random(1);
    for (const unsigned size : {1u, 2u, 3u, 1009u, 4096u, 15013u, 32767u, 32768u, 32769u, 65521u, 1u << 25})
    {
        askOften<char>(random, size);
        askOften<char16>(random, size);
    }
}
