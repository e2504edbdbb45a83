#include "tests/job/job.h"

#include "tools/samples/cover.h"

namespace
{

class Upload : public Job
{
protected:
    Upload() { logIn(); }
};

constexpr const char* kCouldNotBeFound = "The file \"%s\" could not be found.";

std::string formatted(std::string format, const std::string& argument)
{
    return format.replace(format.find("%s"), 2, argument);
}

} // namespace

TEST_F(Upload, SendsEveryElementOfATrackInOrderAndAsItStands)
{
    const std::string cover = exports / "cover.png";
    ASSERT_TRUE(writeCover(cover, 16));
    SampleDescription description;
    description.track(everyElement(tone(), cover), {"rock", "deep house", "", "has \"quotes\""});
    const std::string file = writeDescription(description);

    const std::string printed = run({file});

    ASSERT_EQ(received("/tracks").size(), 1u);
    expectFields(received("/tracks")[0], {{"track[asset_data]", "tone.wav"},
                                          {"oauth_token", token()},
                                          {"track[artwork_data]", "cover.png"},
                                          {"track[title]", "Evening Walk (夕方の散歩)"},
                                          {"track[description]", "Recorded live & in one take."},
                                          {"track[bpm]", "120.0"},
                                          {"track[key_signature]", "A"},
                                          {"track[genre]", "Ambient"},
                                          {"track[track_type]", "original"},
                                          {"track[isrc]", "DEXX12000001"},
                                          {"track[label_name]", "House Label"},
                                          {"track[release]", "LC 01234"},
                                          {"track[release_year]", "2012.0"},
                                          {"track[release_month]", "3.0"},
                                          {"track[release_day]", "14.0"},
                                          {"track[license]", "all-rights-reserved"},
                                          {"track[purchase_url]", "https://shop.example:8443/evening"},
                                          {"track[video_url]", "http://video.example:8080/watch"},
                                          {"track[sharing]", "public"},
                                          {"track[commentable]", "false"},
                                          {"track[streamable]", "false"},
                                          {"track[downloadable]", "true"},
                                          {"track[tag_list]", "\"rock\" \"deep house\" has \"quotes\" "}});
    EXPECT_HOLDS(printed, "Uploading audio file(s) to SoundCloud...");
    EXPECT_HOLDS(printed, "Uploading \"tone.wav\" (1 of 1)");
    EXPECT_FALSE(exists(file)) << "the description is deleted at the end";
    EXPECT_TRUE(exists(tone()) && exists(cover)) << "the user's own files stay";
}

TEST_F(Upload, SendsTheBytesOfTheFiles)
{
    const std::string cover = exports / "cover.png";
    ASSERT_TRUE(writeCover(cover, 16));
    SampleDescription description;
    description.track({{"Path", tone()}, {"UrlArtwork", cover}});
    run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), 1u);
    const std::vector<ReceivedField> fields = received("/tracks")[0].fields;
    EXPECT_EQ(fields.at(0).size, std::filesystem::file_size(tone()));
    EXPECT_EQ(fields.at(0).sha256, sha256Of(tone()));
    EXPECT_EQ(fields.at(2).sha256, sha256Of(cover));
}

TEST_F(Upload, SendsEightFieldsOfABareTrack)
{
    run({writeDescription(minimal())});

    ASSERT_EQ(received("/me").size(), 1u);
    EXPECT_EQ(received("/me")[0].target, "/me?oauth_token=" + token());
    ASSERT_EQ(received("/tracks").size(), 1u);
    expectFields(received("/tracks")[0], {{"track[asset_data]", "tone.wav"},
                                          {"oauth_token", token()},
                                          {"track[title]", "tone"},
                                          {"track[license]", "all-rights-reserved"},
                                          {"track[sharing]", "private"},
                                          {"track[commentable]", "true"},
                                          {"track[streamable]", "true"},
                                          {"track[downloadable]", "false"}});
}

TEST_F(Upload, StartsEveryTrackFromTheConfiguration)
{
    SampleDescription description;
    description.configuration({{"Sharing", "public"}, {"Commentable", "TRUE"}, {"Downloadable", "true"}});
    description.configurationPublisher("soundcloud");
    description.track({{"Path", tone()}, {"MediaTrackTitle", "first"}}, {}, "");
    description.track({{"Path", tone()}, {"MediaTrackTitle", "second"}, {"Sharing", "private"}}, {}, "");
    run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), 2u);
    const ReceivedRequest first = received("/tracks")[0], second = received("/tracks")[1];
    EXPECT_EQ(first.field("track[title]")->text, "first");
    EXPECT_EQ(first.field("track[sharing]")->text, "public");
    EXPECT_EQ(first.field("track[commentable]")->text, "false") << "anything but \"true\" means false";
    EXPECT_EQ(first.field("track[downloadable]")->text, "true");
    EXPECT_EQ(second.field("track[title]")->text, "second");
    EXPECT_EQ(second.field("track[sharing]")->text, "private");
}

TEST_F(Upload, OpensTheEditPageOfTheFirstTrackOnly)
{
    SampleDescription description = minimal();
    description.track({{"Path", tone()}});
    run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), 2u);
    ASSERT_TRUE(waitForBrowser("status 200"));
    EXPECT_EQ(openedUrls(),
              std::vector<std::string>{"https://" + service->host() + "/stand-in/track-2/edit"});
}

TEST_F(Upload, OpensNoEditPageForAHostWithItsOwn)
{
    SampleDescription description = minimal();
    description.configuration({{"GuiMode", "true"}});
    run({writeDescription(description)});

    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_TRUE(openedUrls().empty());
}

TEST_F(Upload, GoesOnWithoutArtworkThatItCannotUse)
{
    const std::string missing = exports / "missing.png";
    const std::string wrongType = writeFile("cover.tiff", "no picture");
    const std::string noName = writeFile(".png", "no name before the dot");
    SampleDescription description;
    for (const std::string& artwork : {missing, wrongType, noName})
        description.track({{"Path", tone()}, {"UrlArtwork", artwork}});
    const std::string printed = run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), 3u);
    for (const ReceivedRequest& request : received("/tracks"))
        EXPECT_EQ(request.field("track[artwork_data]"), nullptr);
    EXPECT_HOLDS(printed, formatted(kCouldNotBeFound, missing));
    EXPECT_HOLDS(printed, "The artwork image for \"" + wrongType + "\" could not be uploaded.");
    EXPECT_HOLDS(printed, "The artwork image for \"" + noName + "\" could not be uploaded.");
    EXPECT_HOLDS(printed, "The artwork file has to be of type \"jpeg\", \"png\" or \"gif\".");
}

TEST_F(Upload, TakesArtworkOfEveryKindWhateverTheCase)
{
    SampleDescription description;
    const std::vector<std::string> names = {"a.gif", "b.JPG", "c.Jpeg", "d.PNG"};
    for (const std::string& name : names)
        description.track({{"Path", tone()}, {"UrlArtwork", writeFile(name, "picture")}});
    run({writeDescription(description)});

    std::vector<std::string> sent;
    for (const ReceivedRequest& request : received("/tracks"))
    {
        const ReceivedField* artwork = request.field("track[artwork_data]");
        sent.push_back(artwork ? artwork->fileName : "none");
    }
    EXPECT_EQ(sent, names);
}

TEST_F(Upload, WarnsOfValuesThatItCannotSet)
{
    SampleDescription description;
    description.configuration({{"Sharing", "friends"}});
    description.track({{"MusicalTempo", "fast"},
                       {"Path", tone()},
                       {"UploadTrackType", "opera"},
                       {"MediaLicense", "cc-by"},
                       {"Streamable", "maybe"}});
    const std::string printed = run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), 1u);
    const ReceivedRequest track = received("/tracks")[0];
    EXPECT_EQ(track.field("track[bpm]"), nullptr);
    EXPECT_EQ(track.field("track[track_type]"), nullptr);
    EXPECT_EQ(track.field("track[license]")->text, "all-rights-reserved");
    EXPECT_EQ(track.field("track[streamable]")->text, "true");

    const std::string anyFile = "\" could not be set to the requested value for any file.";
    const std::string thisFile = "\" could not be set to the requested value for file \"" + tone() + "\".";
    EXPECT_HOLDS(printed, "The parameter \"Sharing" + anyFile);
    EXPECT_HOLDS(printed, "The parameter will be set to \"private\".");
    EXPECT_HOLDS(printed, "The parameter \"MusicalTempo" + anyFile);
    EXPECT_HOLDS(printed, "The parameter \"UploadTrackType" + thisFile);
    EXPECT_HOLDS(printed, "The parameter \"MediaLicense" + thisFile);
    EXPECT_HOLDS(printed, "The parameter will be set to \"all-rights-reserved\".");
    EXPECT_HOLDS(printed, "The parameter \"Streamable" + thisFile);
    EXPECT_HOLDS(printed, "The parameter will be set to \"true\".");
    EXPECT_HOLDS(printed, "Be sure to check the edit page on SoundCloud.");
}

TEST_F(Upload, TakesADescriptionByAPathRelativeToWhereItIsStarted)
{
    writeDescription(minimal());
    run({"description.xml"});
    EXPECT_EQ(received("/tracks").size(), 1u);
}

TEST_F(Upload, WorksWhereNobodyReadsWhatItPrints)
{
    runUnheard({writeDescription(minimal())});
    EXPECT_EQ(received("/tracks").size(), 1u);
}

TEST_F(Upload, WorksWithoutASessionBus)
{
    setVariable("DBUS_SESSION_BUS_ADDRESS", "");
    setVariable("XDG_RUNTIME_DIR", root / "none");
    run({writeDescription(minimal())});
    EXPECT_EQ(received("/tracks").size(), 1u);
}

TEST_F(Upload, SendsAFileOfManyMegabytesWithoutHoldingIt)
{
    constexpr std::uint64_t kSize = 256 << 20;
    const std::string audio = writeFile("long.wav", "");
    std::filesystem::resize_file(audio, kSize);
    SampleDescription description;
    description.track({{"Path", audio}});
    service->plan("/tracks stall " + std::to_string(kSize - 1000));
    Run run = start({writeDescription(description)});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    const long peak = run.process->peakMemory();
    service->release();
    run.finish();

    ASSERT_EQ(received("/tracks").size(), 1u);
    EXPECT_EQ(received("/tracks")[0].fields.at(0).size, kSize);
    EXPECT_TRUE(peak > 0 && peak < static_cast<long>(kSize >> 10)) << peak << " KiB";
}
