#include "tests/job/job.h"

namespace
{

constexpr const char* kRetry = "Some files could not be uploaded. Do you want to retry?";

/// Two tracks of different titles, so that their order shows.
class Failure : public Job
{
protected:
    Failure() { logIn(); }

    std::string twoTracks()
    {
        SampleDescription description;
        description.track({{"Path", tone()}, {"MediaTrackTitle", "first"}});
        description.track({{"Path", writeFile("second.wav", "sound")}, {"MediaTrackTitle", "second"}});
        return writeDescription(description);
    }

    std::vector<std::string> titles() const
    {
        std::vector<std::string> result;
        for (const ReceivedRequest& request : received("/tracks"))
            result.push_back(request.field("track[title]") ? request.field("track[title]")->text : "none");
        return result;
    }

    std::string couldNotUpload(const std::string& path) const
    {
        return "The file \"" + path + "\" could not be uploaded to SoundCloud.";
    }
};

using Titles = std::vector<std::string>;

int countOf(const std::string& part, const std::string& text)
{
    int count = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++count;
    return count;
}

} // namespace

TEST_F(Failure, OfTheFirstTrackCountsForTheLaterOnesToo)
{
    service->plan("/tracks errors Title is taken|Too short & quiet");
    const std::string file = twoTracks();
    const std::string printed = run({file}); // nobody answers: the last button, which is No

    EXPECT_EQ(titles(), (Titles{"first", "second"}));
    EXPECT_HOLDS(printed, couldNotUpload(tone()));
    EXPECT_HOLDS(printed, "SoundCloud answered:");
    EXPECT_HOLDS(printed, "Title is taken");
    EXPECT_HOLDS(printed, "Too short & quiet");
    EXPECT_HOLDS(printed, kRetry);
    EXPECT_FALSE(exists(file));
}

TEST_F(Failure, RetriedSendsAllThatFailedInTheirOrder)
{
    service->plan("/tracks errors Title is taken");
    setAnswers("1");
    const std::string printed = run({twoTracks()});

    EXPECT_EQ(titles(), (Titles{"first", "second", "first", "second"}))
        << "the second was taken the first time, but counts as failed";
    EXPECT_EQ(countOf(kRetry, printed), 1);
    EXPECT_EQ(countOf("Title is taken", printed), 1);
}

TEST_F(Failure, RetriedAndFailingAnewIsToldAnew)
{
    service->plan("/tracks accept");
    service->plan("/tracks error Out of space");
    service->plan("/tracks error Still out of space");
    setAnswers("1,2");
    const std::string printed = run({twoTracks()});

    EXPECT_EQ(titles(), (Titles{"first", "second", "second"}));
    EXPECT_EQ(countOf(kRetry, printed), 2);
    EXPECT_EQ(countOf("Still out of space", printed), 1);
    EXPECT_EQ(countOf(couldNotUpload(exports / "second.wav"), printed), 2);
}

TEST_F(Failure, OfAReplyThatIsNoDocumentIsAskedAboutWithoutATextOfItsOwn)
{
    for (const char* plan :
         {"/tracks reply hello", "/tracks status 503 busy", "/tracks split", "/tracks flood 300000"})
    {
        service->plan(plan);
        const std::string printed = run({writeDescription(minimal())});
        EXPECT_HOLDS(printed, kRetry) << plan;
        EXPECT_LACKS(printed, couldNotUpload(tone())) << plan;
    }
}

TEST_F(Failure, IsReadFromTheReplyAndNeverFromTheStatus)
{
    service->plan("/tracks status 500 <html><body>Sorry</body></html>");
    EXPECT_LACKS(run({writeDescription(minimal())}), kRetry);
    EXPECT_EQ(received("/tracks").size(), 1u);
}

TEST_F(Failure, OfAFileThatIsGoneByThenIsTold)
{
    service->plan("/tracks stall 0");
    const std::string second = writeFile("second.wav", "sound");
    SampleDescription description = minimal();
    description.track({{"Path", second}});
    Run run = start({writeDescription(description)});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    std::filesystem::remove(second);
    service->release();

    const std::string printed = run.finish();
    EXPECT_HOLDS(printed, "The file \"" + second + "\" could not be found.");
    EXPECT_HOLDS(printed, kRetry);
    EXPECT_EQ(received("/tracks").size(), 1u);
}

TEST_F(Failure, OfAFileThatBecomesShorterMeanwhileIsTold)
{
    constexpr std::uintmax_t kSize = 32 << 20;
    const std::string audio = writeFile("shrinking.wav", "");
    std::filesystem::resize_file(audio, kSize);
    SampleDescription description;
    description.track({{"Path", audio}});
    service->plan("/tracks stall 100000");
    Run run = start({writeDescription(description)});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    std::filesystem::resize_file(audio, kSize / 8);
    service->release();

    const std::string printed = run.finish();
    EXPECT_HOLDS(printed, couldNotUpload(audio));
    EXPECT_HOLDS(printed, kRetry);
}

TEST_F(Failure, OfTheConnectionEndsTheRunWithItsNumber)
{
    const std::string large = writeFile("large.wav", std::string(8 << 20, 'a'));
    SampleDescription description;
    description.track({{"Path", large}});
    description.track({{"Path", tone()}});
    for (const char* plan : {"/tracks close 1000", "/tracks reset 1000"})
    {
        service->plan(plan);
        const std::string printed = run({writeDescription(description)});
        EXPECT_HOLDS(printed, "Internal program error.\nError Code: 10") << plan;
        EXPECT_LACKS(printed, kRetry) << plan;
    }
}

TEST_F(Failure, OfAServiceThatRefusesIsTheNumberOfTheConnection)
{
    useHost("127.0.0.1:1");
    EXPECT_HOLDS(run({writeDescription(minimal())}), "Internal program error.\nError Code: 1007");
}

TEST_F(Failure, OfTheCertificateKeepsTheTokenToItself)
{
    using Identity = StandInService::Identity;
    for (const Identity identity : {Identity::otherHost, Identity::expired, Identity::otherAuthority})
    {
        StandInService::Options options;
        options.identity = identity;
        useService(options);
        const std::string printed = run({writeDescription(minimal())});
        EXPECT_HOLDS(printed, "Internal program error.\nError Code: 1060") << static_cast<int>(identity);
        EXPECT_TRUE(service->received().empty()) << static_cast<int>(identity);
    }
}

TEST_F(Failure, OfTheTokenCheckToAnswerInXmlMeansANewLogin)
{
    for (const char* plan : {"/me reply hello", "/me split", "/me errors gone", "/me status 502 bad gateway"})
    {
        const std::size_t opened = openedUrls().size();
        service->plan(plan);
        service->plan("/connect status 500 closed");
        EXPECT_EQ(run({writeDescription(minimal())}), "") << "the login page is all that there is to see";
        EXPECT_TRUE(waitUntil([&] { return openedUrls().size() == opened + 1; })) << plan;
    }
    EXPECT_TRUE(received("/tracks").empty());
}

TEST_F(Failure, ToAnswerOnlyWaits)
{
    service->plan("/me stall 0");
    service->plan("/tracks slow 20");
    Run run = start({writeDescription(minimal())});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    EXPECT_TRUE(run.process->isRunning());
    service->release();
    run.finish();
    EXPECT_EQ(received("/tracks").size(), 1u);
}
