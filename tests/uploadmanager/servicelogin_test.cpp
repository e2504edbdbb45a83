#include "tests/uploadmanager/applicationfixture.h"

#include "containers/keyed/cmdictionary.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmtmpstring.h"
#include "uploadmanager/urlaspath.h"
#include "uploadmanager/vlmrapplication.h"

#include <map>
#include <sys/stat.h>

namespace
{
using Values = std::map<std::string, std::string>;

class ServiceLogin : public ApplicationTest
{
protected:
    bool parse(const char* url, Values& values)
    {
        CmDictionary dictionary;
        dictionary.setOwnership(CmContainer::kTaken);
        IPtr<UrlAsPath> path = adopt(new UrlAsPath(url));
        bool isParsed = app->parseUrl(path, dictionary);
        for (const char16* key : {u"code", u"access_token", u"scope", u"error", u"a", u"b"})
        {
            CmTmpString name(key);
            if (CmString* value = FCast(CmString, dictionary.lookupObject(&name)))
                values[FString(key).text8()] = FString(*value).text8();
        }
        return isParsed;
    }
    bool redirect(const char* url)
    {
        IPtr<UrlAsPath> path = adopt(new UrlAsPath(url));
        return app->handleRedirect(path);
    }
    std::string fatal() { return ApplicationProbe::fatalError(*app); }
    std::string token(const char* product)
    {
        return ApplicationProbe::product(*app, product)->accessToken.text8();
    }
};
} // namespace

TEST_F(ServiceLogin, TakesQueryAndFragmentApart)
{
    Values values;
    EXPECT_TRUE(parse("vlmr://plenar/successfullLogin?code=12%41#access_token=ab/", values));
    EXPECT_EQ(values, (Values{{"code", "12A"}, {"access_token", "ab/"}}))
        << "a delimiter at the end belongs to it";

    values.clear();
    EXPECT_TRUE(parse("vlmr://plenar/successfullLogin", values));
    EXPECT_TRUE(values.empty());

    values.clear();
    EXPECT_FALSE(parse("vlmr://plenar/x?a=1&plain&b=2", values));
    EXPECT_EQ(values, (Values{{"a", "1"}})) << "what stands before the bad part is kept";

    values.clear();
    EXPECT_FALSE(parse("vlmr://plenar/x?a=1#code=2&b=3#scope=4", values))
        << "the part that moves up behind a split one is not looked at";
}

TEST_F(ServiceLogin, RefusesMorePairsThanAServiceWouldSend)
{
    std::string url = "vlmr://plenar/x?a=1";
    for (int i = 1; i < 1000; i++)
        url += "&k" + std::to_string(i) + "=v";
    Values values;
    EXPECT_TRUE(parse(url.c_str(), values));
    EXPECT_EQ(values, (Values{{"a", "1"}}));

    values.clear();
    EXPECT_FALSE(parse((url + "#k=v").c_str(), values));
    EXPECT_TRUE(values.empty());
}

TEST_F(ServiceLogin, StoresTheTokenOfTheProductThatTheUrlNames)
{
    EXPECT_TRUE(redirect("vlmr://zentor/successfullLogin?code=1#access_token=1-2-secret"));
    EXPECT_EQ(token("Zentor"), "MS0yLXNlY3JldA==");
    EXPECT_EQ(token("Plenar"), "");
    EXPECT_TRUE(ApplicationProbe::quitsAtIdle(*app)) << "no description waits";
    EXPECT_EQ(read(userFile("scat.xml")),
              "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<scat>\r"
              "   <string name=\"Zentor\" value=\"MS0yLXNlY3JldA==\"/>\r</scat>\r");
    struct stat status = {};
    ASSERT_EQ(stat(userFile("scat.xml").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777u, 0600u);

    restart();
    EXPECT_EQ(token("Zentor"), "MS0yLXNlY3JldA==") << "the next process finds it";
    EXPECT_TRUE(redirect("vlmr://plenar/successfullLogin?code=1#access_token=x"));
    restart();
    EXPECT_EQ(token("Zentor"), "MS0yLXNlY3JldA==") << "other products keep theirs";
    EXPECT_EQ(token("Plenar"), "eA==");
}

TEST_F(ServiceLogin, TakesTheFirstProductWhoseWordOccursAnywhere)
{
    EXPECT_TRUE(redirect("vlmr://fennic/successfullLogin?code=plenar#access_token=x"));
    EXPECT_EQ(token("Plenar"), "eA==");
    EXPECT_EQ(token("Fennic"), "");
}

TEST_F(ServiceLogin, LogsOutTheNamedProductOrElseTheDefaultOne)
{
    redirect("vlmr://zentor/successfullLogin?code=1#access_token=x");
    redirect("vlmr://loomrit/successfullLogin?code=1#access_token=y");
    EXPECT_TRUE(redirect("vlmr://logout/Zentor"));
    restart();
    EXPECT_EQ(token("Zentor"), "");
    EXPECT_EQ(token("Loomrit"), "eQ==");
    EXPECT_TRUE(redirect("vlmr://logout"));
    EXPECT_TRUE(ApplicationProbe::quitsAtIdle(*app));
    restart();
    EXPECT_EQ(token("Loomrit"), "");
}

TEST_F(ServiceLogin, ShowsTheServicesErrorWithBlanksForPlusSigns)
{
    EXPECT_TRUE(redirect("vlmr://plenar/x?error=access_denied&error_description=The+end-user+denied"));
    EXPECT_EQ(fatal(), "SoundCloud answered:\naccess_denied\nThe end-user denied");
}

TEST_F(ServiceLogin, RefusesRedirectsWithoutData)
{
    EXPECT_TRUE(redirect("vlmr://plenar/successfullLogin"));
    EXPECT_EQ(fatal(), "Internal program error.\nError Code: 9");
}

TEST_F(ServiceLogin, KeepsTheFirstErrorOfAnUnreadableRedirect)
{
    EXPECT_TRUE(redirect("vlmr://plenar/successfullLogin?plain"));
    EXPECT_EQ(fatal(), "Internal program error.\nError Code: 22");
}

TEST_F(ServiceLogin, StopsAtASecondRedirectOfARunButStoresItsToken)
{
    redirect("vlmr://plenar/successfullLogin?code=1#access_token=x");
    redirect("vlmr://plenar/successfullLogin?code=1#access_token=y");
    EXPECT_EQ(token("Plenar"), "eQ==");
    EXPECT_EQ(fatal(), "");
}
