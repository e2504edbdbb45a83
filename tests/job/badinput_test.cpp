#include "tests/job/job.h"

#include <algorithm>

namespace fs = std::filesystem;

namespace
{

std::string errorCode(int code)
{
    return "Internal program error.\nError Code: " + std::to_string(code) + "\n";
}

std::string nested(const std::string& name, int levels)
{
    std::string text;
    for (int i = 0; i < levels; ++i)
        text += "<" + name + ">";
    for (int i = 0; i < levels; ++i)
        text += "</" + name + ">";
    return text;
}

/// Ten entities, each ten times the one before: ten thousand million characters if anybody expands them.
std::string entityBomb()
{
    std::string text = "<?xml version=\"1.0\"?>\n<!DOCTYPE AudioExportDescription [\n<!ENTITY e0 \"ha\">\n";
    for (int i = 1; i <= 10; ++i)
    {
        text += "<!ENTITY e" + std::to_string(i) + " \"";
        for (int k = 0; k < 10; ++k)
            text += "&e" + std::to_string(i - 1) + ";";
        text += "\">\n";
    }
    return text +
           "]>\n<AudioExportDescription><Application><ProductFamily>&e10;</ProductFamily></Application>"
           "</AudioExportDescription>\n";
}

class BadDescription : public Job
{
protected:
    BadDescription() { logIn(); }

    std::string runWith(const std::string& bytes) { return run({writeFile("description.xml", bytes)}); }
};

class BadRedirect : public Job
{
protected:
    std::string redirect(const std::string& rest) { return run({"vlmr://loomrit/successfullLogin" + rest}); }
};

class BadUserFile : public Job
{
protected:
    /// A start with a track, while the login page is closed.
    std::string runWithoutLogin()
    {
        useService({});
        service->plan("/connect status 500 closed");
        return run({writeDescription(minimal())});
    }

    bool wasUploaded() const
    {
        const std::vector<ReceivedRequest> tracks = received("/tracks");
        return std::any_of(tracks.begin(), tracks.end(),
                           [](const ReceivedRequest& track) { return track.status == 201; });
    }

    /// Only a run that ends without a message and without an upload was sent there.
    bool wasSentToLogin() const { return !wasUploaded() && service->waitForRequests("/connect", 1, kHangs); }
};

class FileName : public Job
{
protected:
    FileName() { logIn(); }
};

} // namespace

TEST_F(BadDescription, ThatIsNoneIsRefusedWithItsNumber)
{
    const std::string good = minimal().text();
    std::string binary;
    for (int i = 0; i < 4096; ++i)
        binary.push_back(static_cast<char>(i * 37));

    EXPECT_EQ(run({(exports / "missing.xml").string()}), errorCode(8));
    EXPECT_EQ(runWith(""), errorCode(7));
    EXPECT_EQ(runWith("<AudioExport"), errorCode(7));
    EXPECT_EQ(runWith(good.substr(0, good.size() / 2)), errorCode(7));
    EXPECT_EQ(runWith(good.substr(0, good.size() - 3)), errorCode(7));
    EXPECT_EQ(runWith(binary), errorCode(7));
    EXPECT_EQ(runWith("<Other/>"), errorCode(7));
    EXPECT_EQ(runWith(minimal().version("0.9").text()), errorCode(7));
    EXPECT_EQ(runWith(entityBomb()), errorCode(7));
    EXPECT_EQ(run({exports.string()}), errorCode(11));
    EXPECT_TRUE(service->received().empty());
}

TEST_F(BadDescription, ThatLacksWhatItNeedsIsRefusedWithItsNumber)
{
    SampleDescription missing;
    missing.track({{"Path", exports / "missing.wav"}});
    SampleDescription noPublisher;
    noPublisher.track({{"Path", tone()}}, {}, "elsewhere");

    EXPECT_EQ(runWith(minimal("Nobody").text()), errorCode(16));
    EXPECT_EQ(runWith(minimal("").text()), errorCode(16));
    EXPECT_EQ(runWith(SampleDescription().text()), errorCode(6));
    EXPECT_EQ(runWith(missing.text()), errorCode(4));
    EXPECT_EQ(runWith(noPublisher.text()), errorCode(21));
    EXPECT_FALSE(exists(exports / "description.xml")) << "the description in hand is deleted at the end";
    EXPECT_TRUE(received("/tracks").empty());
}

TEST_F(BadDescription, WithAHigherOrUnreadableVersionIsTaken)
{
    for (const char* version : {"2.5", "newest"})
        runWith(minimal().version(version).text());
    EXPECT_EQ(received("/tracks").size(), 2u);
}

TEST_F(BadDescription, OfAHundredThousandLevelsIsRefused)
{
    const std::string deep = nested("AudioExportDescription", 100000);
    EXPECT_EQ(runWith(deep).substr(0, 23), "Internal program error.");
    std::string inside = minimal().text();
    inside.insert(inside.find("<Track>") + 7, nested("Deep", 100000));
    EXPECT_EQ(runWith(inside).substr(0, 23), "Internal program error.");
}

TEST_F(BadDescription, OfAHundredMegabytesIsReadInBoundedMemory)
{
    std::string large = minimal().text();
    large.insert(large.find("<Track>"), "<Filler>" + std::string(100 << 20, 'x') + "</Filler>");
    service->plan("/tracks stall 0");
    Run run = start({writeFile("description.xml", large)});
    ASSERT_TRUE(waitUntil([&] { return service->stalled() == 1 || !run.process->isRunning(); }));
    EXPECT_LT(run.process->peakMemory(), 1 << 20) << "KiB";
    service->release();
    const std::string printed = run.finish();
    EXPECT_TRUE(received("/tracks").size() == 1 || printed == errorCode(7)) << printed;
}

TEST_F(BadDescription, InTheMiddleOfAnUploadEndsTheRun)
{
    service->plan("/tracks stall 0");
    Run first = start({writeDescription(minimal(), "first.xml")});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    run({writeFile("bad.xml", "<Other/>")});
    EXPECT_HOLDS(first.finish(), errorCode(7));
}

TEST_F(BadRedirect, EndsWithItsNumberAndSavesNothing)
{
    EXPECT_EQ(redirect(""), errorCode(9));
    EXPECT_EQ(redirect("?"), errorCode(22));
    EXPECT_EQ(redirect("?code=1"), errorCode(9));
    EXPECT_EQ(redirect("?code"), errorCode(22));
    EXPECT_EQ(redirect("?a=b=c&d=e"), errorCode(22));
    EXPECT_EQ(redirect("?=#=&&##=%"), errorCode(22));
    EXPECT_EQ(redirect("?state=%&scope=%4"), errorCode(22));
    EXPECT_EQ(run({"vlmr:"}), errorCode(9));
    EXPECT_EQ(run({"vlmr://nobody/successfullLogin?access_token=1"}), errorCode(9));
    EXPECT_FALSE(exists(userFile("scat")));
    EXPECT_TRUE(service->received().empty());
}

TEST_F(BadRedirect, OfGreatLengthIsTakenAsItIs)
{
    const std::string value(120000, 'v'); // near the most that the system hands over as one argument
    EXPECT_EQ(redirect("?error=" + value), "SoundCloud answered:\n" + value + "\n");

    const std::string kept(1000, 't'), tooLong(100000, 't');
    EXPECT_EQ(redirect("?access_token=" + kept), "");
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", base64(kept)}}));
    EXPECT_EQ(redirect("?access_token=" + tooLong), errorCode(5));
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", base64(kept)}}))
        << "longer than a value may be: the old file stays";
}

TEST_F(BadRedirect, WithATokenOfOtherBytesIsNoCrash)
{
    for (const char* rest : {"?access_token=%zz", "?access_token=%c3%a4", "?access_token=%00",
                             "?access_token=1&access_token=2", "?access_token=a%0d%0aHost:+b"})
    {
        const std::string printed = redirect(rest);
        EXPECT_TRUE(printed.empty() || holds(printed, "Internal program error.")) << rest << ": " << printed;
    }
}

TEST_F(BadUserFile, DamagedAtAnyPlaceGivesNoTokenButATrueOne)
{
    const std::string good = attributeFile("scat", {{"Loomrit", base64(token())}});
    for (std::size_t at = 0; at < good.size(); at += 9)
    {
        for (const bool cut : {true, false})
        {
            std::string bad = cut ? good.substr(0, at) : good;
            if (!cut)
                bad[at] = static_cast<char>(bad[at] ^ 0x04);
            writeUserFile("scat", bad);
            const std::string printed = runWithoutLogin();
            // Where the damage makes another token: the service refuses it, or it cannot stand in a URL.
            EXPECT_TRUE(printed == errorCode(1003) || wasUploaded() || wasSentToLogin())
                << at << cut << printed;
            EXPECT_FALSE(cut && wasUploaded()) << at;
        }
    }
}

TEST_F(BadUserFile, WithForeignValuesUploadsNothing)
{
    const std::vector<std::string> files = {
        "<scat><int name=\"Loomrit\" value=\"5\"/></scat>",
        "<scat><member name=\"Loomrit\"><string name=\"a\" value=\"b\"/></member></scat>",
        "<scat><string name=\"Loomrit\" value=\"%%% no base64 %%%\"/></scat>",
        "<scat><string name=\"Loomrit\" value=\"\xC3\xA4\" wide=\"true\"/></scat>",
        "<scat><string name=\"Loomrit\" value=\"" + std::string(1 << 20, 'Q') + "\"/></scat>",
        "<scat><string name=\"Loomrit\" value=\"" + base64("a\r\nX-Own: b") + "\"/></scat>",
        "<other><string name=\"Loomrit\" value=\"" + base64(token()) + "\"/></other>",
    };
    for (const std::string& file : files)
    {
        writeUserFile("scat", "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r" + file + "\r");
        const std::string printed = runWithoutLogin();
        EXPECT_FALSE(wasUploaded()) << file.substr(0, 100);
        EXPECT_TRUE(printed == errorCode(1003) || wasSentToLogin()) << file.substr(0, 100) << printed;
    }
}

TEST_F(BadUserFile, OfTheCacheCountsAsNoWaitingDescription)
{
    const std::string cache = "Vellamoor Upload Manager Cache";
    const std::string redirect = "vlmr://loomrit/successfullLogin?access_token=" + token();
    writeUserFile(cache, "<VellamoorUploadManagerCache><string na");
    EXPECT_EQ(run({redirect}), "");

    writeUserFile(
        cache, attributeFile("VellamoorUploadManagerCache", {{"latest request file", exports / "gone.xml"}}));
    EXPECT_EQ(run({redirect}), errorCode(8));
}

TEST_F(BadUserFile, InAFolderThatCannotBeMadeIsToldOnceALoginIsNeeded)
{
    fs::remove_all(userFolder);
    writeFile("plain", "");
    fs::rename(exports / "plain", userFolder);
    service->plan("/connect status 500 closed");
    const std::string file = writeDescription(minimal());
    EXPECT_EQ(run({file}), errorCode(5));
    EXPECT_EQ(contentsOf(userFolder), "") << "what stood in the way is untouched";
}

TEST_F(BadUserFile, OnAFullDiskLeavesTheOldOneWhole)
{
    const std::string old = attributeFile("scat", {{"Loomrit", base64("old")}, {"Plenar", base64("other")}});
    writeUserFile("scat", old);
    const std::string redirect = "vlmr://loomrit/successfullLogin?access_token=" + token();
    EXPECT_EQ(runWithoutDisk({redirect}), errorCode(5));
    EXPECT_EQ(runWithoutDisk({"vlmr://logout/Loomrit"}), errorCode(5)) << "nobody was logged out";

    EXPECT_EQ(contentsOf(userFile("scat")), old);
    for (const fs::directory_entry& entry : fs::directory_iterator(userFolder))
        EXPECT_EQ(entry.path().filename(), "scat.xml");
}

TEST_F(BadUserFile, ThatCannotBeReadIsLeftAlone)
{
    // Opens as a file, and gives an error instead of its first byte.
    fs::create_directories(userFolder);
    fs::create_symlink("/proc/self/mem", userFile("scat"));
    EXPECT_EQ(run({"vlmr://loomrit/successfullLogin?access_token=" + token()}), errorCode(5));
    EXPECT_EQ(run({"vlmr://logout/Loomrit"}), errorCode(5)) << "nobody was logged out";
    EXPECT_TRUE(fs::is_symlink(userFile("scat"))) << "it may hold other products' tokens";

    fs::remove(userFile("scat"));
    fs::create_directory(userFile("scat"));
    EXPECT_EQ(run({"vlmr://loomrit/successfullLogin?access_token=" + token()}), errorCode(5));
    EXPECT_TRUE(fs::is_directory(userFile("scat")));
}

TEST_F(BadUserFile, ThatIsDamagedIsBegunAnewByALogin)
{
    const std::string good = attributeFile("scat", {{"Plenar", base64("other")}});
    writeUserFile("scat", good.substr(0, good.size() - 4));
    EXPECT_EQ(run({"vlmr://loomrit/successfullLogin?access_token=" + token()}), "");
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", base64(token())}}));
}

TEST_F(BadUserFile, OnAFullDiskUploadsWithTheNewLoginAllTheSame)
{
    const std::string file = writeDescription(minimal());
    writeUserFile("Vellamoor Upload Manager Cache",
                  attributeFile("VellamoorUploadManagerCache", {{"latest request file", file}}));
    const std::string printed = runWithoutDisk({"vlmr://loomrit/successfullLogin?access_token=" + token()});
    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_HOLDS(printed, errorCode(5));
    EXPECT_EQ(printed.find(errorCode(5)), printed.rfind(errorCode(5))) << "told once";
    EXPECT_FALSE(exists(file));
    EXPECT_FALSE(exists(userFile("scat")));
}

TEST_F(BadUserFile, OnAFullDiskTellsThatTheDescriptionCannotWait)
{
    service->plan("/connect status 500 closed");
    const std::string printed = runWithoutDisk({writeDescription(minimal())});
    EXPECT_HOLDS(printed, errorCode(5));
    EXPECT_FALSE(exists(userFile("Vellamoor Upload Manager Cache")));
}

TEST_F(FileName, OfADescriptionMayHoldAnyByte)
{
    for (const std::string name : {"a \"b\" 'c' $d.xml", "line\nfeed.xml", "\xFF\xFE stray.xml",
                                   "e\xCC\x81 apart.xml", "100% & <more>.xml"})
    {
        const std::string file = writeDescription(minimal(), name);
        EXPECT_LACKS(run({file}), "Internal program error.") << name;
        EXPECT_FALSE(exists(file)) << name;
    }
    const std::string longest = writeDescription(minimal(), std::string(251, 'n') + ".xml");
    run({longest});
    EXPECT_FALSE(exists(longest));
    EXPECT_EQ(received("/tracks").size(), 6u);
}

TEST_F(FileName, OfADescriptionSurvivesTheLogin)
{
    for (const std::string name : {"line\nfeed \"&<\xC3\xA4$.xml", "\xFF\xFE stray.xml"})
    {
        fs::remove(userFile("scat"));
        service->plan("/connect status 500 closed");
        const std::string file = writeDescription(minimal(), name);
        const std::size_t before = received("/tracks").size();
        run({file});
        EXPECT_TRUE(exists(file));
        run({"vlmr://loomrit/successfullLogin?access_token=" + token()});
        EXPECT_EQ(received("/tracks").size(), before + 1) << name;
        EXPECT_FALSE(exists(file)) << name;
    }
}

TEST_F(FileName, OfATrackIsSentAsItStands)
{
    SampleDescription description;
    const std::vector<std::string> names = {"it's; 50% $(off).wav", "e\xCC\x81 apart.wav",
                                            "\xE5\xA4\x95\xE6\x96\xB9.wav", std::string(251, 'n') + ".wav"};
    for (const std::string& name : names)
        description.track({{"Path", writeFile(name, "sound")}});
    const std::string quoted = writeFile("say \"yes\".wav", "sound");
    description.track({{"Path", quoted}});
    const std::string printed = run({writeDescription(description)});

    ASSERT_EQ(received("/tracks").size(), names.size() + 1) << printed;
    for (std::size_t i = 0; i < names.size(); ++i)
        EXPECT_EQ(received("/tracks")[i].fields.at(0).fileName, names[i]);
    EXPECT_EQ(received("/tracks").back().field("track[title]")->text, "say \"yes\"");
}
