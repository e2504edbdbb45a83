#pragma once

#include "foundation/text/fstring.h"

/// A token in clear for the length of a scope: decoded in place, and encoded in place again at its end.
///
/// One thread; nobody else may read the token meanwhile. A token that is no base64 is used as it stands.
class ClearToken
{
public:
    explicit ClearToken(FString& base64Token);
    ~ClearToken();
    ClearToken(const ClearToken&) = delete;
    ClearToken& operator=(const ClearToken&) = delete;

    const char* text8() const { return token.text8(); }

private:
    FString& token;
    bool isDecoded;
};
