#include "applicationfixture.h"

#include "application/ghtmlbrowser.h"
#include "application/urlscheme.h"

namespace
{
class Application : public ApplicationTest
{
protected:
    Application() : application(adopt(new NotedApplication)) { gEvents.clear(); }

    std::string popupList()
    {
        testing::internal::CaptureStderr();
        hadWarnings = application->popupWarningList(nullptr);
        return testing::internal::GetCapturedStderr();
    }

    IPtr<NotedApplication> application;
    bool hadWarnings = false;
};
} // namespace

TEST_F(Application, WarningsAreListedOnce)
{
    application->addWarning(u"before warnings are enabled");
    EXPECT_EQ(popupList(), "");
    EXPECT_FALSE(hadWarnings);

    application->enableWarnings(true);
    application->addWarning(nullptr);
    application->addWarning(u"");
    application->addWarning(u"first");
    application->addWarning(u"second");
    EXPECT_EQ(popupList(), "first\nsecond\n");
    EXPECT_TRUE(hadWarnings);
    EXPECT_EQ(popupList(), "");

    application->addWarning(u"third");
    application->clearWarnings();
    EXPECT_EQ(popupList(), "");
}

TEST_F(Application, AnswersItsMenuItems)
{
    const auto send = [this](const char* type, int64 tag)
    {
        FMessage message(type);
        message.addData("Tag", tag);
        return application->notify(&message);
    };
    EXPECT_EQ(send("MenuCanSelect", 7), 1);
    EXPECT_EQ(send("MenuCanSelect", 16), 1);
    EXPECT_EQ(send("MenuCanSelect", 8), 0);
    EXPECT_EQ(send("MenuSelect", 8), 0);
    EXPECT_EQ(send("Something", 7), 0);
    EXPECT_TRUE(gEvents.empty());
    send("MenuSelect", 16);
    EXPECT_EQ(gEvents, (Lines{"about"}));
    send("MenuSelect", 7);
    EXPECT_TRUE(gController->isDone());
}

TEST_F(Application, OpensEachFileOfAList)
{
    CmLinkedList paths;
    paths.takeElements();
    EXPECT_FALSE(application->openFiles(&paths));
    paths.add(new FNPath(u"/bad", FPath::kFile));
    EXPECT_FALSE(application->openFiles(&paths));
    paths.add(new FNPath(u"/good", FPath::kFile));
    paths.add(new FNPath(u"/worse", FPath::kFile));
    EXPECT_TRUE(application->openFiles(&paths));
    EXPECT_EQ(gEvents, (Lines{"open /bad", "open /bad", "open /good", "open /worse"}));
}

TEST_F(Application, KnowsItsNameAndVersion)
{
    EXPECT_EQ(std::u16string(application->getName()), u"Noted Application");
    EXPECT_EQ(std::u16string(application->getDisplayName()), u"Noted Application");
    application->setVersion(u"12.3", u"456");
    EXPECT_EQ(std::u16string(application->getVersion()), u"12.3");
    EXPECT_EQ(std::u16string(application->getBuild()), u"456");
    EXPECT_EQ(application->getMajorVersionInt(), 12);
    application->setVersion(u"", u"");
    EXPECT_EQ(application->getMajorVersionInt(), 0);
    application->setName(u"Renamed");
    EXPECT_EQ(std::u16string(UApplication::getUserFolderName()), u"Renamed");
    UApplication::setUserFolderName(u"Elsewhere");
    EXPECT_EQ(std::u16string(UApplication::getUserFolderName()), u"Elsewhere");
    UApplication::setUserFolderName(u"");
}

TEST_F(Application, ANullNameIsTheDefaultOne)
{
    application = nullptr;
    application = adopt(new NotedApplication(nullptr));
    EXPECT_EQ(std::u16string(application->getName()), u"Application");
}

TEST_F(Application, LooksUpFeatures)
{
    const AppFeatureTableEntry rows[] = {
        {"uploads", FVariant(3)}, {"preview", FVariant("yes")}, {nullptr, FVariant()}};
    EXPECT_FALSE(application->hasFeature("uploads"));
    application->registerFeatures(rows, 3);
    EXPECT_TRUE(application->hasFeature("uploads"));
    EXPECT_FALSE(application->hasFeature("upload"));
    EXPECT_FALSE(application->hasFeature(nullptr));
    FVariant value;
    EXPECT_TRUE(application->getFeatureValue("uploads", value));
    EXPECT_EQ(value.getInt(), 3);
    EXPECT_TRUE(application->getFeatureValue("preview", value));
    EXPECT_STREQ(value.getString8(), "yes");
    EXPECT_FALSE(application->getFeatureValue("absent", value));
}

TEST(URLSchemes, AreFoundByWhatATextBeginsWith)
{
    struct Handler : IURLSchemeHandler
    {
        void openURL(const char*) override {}
    } handler;
    URLScheme::setHandler("vlmr", &handler);
    EXPECT_EQ(URLScheme::findHandler("vlmr://plenar/x"), &handler);
    EXPECT_EQ(URLScheme::findHandler("VLMR:x"), &handler);
    for (const char* text : {"vlmr", "vlm", "", "vlmrs:x", "/vlmr:x", "http://vlmr:"})
        EXPECT_EQ(URLScheme::findHandler(text), nullptr) << text;
    URLScheme::setHandler("vlmr", nullptr);
    EXPECT_EQ(URLScheme::findHandler("vlmr:x"), nullptr);
}

TEST(HTMLBrowser, OffersTheURLToACustomBrowserFirst)
{
    struct Custom : ICustomBrowser
    {
        Answer openURL(const char16* url) override
        {
            last = url;
            return answer;
        }
        std::u16string last;
        Answer answer = kShown;
    } custom;
    GHTMLBrowser browser(1);
    GHTMLBrowser::setCustomBrowser(&custom);
    EXPECT_TRUE(browser.openURL(u"https://host/a?b"));
    EXPECT_EQ(custom.last, u"https://host/a?b");
    custom.answer = ICustomBrowser::kFailed;
    EXPECT_FALSE(browser.openURL(u"https://host/"));
    custom.answer = ICustomBrowser::kNotTaken;
    EXPECT_TRUE(browser.openURL(u"not a URL")) << "what can't be a URL is dropped silently";
    EXPECT_EQ(custom.last, u"not a URL");
    GHTMLBrowser::setCustomBrowser(nullptr);
}
