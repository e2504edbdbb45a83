#include "uploadmanager/uploadthread.h"

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "storage/filesystem/fnfilesystem.h"
#include "uploadmanager/deprecatedcurl.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/serviceconfiguration.h"
#include "uploadmanager/transfer.h"
#include "uploadmanager/uploadform.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/wiretext.h"

namespace
{
constexpr int kUploadPriority = 4;
}

UploadThread::UploadThread(PUploadManagerApplication* owner, VlmrApplication* product)
    : FThread("Upload Thread"),
      manager(owner),
      application(product)
{
    setPriority(kUploadPriority);
}

int UploadThread::entry()
{
    CallbackData data;
    data.app = manager;
    CURL* curl = curl_easy_init();
    if (!curl)
    {
        manager->fatalError(kFatalCurlUpload);
        return -1;
    }
    prepare(curl, data);
    uploadAll(curl, data);
    curl_easy_cleanup(curl);
    gMessenger->postMessage(manager, new FMessage("upload done"), false, 0);
    return 0;
}

void UploadThread::prepare(CURL* curl, CallbackData& data)
{
    checkCurlError(curl_easy_setopt(curl, CURLOPT_URL, makeApiUrl("/tracks").text8()), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 0L), data);
    checkCurlError(setProgressFunction(curl, libcurl_progress_callback), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_PROGRESSDATA, &data), data);
    setVerification(curl, data);
    setReplyCallback(curl, data);
    noteSocket(curl, data);
}

// The judgement on a reply is not taken back between the requests of a run: once one has failed, all behind it count
// as failed too, and a retry sends them again.
void UploadThread::uploadAll(CURL* curl, CallbackData& data)
{
    while ((data.request = manager->getNextRequest()))
    {
        if (isFileThere(*data.request))
            upload(curl, data);
        else
            manager->requestFailed(data.request);
    }
}

bool UploadThread::isFileThere(UploadRequest& request)
{
    FString path = getPathText(&request.path);
    if (!path.isEmpty() && gFileSystem->fileExists(&request.path))
        return true;
    FString text;
    text.printf(strFileWasNotFound.text(), path.text16());
    manager->addUploadError(text.text16());
    return false;
}

void UploadThread::upload(CURL* curl, CallbackData& data)
{
    UploadForm form(data, application);
    checkCurlError(setForm(curl, form.get()), data);

    // Brings the dialog up before the first byte goes out.
    FMessage* message = new FMessage("upload progress");
    message->addInt("progress", 0);
    gMessenger->postMessage(manager, message, false, 0);

    performTransfer(curl, data);
    if (!data.error.isEmpty())
        manager->requestFailed(data.request);
}
