#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

/// One host product: its name, its identity at the service, and the user's token for it.
///
/// Main thread; the upload thread knows the product that is being served, and both reach its token by ClearToken only.
class VlmrApplication : public CmObject
{
    DECLARE_COPYABLE(VlmrApplication, CmObject)

    VlmrApplication(FString productName, FString client, FString word)
        : name(std::move(productName)),
          clientId(std::move(client)),
          schemeWord(std::move(word))
    {
    }

    FString name;
    FString clientId;
    /// The product's place in redirect URIs.
    FString schemeWord;
    /// In base64, never in clear except for the moment of use; empty without a login.
    FString accessToken;
};
