#pragma once

#include "foundation/object/types.h"

class FString;

/// The small questions that many parts of the program have for the user. *Main thread*.
///
/// Where no window can be opened nobody can type: each question is then written to the console and counts as
/// cancelled.
class UCommonDialog
{
public:
    /// Asks for both, beginning with what they hold. False where the user cancelled; both then stay as they were.
    static bool getNameAndPassword(const char16* title, FString& name, FString& password);
};
