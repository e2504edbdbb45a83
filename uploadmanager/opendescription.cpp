#include "application/udesktop.h"
#include "foundation/object/iptr.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/xml/xmldocument.h"
#include "storage/xml/xmlelement.h"
#include "uploadmanager/descriptionform.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/storednames.h"
#include "uploadmanager/storedpath.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/uploadthread.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/wiretext.h"
#include "views/dialog/ualert.h"

namespace
{
void removeIfThere(FPath* path)
{
    if (gFileSystem->fileExists(path))
        gFileSystem->removeFile(path);
}

bool isFolderOnDisk(FPath& path)
{
    FNPath native(getPathText(&path).text16(), FPath::kFile);
    return path.isFolder() || native.isRootDir() || gFileSystem->dirExists(&native);
}
} // namespace

bool PUploadManagerApplication::openFile(FPath* path, FPath*)
{
    fileReceived = true;
    if (gDesktop && isModalAlertActive())
    {
        // A description that comes while a question stands is thrown away.
        if (path)
            removeIfThere(path);
        return false;
    }
    initializeTranslation(path);
    if (!path)
    {
        fatalError(kFatalNullPath);
        return false;
    }
    if (!isDescriptionPath(*path))
    {
        if (!isFolderOnDisk(*path))
            return handleRedirect(path);
        fatalError(kFatalNotAFile);
        return true;
    }
    takeDescription(path);
    forgetCachedDescription();
    return openDescription(path);
}

bool PUploadManagerApplication::openDescription(FPath* path)
{
    Xml::Document document;
    switch (loadDescription(document, path))
    {
    case kDescriptionUnreadable:
        fatalError(kFatalCannotOpen);
        return false;
    case kDescriptionForeign:
        fatalError(kFatalNoDescription);
        return true;
    case kDescriptionLoaded:
        break;
    }
    Xml::Element& root = *document.getRootElement();
    IPtr<UploadRequest> configuration = adopt(scanUploadManagerConfiguration(&root));
    if (!configuration)
    {
        fatalError(kFatalConfiguration);
        return false;
    }
    if (isOtherProductActive(configuration->application))
    {
        refuseOtherProduct();
        return false;
    }
    // A thread that is under way may have taken the tracks from the queue already.
    if (readTracks(root, *configuration) == 0 && !hasWaitingRequests())
    {
        fatalError(kFatalNoTrack);
        return true;
    }
    if (checkNeedLogin(configuration->application))
        waitForLogin(path);
    else
        startUpload(configuration->application);
    return true;
}

void PUploadManagerApplication::takeDescription(FPath* path)
{
    path->addRef();
    checkDeleteXmlFile();
    requestFile = path;
}

// What a login was waited for is superseded by the file that is opened now.
void PUploadManagerApplication::forgetCachedDescription()
{
    FAttributes cache;
    if (FXmlArchive::loadAttributes(kCacheFile, kCacheRoot, cache))
    {
        IPtr<FNPath> waiting = restorePath(cache, kCacheKey);
        if (!waiting->isEqual(requestFile))
            removeIfThere(waiting);
    }
    FXmlArchive::removeObjectArchive(kCacheFile);
}

bool PUploadManagerApplication::isOtherProductActive(VlmrApplication* application) const
{
    return uploadThread && uploadThread->getApplication() != application;
}

void PUploadManagerApplication::refuseOtherProduct()
{
    setModalAlertActive(true);
    UAlert::run(strFeatureNotSupported.text(), UAlert::kInformation, nullptr, nullptr, nullptr, nullptr);
    setModalAlertActive(false);
}

// Gives how many tracks there were to upload.
int PUploadManagerApplication::readTracks(Xml::Element& root, UploadRequest& configuration)
{
    int count = 0;
    forEachChildElement(root,
                        [&](Xml::Element& element)
                        {
                            if (!isElementNamed(element, u"Track"))
                                return;
                            IPtr<UploadRequest> request = adopt(scanUploadRequest(&element, configuration));
                            if (!request)
                            {
                                fatalError(kFatalTrack);
                                return;
                            }
                            addRequest(request);
                            count++;
                        });
    return count;
}

// The redirect of the login starts the program anew and finds the description by the cache file.
void PUploadManagerApplication::waitForLogin(FPath* path)
{
    FString text = getPathText(path);
    FAttributes cache;
    storePath(cache, kCacheKey, text);
    if (text.isEmpty() || !FXmlArchive::saveAttributes(kCacheFile, kCacheRoot, cache))
    {
        fatalError(kFatalCache);
        return;
    }
    deleteRequestFile = false;
    quitAtIdle = true;
}
