#include "uploadmanager/puploadmanagerapplication.h"

#include "application/ucontroller.h"
#include "foundation/message/fmessenger.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"
#include "uploadmanager/productlist.h"
#include "uploadmanager/sharedbrowser.h"
#include "uploadmanager/storednames.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadthread.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/vlmrprotocol.h"

#include <curl/curl.h>

PUploadManagerApplication::PUploadManagerApplication()
    : UApplication(kAppTypeStandalone, "Vellamoor Upload Manager")
{
    translationEnabled = false;
    setVersion(u"1", u"");
    applications.setOwnership(CmContainer::kTaken);
    uploadErrors.setOwnership(CmContainer::kTaken);
    generalErrors.setOwnership(CmContainer::kTaken);
    requests.retainElements();
    finishedRequests.retainElements();
    failedRequests.retainElements();

    configureApplication();
    registerVlmrProtocol();
    addProducts();
    loadTokens();
}

PUploadManagerApplication::~PUploadManagerApplication()
{
    // A transfer that still runs aborts at its next progress callback; what it may post until then has no receiver.
    ending = true;
    gMessenger->killMessages(this, nullptr);
    if (uploadThread)
    {
        uploadThread->waitDead(-1);
        gMessenger->killMessages(this, nullptr);
        static_cast<CmObject*>(uploadThread)->release();
    }
    cleanupProtocolHandler();
    if (curlInitialized)
        curl_global_cleanup();
    deleteSharedBrowser();
    if (progress)
        progress->release();
    if (currentRequest)
        currentRequest->release();
    if (requestFile)
        requestFile->release();
}

void PUploadManagerApplication::addProducts()
{
    for (const Product& product : kProducts)
        applications.add(new VlmrApplication(FString(product.name), FString(product.clientId),
                                             FString(product.schemeWord)));
}

void PUploadManagerApplication::loadTokens()
{
    FAttributes tokens;
    if (!FXmlArchive::loadAttributes(kTokenFile, kTokenRoot, tokens))
        return;
    for (int i = 0; i < applications.total(); i++)
    {
        VlmrApplication* product = static_cast<VlmrApplication*>(applications.at(i));
        tokens.get(product->name.text8(), product->accessToken);
    }
}

void PUploadManagerApplication::postInit()
{
    gController->addIdle(this);
    enableWarnings(true);
}

void PUploadManagerApplication::quit()
{
    endProgress();
    checkDeleteXmlFile();
    addTokenFileWarning();
    setModalAlertActive(true);
    popupWarningList(nullptr);
    setModalAlertActive(false);
    gController->postQuitMessage();
}

void PUploadManagerApplication::checkDeleteXmlFile()
{
    if (!requestFile)
        return;
    if (deleteRequestFile && gFileSystem->fileExists(requestFile))
        gFileSystem->removeFile(requestFile);
    requestFile->release();
    requestFile = nullptr;
}
