#include "uploadmanager/transfer.h"

#include "application/platformservices.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/thread/fthread.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/serviceconfiguration.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/wiretext.h"

#include <chrono>
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

int takeSocket(void* data, curl_socket_t socket, curlsocktype)
{
    static_cast<CallbackData*>(data)->socket = socket;
    return CURL_SOCKOPT_OK;
}

SilenceWatch::Verdict watch(CallbackData& data, double total, double sent, double received)
{
    const auto now = std::chrono::steady_clock::now();
    if (!data.silence.isDue(now))
        return SilenceWatch::Verdict::kMoving;
    const SilenceWatch::Bytes bytes = {total, sent, received, PlatformServices::unsentBytes(data.socket)};
    return data.silence.look(bytes, now);
}

// A file that can't be read on, or has become shorter, ends there for libcurl, which then waits for the reply to more
// than it sends, as the service waits for the rest.
void failUnreadable(CallbackData& data)
{
    FString text;
    text.printf(strUploadFailedForFile.text(), getPathText(&data.request->path).text16());
    data.app->addUploadError(text.text16());
    data.error.assign("error");
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

void noteSocket(CURL* curl, CallbackData& data)
{
    checkCurlError(curl_easy_setopt(curl, CURLOPT_SOCKOPTFUNCTION, takeSocket), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_SOCKOPTDATA, &data), data);
}

void performTransfer(CURL* curl, CallbackData& data)
{
    data.silence = SilenceWatch();
    CURLcode code = curl_easy_perform(curl);
    if (code == CURLE_ABORTED_BY_CALLBACK && data.silence.isNetworkSilent())
        code = CURLE_OPERATION_TIMEDOUT;
    checkCurlError(code, data);
}

int stopSilentTransfer(void* data, double, double dlnow, double ultotal, double ulnow)
{
    const auto verdict = watch(*static_cast<CallbackData*>(data), ultotal, ulnow, dlnow);
    return verdict == SilenceWatch::Verdict::kMoving ? 0 : 1;
}

int libcurl_progress_callback(void* data, double, double dlnow, double ultotal, double ulnow)
{
    CallbackData& callbackData = *static_cast<CallbackData*>(data);
    PUploadManagerApplication* app = callbackData.app;
    if (!app || !gMessenger || app->isEnding())
        return 1;
    postProgress(callbackData, ulnow / ultotal * 100.0);
    const SilenceWatch::Verdict verdict = watch(callbackData, ultotal, ulnow, dlnow);
    if (verdict == SilenceWatch::Verdict::kFileEnded && callbackData.request)
        failUnreadable(callbackData);
    if (verdict != SilenceWatch::Verdict::kMoving)
        return 1;
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
