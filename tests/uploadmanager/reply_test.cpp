#include "tests/uploadmanager/applicationfixture.h"

#include "foundation/object/iptr.h"
#include "uploadmanager/transfer.h"

namespace
{
class Reply : public ApplicationTest
{
protected:
    void SetUp() override
    {
        ApplicationTest::SetUp();
        request = adopt(new UploadRequest);
        request->path = FNPath(u"/music/a.wav", FPath::kFile);
        data.app = app;
        data.request = request;
    }
    void answer(std::string chunk)
    {
        EXPECT_EQ(libcurl_write_callback(chunk.data(), 1, chunk.size(), &data), chunk.size());
    }
    bool isFailed() const { return !data.error.isEmpty(); }
    Texts uploadErrors() { return ApplicationProbe::uploadErrors(*app); }
    Texts generalErrors() { return ApplicationProbe::generalErrors(*app); }

    IPtr<UploadRequest> request;
    CallbackData data;
};
} // namespace

TEST_F(Reply, TellsTheServicesWordsForAFailedFile)
{
    answer("<errors><error>Too long</error><warning>x</warning><error>Too loud &amp; fast</error></errors>");
    EXPECT_TRUE(isFailed());
    EXPECT_EQ(uploadErrors(), (Texts{"The file \"/music/a.wav\" could not be uploaded to SoundCloud.",
                                     "SoundCloud answered:", "Too long", "Too loud & fast"}));
    EXPECT_TRUE(generalErrors().empty());
}

TEST_F(Reply, TellsOfABadTokenAsAGeneralError)
{
    data.request = nullptr;
    answer("<error>401 - Unauthorized</error>");
    EXPECT_TRUE(isFailed());
    EXPECT_EQ(generalErrors(), (Texts{"Error communicating with SoundCloud server.",
                                      "SoundCloud answered:", "401 - Unauthorized"}));
    EXPECT_TRUE(uploadErrors().empty());
}

TEST_F(Reply, JudgesEachChunkByItself)
{
    answer("<track><permalink-url>https://s");
    EXPECT_TRUE(isFailed()) << "half a document is none";
    EXPECT_TRUE(uploadErrors().empty());
}

TEST_F(Reply, AcceptsOtherRootsAndRefusesWhatIsNoXml)
{
    answer("<user><id>3</id></user>");
    EXPECT_FALSE(isFailed());
    answer("<html><body>502</html>");
    EXPECT_TRUE(isFailed());
    EXPECT_EQ(libcurl_write_callback(const_cast<char*>("x"), 1, 1, nullptr), 1u);
}

TEST_F(Reply, WarnsWhereATrackHasNoPageToEdit)
{
    answer("<track><id>3</id></track>");
    EXPECT_FALSE(isFailed());
    EXPECT_EQ(generalErrors(),
              (Texts{"Could not open SoundCloud edit page for uploaded audio file \"/music/a.wav\".",
                     "Be sure to check the edit page on SoundCloud."}));
}
