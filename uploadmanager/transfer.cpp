#include "uploadmanager/transfer.h"

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/thread/fthread.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/serviceconfiguration.h"
#include "uploadmanager/uploadrequest.h"

#include <limits>

namespace
{
constexpr int kQuestionPollMs = 5;

// Without a known total the quotient is no number; the dialog takes any value.
int truncateToInt(double value)
{
    constexpr double kLowest = std::numeric_limits<int>::min();
    constexpr double kHighest = std::numeric_limits<int>::max();
    return value >= kLowest && value <= kHighest ? static_cast<int>(value) : std::numeric_limits<int>::min();
}

void postProgress(CallbackData& data, double percent)
{
    FMessage* message = new FMessage("upload progress");
    message->add("request", data.request, true);
    message->addInt("progress", truncateToInt(percent));
    gMessenger->postMessage(data.app, message, false, 0);
}

// Stands still while the question is on the screen.
void askForCancel(PUploadManagerApplication& app)
{
    app.setModalAlertActive(true);
    gMessenger->postMessage(&app, new FMessage("show are you sure"), false, 0);
    while (app.isModalAlertActive() && !app.isEnding())
        FThreadSleep(kQuestionPollMs);
}
} // namespace

int checkCurlError(CURLcode code, CallbackData& data)
{
    if (code == CURLE_OK || code == CURLE_ABORTED_BY_CALLBACK)
        return 0;
    data.app->fatalError(kFatalCurl + static_cast<int>(code));
    return -1;
}

void setVerification(CURL* curl, CallbackData& data)
{
    checkCurlError(curl_easy_setopt(curl, CURLOPT_SSL_VERIFYPEER, 1L), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_SSL_VERIFYHOST, 2L), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_CAINFO, getCertificateFile().text8()), data);
}

void setReplyCallback(CURL* curl, CallbackData& data)
{
    checkCurlError(curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, libcurl_write_callback), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_WRITEDATA, &data), data);
}

int libcurl_progress_callback(void* data, double, double, double ultotal, double ulnow)
{
    CallbackData& callbackData = *static_cast<CallbackData*>(data);
    PUploadManagerApplication* app = callbackData.app;
    if (!app || !gMessenger || app->isEnding())
        return 1;
    postProgress(callbackData, ulnow / ultotal * 100.0);
    if (!app->isCancelRequested())
        return 0;

    static bool cancelDialogWasShown = false;
    if (!cancelDialogWasShown)
    {
        askForCancel(*app);
        cancelDialogWasShown = app->isCancelRequested();
    }
    return app->isCancelRequested() || app->isEnding() ? 1 : 0;
}
