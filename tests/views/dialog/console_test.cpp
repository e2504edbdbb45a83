#include "foundation/object/classfactory.h"
#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "foundation/text/iuseralert.h"
#include "views/dialog/iprogress.h"
#include "views/dialog/ualert.h"
#include "views/dialog/ucommondialog.h"
#include "views/dialog/uconsole.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>

namespace
{
std::string printedBy(const std::function<void()>& body)
{
    testing::internal::CaptureStderr();
    body();
    return testing::internal::GetCapturedStderr();
}

int ask(const char16* button2 = u"No", const char16* button3 = nullptr)
{
    return UAlert::run(u"Retry?", UAlert::kQuestion, u"Yes", button2, button3, nullptr);
}

IPtr<IProgress> makeProgress()
{
    const auto object = adopt(ClassFactory::instance(true)->createObjectByID(IProgress::iid));
    return adopt(askInterface<IProgress>(object.get()));
}

bool refuse()
{
    return false;
}
} // namespace

TEST(Console, WritesAnAlertAsOneBlockAndTakesTheFirstButton)
{
    int answer = 0;
    EXPECT_EQ(printedBy(
                  [&]
                  {
                      answer = UAlert::run(u"Two lines:\nGr\u00fc\u00dfe \u65e5\u672c", UAlert::kInformation,
                                           nullptr, u"Export", nullptr, nullptr);
                  }),
              "Two lines:\nGr\u00fc\u00dfe \u65e5\u672c\n");
    EXPECT_EQ(answer, 1);
}

TEST(Console, CancelsWhatHadToBeTyped)
{
    FString name(u"ada"), password(u"secret");
    EXPECT_EQ(printedBy([&] { EXPECT_FALSE(UCommonDialog::getNameAndPassword(u"Who?", name, password)); }),
              "Who?\n");
    EXPECT_TRUE(name == ConstString(u"ada") && password == ConstString(u"secret"));
}

TEST(Console, TakesTheLastButtonOfAQuestion)
{
    printedBy(
        []
        {
            EXPECT_EQ(ask(), 2);
            EXPECT_EQ(ask(u"No", u"Cancel"), 3);
            EXPECT_EQ(ask(nullptr), 1);
        });
}

namespace
{
// The answers are read once a process, so that they are asked for in one of their own.
[[noreturn]] void takeGivenAnswers()
{
    setenv("VELLAMOOR_ANSWERS", "1,2,1,9,x,,1", 1);
    UAlert::run(u"A notice uses none up.", UAlert::kInformation, u"OK", nullptr, nullptr, nullptr);
    std::string answers;
    for (int i = 0; i < 8; i++)
        answers += std::to_string(ask());
    fprintf(stderr, "%s", answers.c_str());
    exit(0);
}

} // namespace

TEST(ConsoleDeathTest, TakesGivenAnswersInTheirOrder)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_EXIT(takeGivenAnswers(), testing::ExitedWithCode(0), "A notice uses none up(.|\n)*12122212");
}

TEST(Console, AnApplicationMayRefuseAlerts)
{
    UAlert::setPermission(&refuse);
    EXPECT_EQ(printedBy([] { EXPECT_EQ(ask(), 0); }), "");
    UAlert::setPermission(nullptr);
}

TEST(Console, LowerRoomsAskThroughTheAlert)
{
    UAlert::serveLowerRooms();
    ASSERT_NE(IUserAlert::get(), nullptr);
    EXPECT_EQ(printedBy([] { EXPECT_EQ(IUserAlert::get()->run(u"Low", 1, u"Yes", u"No", nullptr), 2); }),
              "Low\n");
    IUserAlert::set(nullptr);
}

TEST(Progress, ShowsItsTitleAndEachChangedLine)
{
    const IPtr<IProgress> progress = makeProgress();
    ASSERT_TRUE(progress);
    bool isCancelled = false;
    const std::string printed = printedBy(
        [&]
        {
            progress->initialize(1, u"Uploading...", &isCancelled);
            progress->setMaxValue(200);
            progress->startProcessing();
            progress->setProgressValue(0);
            progress->setProgressInfo(u"Uploading \"a\" (1 of 2)");
            progress->setProgressValue(1);
            progress->setProgressInfo(u"Uploading \"a\" (1 of 2)");
            progress->setProgressValue(100);
            progress->setProgressInfo(u"Uploading \"a\" (1 of 2)");
            progress->setProgressInfo(u"Uploading \"b\" (2 of 2)");
            progress->setProgressValue(500);
            progress->setProgressInfo(u"Uploading \"b\" (2 of 2)");
        });
    EXPECT_EQ(printed, "Uploading...\n"
                       "Uploading \"a\" (1 of 2) 0%\n"
                       "Uploading \"a\" (1 of 2) 50%\n"
                       "Uploading \"b\" (2 of 2) 50%\n"
                       "Uploading \"b\" (2 of 2) 100%\n");
    EXPECT_FALSE(isCancelled);
}

TEST(Progress, GoesOnAfterAQuestion)
{
    const IPtr<IProgress> progress = makeProgress();
    const std::string printed = printedBy(
        [&]
        {
            progress->initialize(1, u"Title", nullptr);
            progress->startProcessing();
            progress->endProcessing();
            progress->endProcessing();
            progress->setProgressValue(10);
            progress->setProgressInfo(u"File");
        });
    EXPECT_EQ(printed, "Title\nTitle\nFile 10%\n");
}

TEST(Progress, SaysThatItShowsNothingBeforeItIsInitialized)
{
    const IPtr<IProgress> progress = makeProgress();
    EXPECT_EQ(printedBy(
                  [&]
                  {
                      EXPECT_EQ(progress->startProcessing(), -1);
                      EXPECT_EQ(progress->endProcessing(), -1);
                      EXPECT_EQ(progress->setProgressInfo(u"File"), -1);
                      progress->initialize(2, u"Title", nullptr);
                      EXPECT_EQ(progress->setProgressInfo(u"File"), 0);
                      EXPECT_EQ(progress->setNumSteps(2), 0);
                      EXPECT_EQ(progress->nextStep(2), 0);
                      EXPECT_EQ(progress->nextStep(3), -1);
                  }),
              "")
        << "nothing is shown before it starts";
}
