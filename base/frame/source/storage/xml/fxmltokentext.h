#pragma once

#include "storage/xml/fxmlparser.h"

#include <cstring>

/// The bytes of a token as they are collected, in a buffer of `kMaxToken` + 1 bytes.
struct FXmlParser::TokenText
{
    explicit TokenText(char* target) : text(target) {}

    bool isFull() const { return length == kMaxToken; }
    /// False where the token would be too long.
    bool add(char c)
    {
        if (isFull())
            return false;
        text[length++] = c;
        return true;
    }
    bool add(const char* bytes, size_t count)
    {
        if (count > kMaxToken - length)
            return false;
        memcpy(text + length, bytes, count);
        length += count;
        return true;
    }
    void terminate() { text[length] = 0; }

    char* text;
    size_t length = 0;
};
