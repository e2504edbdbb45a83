#include "uploadmanager/cleartoken.h"

#include "foundation/text/fbase64.h"

ClearToken::ClearToken(FString& base64Token) : token(base64Token), isDecoded(FBase64::decode(base64Token)) {}

ClearToken::~ClearToken()
{
    if (isDecoded)
        FBase64::encode(token);
}
