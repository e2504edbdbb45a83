#pragma once

#include "foundation/object/types.h"

/// A translator that switches the language of a running program by replacing texts as they are drawn.
/// *Main thread.*
class IRealtimeTranslator
{
public:
    virtual ~IRealtimeTranslator() = default;

    /// The text to draw instead, or `text` itself.
    virtual const char16* translateForDrawing(const char16* text) = 0;

    /// Null where the language stays what it was at start. Borrowed.
    static inline IRealtimeTranslator* theInstance = nullptr;
};
