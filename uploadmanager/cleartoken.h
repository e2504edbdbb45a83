#pragma once

#include "foundation/text/fstring.h"
#include "foundation/thread/flockscope.h"

/// A token in clear for the length of a scope: decoded in place, and encoded in place again at its end.
///
/// A description may come while the upload thread sends its form, and both use the product's token; so one lock,
/// held for the scope, keeps them apart. Thread-safe, as long as tokens are read and written by this class alone.
class ClearToken
{
public:
    explicit ClearToken(FString& base64Token);
    ~ClearToken();
    ClearToken(const ClearToken&) = delete;
    ClearToken& operator=(const ClearToken&) = delete;

    /// Gives a token a new value, in base64.
    static void replace(FString& base64Token, const FString& value);

    const char* text8() const { return token.text8(); }
    /// Whether this can be a token of the service: it is there, was base64, and holds nothing that a URL can't carry.
    /// What else stands in the file of tokens is as good as none.
    bool isUsable() const;

private:
    FLockScope guard;
    FString& token;
    bool isDecoded;
};
