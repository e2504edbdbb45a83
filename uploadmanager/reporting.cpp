#include "foundation/text/cmstring.h"
#include "foundation/thread/flockscope.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/wiretext.h"

bool PUploadManagerApplication::fatalError(const char16* text)
{
    FLockScope guard(errorLock);
    if (!fatalErrorText.isEmpty())
        return true;
    if (text)
        fatalErrorText.assign(text);
    return false;
}

bool PUploadManagerApplication::fatalError(int code)
{
    FString text;
    text.printf(strInternalError.text(), code);
    return fatalError(text.text16());
}

void PUploadManagerApplication::addUploadError(const char16* text)
{
    if (!text)
        return;
    FLockScope guard(errorLock);
    uploadErrors.add(new CmString(text));
}

void PUploadManagerApplication::addGeneralError(const char16* text)
{
    if (!text)
        return;
    FLockScope guard(errorLock);
    generalErrors.add(new CmString(text));
}

void PUploadManagerApplication::addParameterWarning(UploadRequest* request, FString parameter,
                                                    const char16* fallback)
{
    if (!request || parameter.isEmpty())
        return;
    FString path = getPathText(&request->path);
    FString text;
    if (path.isEmpty())
        text.printf(strParameterCouldNotBeSet.text(), parameter.text16());
    else
        text.printf(strParameterCouldNotBeSetForFile.text(), parameter.text16(), path.text16());
    addGeneralError(text.text16());
    if (fallback)
    {
        text.printf(strParameterWillBeSetToValue.text(), fallback);
        addGeneralError(text.text16());
    }
    addGeneralError(strCheckMetaDataOnline.text());
}

bool PUploadManagerApplication::hasFatalError()
{
    FLockScope guard(errorLock);
    return !fatalErrorText.isEmpty();
}

// Copies the texts of a store to the warning list. They are shared by reference meanwhile, as the list is not locked.
void PUploadManagerApplication::addWarnings(CmArray& errors)
{
    CmArray texts(0, 10);
    texts.retainElements();
    {
        FLockScope guard(errorLock);
        texts.takeAllFrom(&errors, true);
    }
    for (int i = 0; i < texts.total(); i++)
        addWarning(static_cast<CmString*>(texts.at(i))->text16());
}
