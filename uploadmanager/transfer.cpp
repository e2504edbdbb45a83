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
constexpr std::chrono::seconds kQuiet{5};
constexpr int kLooks = 3;

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

// A file that can't be read on, or has become shorter, ends there for libcurl, which then waits for the reply to more
// than it sends, as the service waits for the rest. A network that stalls is another thing: it takes nothing more.
bool hasStoppedSending(CallbackData& data, double total, double sent)
{
    const auto now = std::chrono::steady_clock::now();
    if (sent != data.sent || sent >= total)
    {
        data.sent = sent;
        data.sentAt = now;
        data.looks = 0;
        return false;
    }
    // Time alone also passes while the process is stopped or a question is up.
    return sent > 0 && ++data.looks >= kLooks && now - data.sentAt > kQuiet &&
           PlatformServices::unsentBytes(data.socket) == 0;
}

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

int libcurl_progress_callback(void* data, double, double, double ultotal, double ulnow)
{
    CallbackData& callbackData = *static_cast<CallbackData*>(data);
    PUploadManagerApplication* app = callbackData.app;
    if (!app || !gMessenger || app->isEnding())
        return 1;
    postProgress(callbackData, ulnow / ultotal * 100.0);
    if (callbackData.request && hasStoppedSending(callbackData, ultotal, ulnow))
    {
        failUnreadable(callbackData);
        return 1;
    }
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
