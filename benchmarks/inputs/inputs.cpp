#include "benchmarks/inputs/inputs.h"

#include <bit>
#include <cmath>
#include <cstdio>

namespace
{
constexpr const char* kWords[] = {"volume", "window", "track", "colour",  "evening", "metronome",
                                  "left",   "record", "input", "latency", "walk",    "position",
                                  "fade",   "buffer", "title", "marker"};
constexpr const char* kAccented[] = {"Übergang", "façade", "señal", "Größe",
                                     "naïve",    "€ 12",   "déjà",  "smørrebrød"};
constexpr const char* kJapanese[] = {"設定を保存", "音量", "窓の位置",     "録音を開始しました。",
                                     "トラック",   "入力", "、夕方の散歩", "メトロノームの色"};

/// Random numbers that are the same in every run. Classes of the standard library may differ between versions.
class Numbers
{
public:
    explicit Numbers(uint64 start) : state(start) {}
    uint64 next()
    {
        state = state * 6364136223846793005u + 1442695040888963407u;
        return state ^ state >> 31;
    }
    unsigned below(unsigned limit) { return static_cast<unsigned>((next() >> 24) % limit); }
    double fraction() { return static_cast<double>(next() >> 11) * 0x1p-53; }

private:
    uint64 state;
};

template <size_t Count>
const char* pick(Numbers& numbers, const char* const (&words)[Count])
{
    return words[numbers.below(Count)];
}

std::string wordsOf(Numbers& numbers, unsigned count)
{
    std::string text = pick(numbers, kWords);
    for (unsigned i = 1; i < count; i++)
        text += std::string(" ") + pick(numbers, kWords);
    return text;
}

std::string numbered(Numbers& numbers, unsigned number)
{
    return std::string(pick(numbers, kWords)) + ' ' + std::to_string(number);
}

template <class... Arguments>
std::string formatted(const char* format, Arguments... arguments)
{
    char text[512];
    snprintf(text, sizeof(text), format, arguments...);
    return text;
}

// Settings

std::string settingsLine(Numbers& numbers, unsigned index)
{
    const std::string name = numbered(numbers, index);
    const unsigned kind = numbers.below(4);
    if (kind < 2)
        return formatted("      <int name=\"%s\" value=\"%u\"/>\r", name.c_str(), numbers.below(100000));
    if (kind == 2)
        return formatted("      <float name=\"%s\" value=\"%.50g\"/>\r", name.c_str(),
                         1000 * numbers.fraction());
    return formatted("      <string name=\"%s\" value=\"%s\"/>\r", name.c_str(), wordsOf(numbers, 3).c_str());
}

std::string makeSettings()
{
    constexpr size_t kSize = 20'000'000;
    Numbers numbers(1);
    std::string text = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<Settings>\r";
    for (unsigned member = 0; text.size() < kSize; member++)
    {
        text += formatted("   <member name=\"group %u\">\r", member);
        for (unsigned i = 0; i < 100; i++)
            text += settingsLine(numbers, i);
        text += "   </member>\r";
    }
    return text + "</Settings>\r";
}

// Skin

std::string skinAttributes(Numbers& numbers, unsigned index)
{
    std::string text =
        formatted(" name=\"%s\" size=\"%u,%u,%u,%u\" attach=\"left right\"", numbered(numbers, index).c_str(),
                  numbers.below(400), numbers.below(300), numbers.below(200), numbers.below(40));
    constexpr const char* kFurther[] = {" style=\"Standard Button\"", " title=\"Save &amp; Close\"",
                                        " options=\"border transparent\"", " color=\"#FF8040C0\""};
    for (unsigned i = numbers.below(5); i > 0; i--)
        text += kFurther[i - 1];
    return text;
}

void addSkinElement(std::string& text, Numbers& numbers, unsigned depth)
{
    constexpr const char* kTags[] = {"view", "control", "layout", "bitmap", "label", "slider"};
    const char* tag = pick(numbers, kTags);
    const std::string tabs(depth, '\t');
    text += tabs + '<' + tag + skinAttributes(numbers, depth);
    if (depth == 5)
    {
        text += numbers.below(8) == 0 ? '>' + wordsOf(numbers, 4) + "</" + tag + ">\n" : std::string("/>\n");
        return;
    }
    text += ">\n";
    for (unsigned i = 0; i < 3; i++)
        addSkinElement(text, numbers, depth + 1);
    text += tabs + "</" + tag + ">\n";
}

std::string makeSkin()
{
    constexpr size_t kSize = 2'000'000;
    Numbers numbers(2);
    std::string text = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<Skin>\n";
    for (unsigned screen = 0; text.size() < kSize; screen++)
    {
        text += formatted("\t<!-- screen %u: %s -->\n", screen, wordsOf(numbers, 5).c_str());
        addSkinElement(text, numbers, 1);
    }
    return text + "</Skin>\n";
}

// Tree

std::u16string makeValueText(Numbers& numbers)
{
    const std::string words = wordsOf(numbers, 2 + numbers.below(3));
    std::u16string text(words.begin(), words.end());
    if (numbers.below(8) == 0)
        text += u" Größe 音量";
    return text.substr(0, 30);
}

std::vector<Inputs::Member> makeTree()
{
    Numbers numbers(3);
    std::vector<Inputs::Member> members;
    for (unsigned i = 0; i < 1000; i++)
    {
        Inputs::Member member{numbered(numbers, (i * 617) % 1000), {}};
        for (unsigned k = 0; k < 100; k++)
        {
            const unsigned kind = numbers.below(4);
            Inputs::Value value{
                numbered(numbers, (k * 37) % 100), kind < 2 ? 0 : static_cast<int>(kind) - 1, 0, 0, {}};
            value.integer = static_cast<int64>(numbers.below(1000000));
            value.number = 1000 * numbers.fraction();
            value.text = makeValueText(numbers);
            member.values.push_back(value);
        }
        members.push_back(member);
    }
    return members;
}

// Texts

constexpr size_t kTextSize = 16384;

std::string makeMixed()
{
    Numbers numbers(5);
    std::string text;
    while (text.size() < kTextSize)
        text += std::string(numbers.below(8) == 0 ? pick(numbers, kAccented) : pick(numbers, kWords)) + ' ';
    return text;
}

std::string makeJapanese()
{
    Numbers numbers(6);
    std::string text;
    while (text.size() < kTextSize)
        text += pick(numbers, kJapanese);
    return text;
}

std::string makeAscii()
{
    Numbers numbers(4);
    return wordsOf(numbers, 10000).substr(0, kTextSize);
}

std::vector<std::string> makeFileNames()
{
    Numbers numbers(7);
    std::vector<std::string> names;
    for (int i = 0; i < 1000; i++)
        names.push_back(formatted("Track %u take %u.wav", numbers.below(30), numbers.below(200)));
    return names;
}

template <class Make>
std::vector<double> makeDoubles(uint64 start, Make make)
{
    Numbers numbers(start);
    std::vector<double> values;
    while (values.size() < 1000)
        if (const double value = make(numbers); std::isfinite(value))
            values.push_back(value);
    return values;
}
} // namespace

namespace Inputs
{
const std::string& settingsFile()
{
    static const std::string text = makeSettings();
    return text;
}

const std::string& skinFile()
{
    static const std::string text = makeSkin();
    return text;
}

const std::vector<Member>& tree()
{
    static const std::vector<Member> members = makeTree();
    return members;
}

const std::string& asciiText()
{
    static const std::string text = makeAscii();
    return text;
}

const std::string& mixedText()
{
    static const std::string text = makeMixed();
    return text;
}

const std::string& japaneseText()
{
    static const std::string text = makeJapanese();
    return text;
}

const std::vector<std::string>& fileNames()
{
    static const std::vector<std::string> names = makeFileNames();
    return names;
}

const std::vector<double>& shortDoubles()
{
    static const std::vector<double> values =
        makeDoubles(8, [](Numbers& numbers) { return numbers.below(20000) / 100.0 - 60; });
    return values;
}

const std::vector<double>& plainDoubles()
{
    static const std::vector<double> values =
        makeDoubles(9, [](Numbers& numbers) { return 1000 * numbers.fraction(); });
    return values;
}

const std::vector<double>& wideDoubles()
{
    static const std::vector<double> values =
        makeDoubles(10, [](Numbers& numbers) { return std::bit_cast<double>(numbers.next()); });
    return values;
}
} // namespace Inputs
