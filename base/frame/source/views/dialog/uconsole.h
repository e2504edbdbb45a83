#pragma once

#include "foundation/object/types.h"

class ConstString;

/// Speaks to the user where no window can be opened: on standard error.
///
/// Nobody is there to press a button. A question takes its last one, or what VELLAMOOR_ANSWERS says: the numbers of
/// the buttons for the questions of this run in their order, separated by commas ("1,2"). Everything else takes its
/// first. *Main thread*.
class UConsole
{
public:
    static UConsole& instance();

    /// Writes the text as one block and gives the number of the button that answers it.
    int alert(const char16* text, bool isQuestion, int buttonCount);
    /// Writes one line.
    void print(const ConstString& line);

private:
    UConsole();

    /// The next of the given answers; 0 where there is none, or none that counts a button.
    int takeAnswer(int buttonCount);

    const char* answers;
};
