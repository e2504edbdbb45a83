#include "tests/uploadmanager/applicationfixture.h"

#include "application/ucontroller.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"
#include "uploadmanager/transfer.h"
#include "uploadmanager/vlmrapplication.h"

#include <thread>

// How a run goes on and ends, with tracks whose file is gone: the thread fails them without asking the service.

namespace
{
class Run : public ApplicationTest
{
protected:
    void add(const char16* path = u"/none/a.wav")
    {
        IPtr<UploadRequest> request = adopt(new UploadRequest);
        request->path = FNPath(path, FPath::kFile);
        app->addRequest(request);
    }
    /// Lets the thread work on the queue until it has nothing more to do.
    void upload()
    {
        app->startUpload(ApplicationProbe::product(*app, "Plenar"));
        ApplicationProbe::waitForThread(*app);
    }
    int notify(const char* type)
    {
        FMessage message(type);
        return app->notify(&message);
    }
    int posted(const char* type) { return gMessenger->messagesPosted(app, type); }
    static bool isQuitting() { return gMessenger->messagesPosted(gController, "Quit") > 0; }
    int failed() { return ApplicationProbe::failed(*app); }
    std::string fatal() { return ApplicationProbe::fatalError(*app); }
};
} // namespace

TEST_F(Run, TellsUploadErrorsBeforeTheQuestionAndTheOthersAtItsEnd)
{
    app->enableWarnings(true);
    add();
    upload();
    app->addGeneralError(u"general");
    testing::internal::CaptureStderr();
    EXPECT_EQ(notify("upload done"), 1);

    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "The file \"/none/a.wav\" could not be found.\n"
              "Some files could not be uploaded. Do you want to retry?\n"
              "general\n");
    EXPECT_EQ(failed(), 1) << "nobody answered, which means no";
    EXPECT_TRUE(ApplicationProbe::isCancelled(*app));
    EXPECT_TRUE(isQuitting());
}

TEST_F(Run, ShowsAFatalErrorAloneAndOnlyAtAPulse)
{
    app->enableWarnings(true);
    add();
    upload();
    app->addGeneralError(u"general");
    EXPECT_FALSE(app->openFile(nullptr, nullptr));
    testing::internal::CaptureStderr();
    EXPECT_EQ(notify("upload done"), 1);
    EXPECT_EQ(notify("upload progress"), 1);
    EXPECT_EQ(notify("show are you sure"), 1);
    EXPECT_FALSE(isQuitting());
    EXPECT_EQ(notify("Idle"), 1);

    EXPECT_EQ(testing::internal::GetCapturedStderr(), "Internal program error.\nError Code: 2\n");
    EXPECT_TRUE(isQuitting());
}

TEST_F(Run, ThrowsAwayADescriptionThatComesWhileAQuestionStands)
{
    std::string file = write("second.xml", "<AudioExportDescription/>");
    IPtr<FNPath> path = adopt(new FNPath(FPath::kFile));
    path->fromPlatformPath(file.c_str());
    app->setModalAlertActive(true);
    EXPECT_FALSE(app->openFile(path, nullptr));
    EXPECT_FALSE(std::filesystem::exists(file));
    EXPECT_EQ(fatal(), "");
}

TEST_F(Run, IsNotEndedByWhatAFormerOneSaidAtItsEnd)
{
    add();
    upload();
    add();
    upload();
    EXPECT_EQ(posted("upload done"), 1) << "the first would end the second";
    EXPECT_EQ(failed(), 2);

    notify("upload done");
    EXPECT_TRUE(isQuitting());
    add();
    upload();
    EXPECT_FALSE(isQuitting()) << "the description came before the quit message was heard";
}

TEST_F(Run, BeginsAnewWhereTracksCameAsTheThreadRanDry)
{
    add();
    upload();
    add();
    notify("upload done");
    ApplicationProbe::waitForThread(*app);
    EXPECT_EQ(ApplicationProbe::waiting(*app), 0);
    EXPECT_EQ(failed(), 2);
    EXPECT_FALSE(isQuitting());
}

TEST_F(Run, GoesOnForARetryWithoutAThreadButTellsSo)
{
    add();
    app->startUpload(nullptr);
    ApplicationProbe::waitForThread(*app);
    EXPECT_EQ(fatal(), "Internal program error.\nError Code: 19");
    EXPECT_EQ(failed(), 1);
    EXPECT_EQ(app->notify(nullptr), -1);
}

TEST_F(Run, AsksOnceWhetherToCancelWhileTheTransferStandsStill)
{
    IPtr<UploadRequest> request = adopt(new UploadRequest);
    CallbackData data;
    data.app = app;
    data.request = request;
    EXPECT_EQ(libcurl_progress_callback(&data, 0, 0, 0, 0), 0) << "no number at all is no harm";
    EXPECT_EQ(posted("upload progress"), 1);

    // The main thread's part while another one transfers: the question, answered by its last button, which is no.
    int result = -1;
    ApplicationProbe::cancel(*app);
    std::thread transfer([&] { result = libcurl_progress_callback(&data, 0, 0, 100, 50); });
    while (ApplicationProbe::isCancelled(*app))
        gMessenger->deliverMessages();
    transfer.join();
    EXPECT_EQ(result, 0);
    EXPECT_FALSE(app->isModalAlertActive());

    // Yes leaves the flag as it is.
    ApplicationProbe::cancel(*app);
    std::thread cancelled([&] { result = libcurl_progress_callback(&data, 0, 0, 100, 60); });
    while (posted("show are you sure") == 0)
        std::this_thread::yield();
    app->setModalAlertActive(false);
    cancelled.join();
    EXPECT_EQ(result, 1);

    EXPECT_EQ(libcurl_progress_callback(&data, 0, 0, 100, 70), 1);
    EXPECT_EQ(posted("show are you sure"), 1) << "there is no second question";
}
