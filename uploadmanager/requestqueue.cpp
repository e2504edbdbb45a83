#include "foundation/thread/flockscope.h"
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
    if (!checkInitializeCurl(kFatalCurlGlobal))
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
    uploadThread->run();
}

bool PUploadManagerApplication::checkInitializeCurl(int fatalCode)
{
    if (curlInitialized)
        return true;
    curlInitialized = curl_global_init(CURL_GLOBAL_ALL) == CURLE_OK;
    if (!curlInitialized)
        fatalError(fatalCode);
    return curlInitialized;
}
