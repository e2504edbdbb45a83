#include "views/dialog/uconsole.h"

#include "foundation/text/fstring.h"

#include <cstdio>
#include <cstdlib>

UConsole::UConsole() : answers(getenv("VELLAMOOR_ANSWERS")) {}

UConsole& UConsole::instance()
{
    static UConsole console;
    return console;
}

int UConsole::alert(const char16* text, bool isQuestion, int buttonCount)
{
    print(text);
    if (!isQuestion)
        return 1;
    const int answer = takeAnswer(buttonCount);
    return answer > 0 ? answer : buttonCount;
}

int UConsole::takeAnswer(int buttonCount)
{
    if (!answers || !*answers)
        return 0;

    char* end = nullptr;
    const long answer = strtol(answers, &end, 10);
    const bool isNumber = end != answers && (*end == ',' || *end == '\0');
    // Whatever stands there is used up.
    while (*end && *end != ',')
        end++;
    answers = *end ? end + 1 : end;
    return isNumber && answer >= 1 && answer <= buttonCount ? static_cast<int>(answer) : 0;
}

void UConsole::print(const ConstString& line)
{
    FString text(line);
    text.append("\n");
    text.toMultiByte(kEncodingUtf8);
    // At once, so that the lines of several processes on one terminal don't mix.
    fwrite(text.text8(), 1, text.length(), stderr);
    fflush(stderr);
}
