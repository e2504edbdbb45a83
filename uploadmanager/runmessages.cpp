#include "application/ucontroller.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/classfactory.h"
#include "foundation/thread/flockscope.h"
#include "services/localisation/utranslator.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/uploadthread.h"
#include "views/dialog/dialogstrings.h"
#include "views/dialog/ualert.h"

#include <algorithm>
#include <atomic>
#include <iterator>

// How the program follows its run: the idle pulse and the messages of the upload thread, all on the main thread.

namespace
{
constexpr int kHandled = 1;
constexpr int kFailed = -1;

// A start without a file is told by time alone: about a third of a second.
constexpr int kPulsesWithoutFile = 21;

constexpr int kProgressModePlain = 1;
constexpr int kProgressMaximum = 100;
constexpr int kAnswerYes = 1;
constexpr int kAnswerNo = 2;

// Flags that the upload thread reads; the dialog's cancel button writes one of them through a plain pointer.
bool loadFlag(const bool& flag)
{
    return std::atomic_ref<bool>(const_cast<bool&>(flag)).load();
}

void storeFlag(bool& flag, bool value)
{
    std::atomic_ref<bool>(flag).store(value);
}

// Keeps a dialog's own event handling from delivering further messages inside the one at hand.
class DeliveryPause
{
public:
    DeliveryPause() { gMessenger->lockMessageDeliverance(true); }
    ~DeliveryPause() { gMessenger->lockMessageDeliverance(false); }
    DeliveryPause(const DeliveryPause&) = delete;
    DeliveryPause& operator=(const DeliveryPause&) = delete;
};

int askYesNo(const char16* text)
{
    return UAlert::run(text, UAlert::kQuestion, strYes.text(), strNo.text(), nullptr, nullptr);
}
} // namespace

bool PUploadManagerApplication::isCancelRequested() const
{
    return loadFlag(cancelRequested);
}

void PUploadManagerApplication::setCancelRequested(bool requested)
{
    storeFlag(cancelRequested, requested);
}

bool PUploadManagerApplication::isModalAlertActive() const
{
    return loadFlag(modalAlertActive);
}

void PUploadManagerApplication::setModalAlertActive(bool active)
{
    storeFlag(modalAlertActive, active);
}

bool PUploadManagerApplication::isGuiMode() const
{
    return loadFlag(guiMode);
}

void PUploadManagerApplication::setGuiMode(bool state)
{
    storeFlag(guiMode, state);
}

bool PUploadManagerApplication::isModal()
{
    return isModalAlertActive() || UApplication::isModal();
}

int PUploadManagerApplication::notify(FMessage* message)
{
    if (!message)
        return kFailed;
    if (message->isType("Idle"))
        return onIdle(message);
    if (message->isType("upload progress"))
        return onUploadProgress(message);
    if (message->isType("show are you sure"))
        return onShowAreYouSure();
    if (message->isType("upload done"))
        return onUploadDone();
    return UApplication::notify(message);
}

int PUploadManagerApplication::onIdle(FMessage* message)
{
    if (isWaitingForFile())
        return UApplication::notify(message);
    if (!translationEnabled)
    {
        translationEnabled = true;
        gTranslator->initialize(false);
    }
    return endRunIfDue() ? kHandled : UApplication::notify(message);
}

bool PUploadManagerApplication::endRunIfDue()
{
    // Held while the alert is up, so that the upload thread adds no further error behind the one that is shown.
    FLockScope guard(errorLock);
    if (!fileReceived && fatalErrorText.isEmpty())
        fatalErrorText.assign(stringCannotStartDirectly.text());
    if (showFatalError())
        return true;
    if (quitAtIdle)
        quit();
    return quitAtIdle;
}

bool PUploadManagerApplication::isWaitingForFile()
{
    static int counter = 0;
    if (fileReceived)
        return false;
    counter++;
    return counter < kPulsesWithoutFile;
}

bool PUploadManagerApplication::showFatalError()
{
    if (fatalErrorText.isEmpty())
        return false;
    endProgress();
    setModalAlertActive(true);
    UAlert::run(fatalErrorText.text16(), UAlert::kInformation, strOK.text(), nullptr, nullptr, nullptr);
    setModalAlertActive(false);
    quit();
    return true;
}

int PUploadManagerApplication::onUploadProgress(FMessage* message)
{
    if (quitAtIdle || isCancelRequested() || hasFatalError())
        return kHandled;
    bool isShown = true;
    if (!progress)
    {
        if (!createProgress())
        {
            fatalError(kFatalProgressDialog);
            return kFailed;
        }
        isShown = openProgress();
    }
    DeliveryPause pause;
    return showProgress(*message) && isShown ? kHandled : kFailed;
}

bool PUploadManagerApplication::createProgress()
{
    ClassFactory* factory = ClassFactory::instance(false);
    FUnknown* object = factory ? factory->createObjectByID(IProgress::iid) : nullptr;
    progress = askInterface<IProgress>(object);
    if (object)
        object->release();
    return progress != nullptr;
}

bool PUploadManagerApplication::openProgress()
{
    const int32 results[] = {
        progress->initialize(kProgressModePlain, stringUploadingToSoundCloud.text(), &cancelRequested),
        progress->setMaxValue(kProgressMaximum), progress->startProcessing()};
    return std::all_of(std::begin(results), std::end(results),
                       [](int32 result) { return result == kResultOk; });
}

bool PUploadManagerApplication::showProgress(FMessage& message)
{
    int64 percent = 0;
    message.getInt("progress", &percent);
    bool isShown = progress->setProgressValue(static_cast<int>(percent)) == kResultOk;

    UploadRequest* request = FCast(UploadRequest, toFObject(message.getUnknown("request")));
    if (!request)
        return isShown;
    int done = 0;
    int total = 0;
    {
        FLockScope guard(requestQueueLock);
        done = finishedRequests.total() + failedRequests.total();
        total = done + requests.total();
    }
    FString text;
    text.printf(strUploadingFile.text(), FString(request->path.getName()).text16(), done + 1, total + 1);
    return progress->setProgressInfo(text.text16()) == kResultOk && isShown;
}

int PUploadManagerApplication::onShowAreYouSure()
{
    if (quitAtIdle || hasFatalError())
        return kHandled;
    endProgress();
    setModalAlertActive(true);
    if (askYesNo(stringDoYouWantToCancelUpload.text()) == kAnswerNo)
        setCancelRequested(false);
    setModalAlertActive(false);
    return kHandled;
}

int PUploadManagerApplication::onUploadDone()
{
    if (quitAtIdle || hasFatalError())
        return kHandled;
    // The thread has said its last word; only its return is outstanding.
    if (uploadThread)
        uploadThread->waitDead(-1);
    if (restartForWaitingRequests())
        return kHandled;
    endProgress();
    if (!failedRequests.isEmpty() && askRetry() && retryFailedRequests())
        return kHandled;
    setModalAlertActive(false);
    addWarnings(generalErrors);
    quit();
    return kHandled;
}

// A description may arrive just as the thread runs dry; its tracks must not wait for ever.
bool PUploadManagerApplication::restartForWaitingRequests()
{
    if (!uploadThread || isCancelRequested() || !hasWaitingRequests())
        return false;
    startUpload(uploadThread->getApplication());
    return true;
}

bool PUploadManagerApplication::askRetry()
{
    addWarnings(uploadErrors);
    setModalAlertActive(true);
    popupWarningList(nullptr);
    if (askYesNo(strAskRetry.text()) == kAnswerYes)
    {
        setModalAlertActive(false);
        return true;
    }
    setCancelRequested(true);
    return false;
}

bool PUploadManagerApplication::retryFailedRequests()
{
    bool isMoved = true;
    {
        FLockScope guard(requestQueueLock);
        for (int i = 0; isMoved && i < failedRequests.total(); i++)
            isMoved = requests.add(failedRequests.at(i));
        if (isMoved)
            failedRequests.removeAll();
    }
    if (!isMoved)
    {
        addUploadError(strRetryFailed.text());
        return false;
    }
    {
        FLockScope guard(errorLock);
        uploadErrors.removeAll();
    }
    startUpload(nullptr);
    return true;
}

void PUploadManagerApplication::endProgress()
{
    if (progress)
        progress->endProcessing();
}
