#pragma once

#include "foundation/object/types.h"

#include <string>
#include <vector>

// What the benchmarks read and write: made by rules, the same in every run.
namespace Inputs
{
/// A settings file of about 20 MB as the XML archive writes them: members of 100 values, a value a line, half of them
/// integers, a quarter each of 8-bit texts and doubles. Lines are indented by three blanks a level and end in CR.
const std::string& settingsFile();

/// The description of screens, about 2 MB: elements nested five deep with three to seven attributes, one element a
/// line, indented by tabs, ended by LF; a comment before each screen, a text in every eighth element.
const std::string& skinFile();

struct Value
{
    std::string name;
    /// 0 an integer, 1 a double, 2 a text.
    int kind;
    int64 integer;
    double number;
    std::u16string text;
};
struct Member
{
    std::string name;
    std::vector<Value> values;
};
/// 1,000 members of 100 values each: half integers, a quarter doubles between 0 and 1000 with all their digits, a
/// quarter texts of ten to thirty characters, every eighth of them with letters beyond ASCII. The names of members
/// and of the values in each are in no order.
const std::vector<Member>& tree();

/// 16 KiB of UTF-8 each: English words; the same with an accented letter or a sign in about every eighth word;
/// Japanese sentences.
const std::string& asciiText();
const std::string& mixedText();
const std::string& japaneseText();

/// 1,000 names of files as users number them: "Track 7 take 12.wav".
const std::vector<std::string>& fileNames();

/// 1,000 doubles each: gains and positions with few digits, as settings have them; random ones between 0 and 1000,
/// with all digits; random ones of every magnitude.
const std::vector<double>& shortDoubles();
const std::vector<double>& plainDoubles();
const std::vector<double>& wideDoubles();
} // namespace Inputs
