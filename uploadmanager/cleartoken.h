#pragma once

#include "foundation/text/fstring.h"

/// A token in clear for the length of a scope: decoded in place, and encoded in place again at its end.
///
/// One thread; nobody else may read the token meanwhile.
class ClearToken
{
public:
    explicit ClearToken(FString& base64Token);
    ~ClearToken();
    ClearToken(const ClearToken&) = delete;
    ClearToken& operator=(const ClearToken&) = delete;

    const char* text8() const { return token.text8(); }
    /// Whether this can be a token of the service: it was base64, and holds nothing that a URL can't carry. What else
    /// stands in the file of tokens is as good as none.
    bool isUsable() const;

private:
    FString& token;
    bool isDecoded;
};
