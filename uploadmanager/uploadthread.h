#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/thread/fthread.h"
#include "uploadmanager/callbackdata.h"

#include <curl/curl.h>

class PUploadManagerApplication;
class VlmrApplication;

/// Takes requests from the queue and posts each to the service; transfers block, so the idle pulse lives elsewhere.
///
/// Built and started by the main thread. It reaches the application only by the locked operations of the queue and by
/// posted messages. A run ends when the queue gives nothing more, and can be started again.
class UploadThread : public FThread, public CmObject
{
    DECLARE_TYPE(UploadThread, CmObject)

    UploadThread(PUploadManagerApplication* owner, VlmrApplication* product);

    int entry() override;
    CmObject* newCopy() const override { return nullptr; }

    /// The product whose tracks are uploaded; a run serves only one.
    VlmrApplication* getApplication() const { return application; }

private:
    void prepare(CURL* curl, CallbackData& data);
    void uploadAll(CURL* curl, CallbackData& data);
    void upload(CURL* curl, CallbackData& data);
    bool isFileThere(UploadRequest& request);

    PUploadManagerApplication* manager;
    VlmrApplication* application;
};
