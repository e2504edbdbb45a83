#include "tests/uploadmanager/applicationfixture.h"

#include "foundation/object/iptr.h"
#include "uploadmanager/cleartoken.h"
#include "uploadmanager/deprecatedcurl.h"
#include "uploadmanager/uploadform.h"

using UploadFormTest = ApplicationTest;

TEST_F(UploadFormTest, TellsOfARefusedFieldButNeverTheToken)
{
    IPtr<UploadRequest> request = adopt(new UploadRequest);
    request->path = FNPath(u"/music/a.wav", FPath::kFile);
    CallbackData data;
    data.app = app;
    data.request = request;
    curl_httppost* first = nullptr;
    curl_httppost* last = nullptr;
    // Two names are refused.
    vlmr_curl_formadd2(&first, &last, kFormName, "track[title]", kFormName, "夜", data);
    vlmr_curl_formadd2(&first, &last, kFormName, "oauth_token", kFormName, "secret", data);
    EXPECT_EQ(
        ApplicationProbe::uploadErrors(*app),
        (Texts{"Could not set SoundCloud parameter \"track[title]\" to \"夜\" for file \"/music/a.wav\".",
               "SoundCloud error code: 2",
               "Could not set SoundCloud parameter \"oauth_token\" to \"...\" for file \"/music/a.wav\".",
               "SoundCloud error code: 2"}));
    freeForm(first);
}

TEST_F(UploadFormTest, HasATokenInClearForAMomentOnly)
{
    FString token("MS0yLXNlY3JldA==");
    {
        ClearToken clear(token);
        EXPECT_STREQ(clear.text8(), "1-2-secret");
        EXPECT_TRUE(clear.isUsable());
    }
    EXPECT_STREQ(token.text8(), "MS0yLXNlY3JldA==");

    // Nothing, no base64, base64 of a line feed, of a byte that is no ASCII.
    for (const char* bad : {"", "secret", "YQpi", "w6Q="})
    {
        FString text(bad);
        EXPECT_FALSE(ClearToken(text).isUsable()) << bad;
        EXPECT_FALSE(ClearToken(text).isUsable()) << bad << ", asked again";
    }
}
