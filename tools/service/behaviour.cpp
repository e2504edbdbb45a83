#include "tools/service/behaviour.h"

#include <charconv>
#include <iterator>

namespace
{

struct Word
{
    Behaviour::Kind kind;
    const char* name;
    bool hasNumber;
};

constexpr Word kWords[] = {
    {Behaviour::Kind::accept, "accept", false}, {Behaviour::Kind::reply, "reply", false},
    {Behaviour::Kind::error, "error", false},   {Behaviour::Kind::errors, "errors", false},
    {Behaviour::Kind::status, "status", true},  {Behaviour::Kind::split, "split", false},
    {Behaviour::Kind::flood, "flood", true},    {Behaviour::Kind::close, "close", true},
    {Behaviour::Kind::reset, "reset", true},    {Behaviour::Kind::stall, "stall", true},
    {Behaviour::Kind::slow, "slow", true},      {Behaviour::Kind::deny, "deny", false},
};

/// Cuts the first word off `text`, with the blank behind it.
std::string takeWord(std::string& text)
{
    const std::size_t end = text.find(' ');
    const std::string word = text.substr(0, end);
    text.erase(0, end == std::string::npos ? end : end + 1);
    return word;
}

const Word* findWord(const std::string& name)
{
    for (const Word& word : kWords)
    {
        if (name == word.name)
            return &word;
    }
    return nullptr;
}

} // namespace

const char* nameOf(Behaviour::Kind kind)
{
    for (const Word& word : kWords)
    {
        if (word.kind == kind)
            return word.name;
    }
    return "";
}

std::optional<Behaviour> Behaviour::parse(const std::string& words)
{
    std::string rest = words;
    const Word* word = findWord(takeWord(rest));
    if (!word)
        return std::nullopt;

    Behaviour result;
    result.kind = word->kind;
    if (word->hasNumber)
    {
        const std::string digits = takeWord(rest);
        const char* end = digits.data() + digits.size();
        const auto [stop, failure] = std::from_chars(digits.data(), end, result.number);
        if (failure != std::errc() || stop != end || result.number < 0)
            return std::nullopt;
    }
    result.text = rest;
    return result;
}

std::vector<std::string> Behaviour::texts() const
{
    std::vector<std::string> result;
    std::size_t at = 0;
    while (true)
    {
        const std::size_t end = text.find('|', at);
        result.push_back(text.substr(at, end - at));
        if (end == std::string::npos)
            return result;
        at = end + 1;
    }
}
