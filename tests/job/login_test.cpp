#include "tests/job/job.h"

#include <array>

namespace fs = std::filesystem;

namespace
{

constexpr const char* kLoomritClient = "2b3c4d5e6f708192a3b4c5d6e7f8091a";
constexpr const char* kCache = "Vellamoor Upload Manager Cache";

class Login : public Job
{
protected:
    static fs::perms modeOf(const std::string& path) { return fs::status(path).permissions(); }

    /// Lets the first process go to the browser, which waits at the login page until the service is released.
    void goToTheBrowser(const std::string& file)
    {
        service->plan("/connect stall 0");
        run({file});
        ASSERT_TRUE(service->waitForStalled(1, kHangs));
    }

    void answerTheLogin()
    {
        service->release();
        ASSERT_TRUE(waitForBrowser("program ended with "));
        EXPECT_EQ(browserLines().at(2).substr(0, 14), "redirect vlmr:");
    }

    std::string redirectUrl(const std::string& product = "loomrit") const
    {
        return "vlmr://" + product + "/successfullLogin?code=1#access_token=" + token();
    }
};

constexpr fs::perms kOwnerOnly = fs::perms::owner_read | fs::perms::owner_write;

} // namespace

TEST_F(Login, GoesThroughTheBrowserAndASecondProcess)
{
    const std::string file = writeDescription(minimal());
    goToTheBrowser(file);

    EXPECT_EQ(openedUrls(), std::vector<std::string>{connectUrl(kLoomritClient, "loomrit")});
    EXPECT_TRUE(exists(file)) << "the second process needs it";
    EXPECT_EQ(contentsOf(userFile(kCache)),
              attributeFile("VellamoorUploadManagerCache", {{"latest request file", file}}, true));
    EXPECT_EQ(modeOf(userFile(kCache)), kOwnerOnly);
    EXPECT_EQ(modeOf(userFolder), fs::perms::owner_all);
    EXPECT_TRUE(received("/me").empty()) << "there is no token to check";

    answerTheLogin();

    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", base64(token())}}));
    EXPECT_EQ(modeOf(userFile("scat")), kOwnerOnly);
    EXPECT_FALSE(exists(userFile(kCache)));
    EXPECT_FALSE(exists(file));
    ASSERT_EQ(received("/tracks").size(), 1u);
    EXPECT_EQ(received("/tracks")[0].field("oauth_token")->text, token());
    ASSERT_TRUE(waitForBrowser("status 200"));
    EXPECT_EQ(openedUrls().size(), 2u);
    EXPECT_HOLDS(openedUrls().back(), "/edit");
}

TEST_F(Login, IsAskedForAgainWhereTheServiceRefusesTheToken)
{
    logIn("Loomrit", "outlived");
    const std::string file = writeDescription(minimal());
    goToTheBrowser(file);
    EXPECT_EQ(received("/me").size(), 1u);

    answerTheLogin();
    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_FALSE(exists(file));
}

TEST_F(Login, IsAskedForOnceWhereTheHostRequiresIt)
{
    logIn();
    SampleDescription description = minimal();
    description.configuration({{"RequireLogin", "true"}});
    goToTheBrowser(writeDescription(description));
    EXPECT_TRUE(received("/tracks").empty());

    answerTheLogin();
    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_EQ(received("/connect").size(), 1u);
}

TEST_F(Login, UsesTheWordAndClientOfEachProduct)
{
    const std::vector<std::array<const char*, 3>> products = {
        {"Plenar", "0f1e2d3c4b5a69788796a5b4c3d2e1f0", "plenar"},
        {"Zentor", "1a2b3c4d5e6f708192a3b4c5d6e7f809", "zentor"},
        {"Fennic", "3c4d5e6f708192a3b4c5d6e7f8091a2b", "fennic"}};
    std::vector<std::string> expected;
    for (const auto& [name, client, word] : products)
    {
        service->plan("/connect status 500 closed");
        run({writeDescription(minimal(name))});
        expected.push_back(connectUrl(client, word));
        ASSERT_TRUE(waitUntil([&] { return openedUrls().size() == expected.size(); }));
    }
    EXPECT_EQ(openedUrls(), expected);
}

TEST_F(Login, KeepsTheTokensOfTheOtherProducts)
{
    writeUserFile("scat", attributeFile("scat", {{"Plenar", base64("other")}, {"Zentor", ""}}));
    run({redirectUrl("fennic")});
    EXPECT_EQ(
        contentsOf(userFile("scat")),
        attributeFile("scat", {{"Fennic", base64(token())}, {"Plenar", base64("other")}, {"Zentor", ""}}));
}

TEST_F(Login, WithoutAWaitingDescriptionSavesTheTokenAndEnds)
{
    const std::string printed = run({redirectUrl()});
    EXPECT_EQ(printed, "");
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", base64(token())}}));
    EXPECT_TRUE(service->received().empty());
}

TEST_F(Login, RefusedByTheUserTellsSoAndKeepsTheDescription)
{
    service->plan("/connect deny");
    const std::string file = writeDescription(minimal());
    run({file});
    ASSERT_TRUE(waitForBrowser("program ended with "));
    EXPECT_TRUE(exists(file));
    EXPECT_TRUE(exists(userFile(kCache)));
    EXPECT_FALSE(exists(userFile("scat")));

    const std::string printed =
        run({"vlmr://loomrit/successfullLogin?error=access_denied&error_description=The+end-user+denied+it"});
    EXPECT_HOLDS(printed, "SoundCloud answered:\naccess_denied\nThe end-user denied it");
    EXPECT_TRUE(exists(file)) << "a later login still finds it";

    run({redirectUrl()});
    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_FALSE(exists(file));
}

TEST_F(Login, OfALaterDescriptionDeletesTheOneThatWaited)
{
    service->plan("/connect status 500 closed");
    service->plan("/connect status 500 closed");
    const std::string first = writeDescription(minimal(), "first.xml");
    run({first});
    const std::string second = writeDescription(minimal(), "second.xml");
    run({second});
    EXPECT_FALSE(exists(first));
    EXPECT_TRUE(exists(second));
}

TEST_F(Login, LogoutEmptiesTheTokenOfTheNamedProduct)
{
    writeUserFile("scat", attributeFile("scat", {{"Loomrit", base64("one")}, {"Plenar", base64("two")}}));
    EXPECT_EQ(run({"vlmr://logout/Plenar"}), "");
    EXPECT_EQ(contentsOf(userFile("scat")),
              attributeFile("scat", {{"Loomrit", base64("one")}, {"Plenar", ""}}));

    EXPECT_EQ(run({"vlmr://logout/Somebody"}), "");
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", ""}, {"Plenar", ""}}));
}

TEST_F(Login, LogoutWithoutAnyTokenMakesNone)
{
    EXPECT_EQ(run({"vlmr://logout/Plenar"}), "");
    EXPECT_FALSE(exists(userFile("scat")));
}

TEST_F(Login, WithoutAnyBrowserLeavesTheDescriptionWaiting)
{
    fs::remove(configHome / "mimeapps.list");
    fs::remove_all(root / "data" / "applications");
    const std::string file = writeDescription(minimal());
    EXPECT_EQ(run({file}), "") << "whether a browser comes up is not known here";
    EXPECT_TRUE(exists(file));
    EXPECT_TRUE(exists(userFile(kCache)));
}

TEST_F(Login, ShowsNoTokenInTheListOfProcesses)
{
    service->plan("/tracks stall 0");
    writeUserFile(kCache, attributeFile("VellamoorUploadManagerCache",
                                        {{"latest request file", writeDescription(minimal())}}));
    Run run = start({redirectUrl()});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    EXPECT_LACKS(contentsOf("/proc/" + std::to_string(run.process->id()) + "/cmdline"), token());
    service->release();
    run.finish();
}
