#include "application/ucontroller.h"
#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/thread/flockscope.h"
#include "network/http/tlssession.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/uploadthread.h"

#include <curl/curl.h>
#include <new>

void PUploadManagerApplication::addRequest(UploadRequest* request)
{
    FLockScope guard(requestQueueLock);
    if (request && !requests.add(request))
        fatalError(kFatalAddRequest);
}

bool PUploadManagerApplication::hasWaitingRequests()
{
    FLockScope guard(requestQueueLock);
    return !requests.isEmpty();
}

UploadRequest* PUploadManagerApplication::getNextRequest()
{
    FLockScope guard(requestQueueLock);
    bool isDone = true;
    if (currentRequest)
    {
        CmArray& target = isCancelRequested() ? requests : finishedRequests;
        isDone = target.add(currentRequest);
        currentRequest->release();
        currentRequest = nullptr;
    }
    if (!isEnding() && !isCancelRequested() && FCast(UploadRequest, requests.at(0)))
    {
        currentRequest = static_cast<UploadRequest*>(requests.at(0));
        currentRequest->addRef();
        isDone = requests.removeAt(0) && isDone;
    }
    if (!isDone)
        fatalError(kFatalNextRequest);
    return currentRequest;
}

void PUploadManagerApplication::requestFailed(UploadRequest* request)
{
    if (!request)
        return;
    FLockScope guard(requestQueueLock);
    bool isDone = failedRequests.containsAbs(request) || failedRequests.add(request);
    if (requests.containsAbs(request))
        isDone = requests.remove(request) && isDone;
    if (finishedRequests.containsAbs(request))
        isDone = finishedRequests.remove(request) && isDone;
    if (currentRequest == request)
    {
        currentRequest->release();
        currentRequest = nullptr;
    }
    if (!isDone)
        fatalError(kFatalRequestFailed);
}

void PUploadManagerApplication::startUpload(VlmrApplication* application)
{
    if (!application && (!uploadThread || !uploadThread->getApplication()))
        fatalError(kFatalRetryWithoutThread);
    if (!checkInitializeCurl())
        return;

    if (!uploadThread)
        uploadThread = new (std::nothrow) UploadThread(this, application);
    if (!uploadThread)
    {
        fatalError(strNoMemory.text());
        return;
    }
    if (application && uploadThread->isThreadRunning())
        return;
    if (!application)
        uploadThread->terminate();
    forgetFormerEnd();
    if (uploadThread->run() != 0)
        fatalError(strNoMemory.text());
}

// What a former run said at its end is taken back where it was not heard yet: "upload done" would end the run that
// begins now, and so would the quit message that followed from it.
void PUploadManagerApplication::forgetFormerEnd()
{
    FMessage done("upload done");
    gMessenger->killMessages(this, &done);
    FMessage quitting("Quit");
    gMessenger->killMessages(gController, &quitting);
}

bool PUploadManagerApplication::checkInitializeCurl()
{
    if (curlInitialized)
        return true;
    // libcurl does not look whether the library of its encryption is there, and runs into it.
    curlInitialized = curl_global_init(CURL_GLOBAL_ALL) == CURLE_OK && TlsSession::isAvailable();
    if (!curlInitialized)
        fatalError(kFatalCurlGlobal);
    return curlInitialized;
}
