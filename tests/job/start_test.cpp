#include "tests/job/job.h"

#include <thread>

namespace
{

constexpr const char* kCannotStart = "You cannot start the Vellamoor Upload Manager directly.";

class Start : public Job
{
protected:
    /// What the shipped translation has for an English text; empty if there is none.
    static std::string translation(const std::string& english, const std::string& code)
    {
        const std::string table = contentsOf(std::string(JOB_RESOURCES) + "/translation.xml");
        const std::size_t entry = table.find("Key=\"" + english + "\"");
        const std::size_t begin = table.find("<" + code + ">", entry) + code.size() + 2;
        return entry == std::string::npos ? "" : table.substr(begin, table.find("</", begin) - begin);
    }
};

} // namespace

TEST_F(Start, WithoutAFileSaysSoAndEnds)
{
    EXPECT_EQ(run({}), std::string(kCannotStart) + "\n");
    EXPECT_TRUE(service->received().empty());
}

TEST_F(Start, WithoutAFileSaysSoInTheLanguageOfTheUser)
{
    for (const auto& [locale, code] : {std::pair("de_DE.UTF-8", "de"), std::pair("fr_FR.UTF-8", "fr"),
                                       std::pair("ja_JP.UTF-8", "jp"), std::pair("es_ES.UTF-8", "es")})
    {
        setVariable("LANG", locale);
        const std::string expected = translation(kCannotStart, code);
        EXPECT_GT(expected.size(), 20u) << code;
        EXPECT_EQ(run({}), expected + "\n") << locale;
    }
}

TEST_F(Start, SpeaksTheLanguageOfTheDescriptionAndRemembersIt)
{
    logIn();
    SampleDescription description = minimal();
    description.language("de");
    const std::string printed = run({writeDescription(description)});
    EXPECT_HOLDS(printed, translation("Uploading audio file(s) to SoundCloud...", "de"));
    EXPECT_EQ(contentsOf(userFile("language")), attributeFile("language", {{"language", "de"}}));

    SampleDescription unknown("Nobody");
    unknown.language("xx").track({{"Path", tone()}});
    const std::string later = run({writeDescription(unknown)});
    EXPECT_LACKS(later, "Internal program error.");
    EXPECT_HOLDS(later, "16");
    EXPECT_EQ(contentsOf(userFile("language")), attributeFile("language", {{"language", "de"}}));
}

TEST_F(Start, LoadsSettingsAndPresetsAndSavesThemAtTheEnd)
{
    const std::string settings =
        "<Defaults><rootObjects><root name=\"Defaults\"><list name=\"Entries\" type=\"list\"><item>"
        "<string name=\"Group\" value=\"g\"/><int name=\"Version\" value=\"3\"/>"
        "<member name=\"Values\"><int name=\"k\" value=\"7\"/></member>"
        "</item></list></root></rootObjects></Defaults>";
    writeUserFile("Defaults", settings);
    std::filesystem::create_directory(userFolder / "Presets");
    writeUserFile("Presets/RAMPresets",
                  "<Presets><rootObjects><root name=\"Pool\" ID=\"1\"/></rootObjects>"
                  "<obj class=\"FPresetPool\" ID=\"1\"><list name=\"Lists\" type=\"list\"><item>"
                  "<string name=\"ID\" value=\"sounds\"/></item></list></obj></Presets>");
    run({});
    const std::string saved = contentsOf(userFile("Defaults"));
    EXPECT_HOLDS(saved, "<string name=\"Group\" value=\"g\"/>\r");
    EXPECT_HOLDS(saved, "<int name=\"k\" value=\"7\"/>\r");
    EXPECT_FALSE(exists(userFile("Defaults_old")));
    EXPECT_HOLDS(contentsOf(userFile("Presets/RAMPresets")), "<string name=\"Name\" value=\"sounds\"");

    std::filesystem::remove(userFile("Defaults"));
    run({});
    const auto mode = std::filesystem::status(userFile("Defaults")).permissions();
    EXPECT_EQ(mode, std::filesystem::perms(0600));
}

TEST_F(Start, OfASecondProcessAddsToTheUploadsOfTheFirst)
{
    logIn();
    service->plan("/tracks stall 0");
    const std::string firstFile = writeDescription(minimal(), "first.xml");
    Run first = start({firstFile});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    ASSERT_TRUE(first.process->waitForOutput("(1 of 1)"));

    SampleDescription second = minimal();
    second.configuration({{"RequireLogin", "true"}});
    const std::string secondFile = writeDescription(second, "second.xml");
    EXPECT_EQ(run({"second.xml"}), "") << "the second start hands over and ends";
    EXPECT_TRUE(first.process->waitForOutput("(1 of 2)"));
    EXPECT_FALSE(exists(firstFile)) << "it was let go when the second came";
    service->release();
    first.finish();

    EXPECT_EQ(received("/tracks").size(), 2u);
    EXPECT_FALSE(exists(secondFile));
    EXPECT_TRUE(received("/connect").empty()) << "no new login while an upload is under way";
}

TEST_F(Start, AtAnyMomentOfTheEndOfAnotherRunLosesNothing)
{
    logIn();
    constexpr int kRounds = 12;
    for (int round = 0; round < kRounds; ++round)
    {
        Run first = start({writeDescription(minimal(), "first.xml")});
        ASSERT_TRUE(service->waitForRequests("/tracks", 2 * round + 1, kHangs));
        std::this_thread::sleep_for(std::chrono::milliseconds(7 * round));
        Run second = start({writeDescription(minimal(), "second.xml")});
        second.finish();
        first.finish();
        EXPECT_EQ(received("/tracks").size(), static_cast<std::size_t>(2 * round + 2)) << round;
        EXPECT_FALSE(exists(exports / "first.xml") || exists(exports / "second.xml")) << round;
    }
}

TEST_F(Start, OfASecondProcessForAnotherProductIsRefused)
{
    logIn();
    service->plan("/tracks stall 0");
    Run first = start({writeDescription(minimal(), "first.xml")});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));

    const std::string secondFile = writeDescription(minimal("Plenar"), "second.xml");
    run({secondFile});
    EXPECT_TRUE(first.process->waitForOutput(
        "You cannot upload tracks from 2 different Vellamoor applications at the same time.\n"
        "Please wait until the current upload has finished."));
    EXPECT_TRUE(exists(secondFile));
    service->release();
    first.finish();

    EXPECT_EQ(received("/tracks").size(), 1u);
    EXPECT_FALSE(exists(secondFile)) << "it is the file in hand when the run ends";
}

TEST_F(Start, OfALogoutEndsARunWhoseUploadStandsStill)
{
    logIn();
    service->plan("/tracks stall 0");
    Run first = start({writeDescription(minimal())});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));

    run({"vlmr://logout/Loomrit"});
    first.finish();
    EXPECT_EQ(contentsOf(userFile("scat")), attributeFile("scat", {{"Loomrit", ""}}));
}

TEST_F(Start, EndsWithTheSessionAndLosesNothing)
{
    logIn();
    service->plan("/tracks stall 0");
    const std::string file = writeDescription(minimal());
    Run first = start({file});
    ASSERT_TRUE(service->waitForStalled(1, kHangs));
    ASSERT_TRUE(first.process->waitForOutput("(1 of 1)"));
    first.process->terminate();
    first.finish();
    EXPECT_TRUE(exists(file));
}

TEST_F(Start, PrefersTheHostsOfTheUserFolder)
{
    logIn();
    useHost("127.0.0.1:1");
    writeUserFile("service",
                  attributeFile("service", {{"API Host", service->host()}, {"Web Host", service->host()}}));
    run({writeDescription(minimal())});
    EXPECT_EQ(received("/tracks").size(), 1u);
}
