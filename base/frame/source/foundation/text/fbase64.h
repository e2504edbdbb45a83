#pragma once

class FString;

/// Base64 with the standard alphabet and "=" at the end, in place, for 7-bit text only. Thread-safe.
class FBase64
{
public:
    /// False, with the text as it was, if it is empty or holds a byte above 127.
    static bool encode(FString& text);
    /// False, with the text as it was, if it isn't well formed or would give a byte above 127.
    static bool decode(FString& text);
};
