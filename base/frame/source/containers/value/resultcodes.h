#pragma once

#include "foundation/object/types.h"

/// What the interfaces of values give for an argument that they can't take; 0 is success.
inline constexpr int32 kResultInvalidArgument = 2;

/// Answers a question for a number through an interface.
inline int32 answerNumber(int* result, unsigned number)
{
    if (!result)
        return kResultInvalidArgument;
    *result = static_cast<int>(number);
    return kResultOk;
}
