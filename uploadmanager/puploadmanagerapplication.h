#pragma once

#include "application/uapplication.h"
#include "containers/sequence/cmarray.h"
#include "foundation/text/fstring.h"
#include "foundation/thread/flock.h"
#include "storage/path/fpath.h"
#include "uploadmanager/fatalcodes.h"
#include "views/dialog/iprogress.h"

#include <atomic>

class CmDictionary;
class FAttributes;
class FNPath;
class UploadRequest;
class UploadThread;
class VlmrApplication;

namespace Xml
{
class Document;
class Element;
} // namespace Xml

/// The program: it turns export descriptions into a queue of uploads, sees to the login, follows the upload thread
/// by its messages, and quits when all is done. One host product is served at a time.
///
/// Main thread, but for what is named thread-safe below. Locks: `requestQueueLock` before `errorLock`.
class PUploadManagerApplication : public UApplication
{
    DECLARE_TYPE(PUploadManagerApplication, UApplication)

    PUploadManagerApplication();
    ~PUploadManagerApplication() override;

    int notify(FMessage* message) override;
    void postInit() override;
    /// Takes an export description, or a login redirect given as a file. True when `path` was handled.
    bool openFile(FPath* path, FPath* unused) override;
    /// There is no menu bar.
    UMenu* makeMenus() override { return nullptr; }
    /// The platform refuses files while this holds.
    bool isModal() override;

    // The queue. `requestFailed` and `getNextRequest` are called by the upload thread.

    void addRequest(UploadRequest* request);
    /// The request to work on, borrowed until the next call; null when the thread is to end.
    UploadRequest* getNextRequest();
    void requestFailed(UploadRequest* request);
    /// Sees to it that the thread works on the queue; null starts it again over the failed requests.
    void startUpload(VlmrApplication* application);
    bool checkInitializeCurl();

    // Reporting. Thread-safe.

    /// Keeps the first text only; it is shown at the next pulse, and the run ends. Tells whether there was one before.
    bool fatalError(const char16* text);
    bool fatalError(int code);
    void addUploadError(const char16* text);
    void addGeneralError(const char16* text);
    /// Two or three general errors on a value of `parameter` that can't be used; `fallback`, if any, stays in force.
    void addParameterWarning(UploadRequest* request, FString parameter, const char16* fallback);

    // Flags that the upload thread shares; plain bytes, read and written as a whole. Thread-safe.

    bool isCancelRequested() const;
    bool isModalAlertActive() const;
    void setModalAlertActive(bool active);
    /// Whether the process is going down, so that a running transfer must abort.
    bool isEnding() const { return ending; }
    bool isGuiMode() const;

    // The description.

    /// Switches the translator on, in the language of the first description of the run. `file` may be null.
    void initializeTranslation(FPath* file);
    /// A new record that all tracks begin with; null where the description can't be used.
    UploadRequest* scanUploadManagerConfiguration(Xml::Element* root);
    /// A new request of one track; null where the track can't be uploaded.
    UploadRequest* scanUploadRequest(Xml::Element* track, UploadRequest& configuration);
    bool scanPublisherConfiguration(Xml::Element* element, UploadRequest* request);
    /// Adds the attribute, or without `attributeName` the text, of each child named `elementName`.
    bool scanElements(Xml::Element& parent, FString& elementName, CmContainer& target,
                      FString* attributeName);

    // The login.

    /// True when the browser was sent to the login page, or sending it failed.
    bool checkNeedLogin(VlmrApplication* application);
    /// Asks the service; `token` is in base64 and left so.
    bool isValidAccessToken(FString& token);
    /// Takes the token out of a redirect and goes on with the description that waits for it.
    bool handleRedirect(FPath* url);
    /// Fills `result` with the pairs of query and fragment. False leaves the pairs read so far.
    bool parseUrl(FPath* url, CmDictionary& result);
    bool checkScLoginData(FPath* url, CmDictionary& dictionary);
    bool checkScError(CmDictionary& dictionary);

    /// Ends the run: lets the description go, shows what is left to tell, posts the quit message.
    void quit();
    void checkDeleteXmlFile();

private:
    /// Lets tests look at the stores and the queue.
    friend struct ApplicationProbe;

    void addProducts();
    void loadTokens();

    int onIdle(FMessage* message);
    bool isWaitingForFile();
    bool endRunIfDue();
    bool showFatalError();
    int onUploadProgress(FMessage* message);
    bool createProgress();
    bool openProgress();
    bool showProgress(FMessage& message);
    int onShowAreYouSure();
    int onUploadDone();
    bool askRetry();
    bool retryFailedRequests();
    bool restartForWaitingRequests();
    void forgetFormerEnd();
    void endProgress();
    bool hasFatalError();
    void setCancelRequested(bool requested);
    void setGuiMode(bool state);
    void addWarnings(CmArray& errors);

    void takeDescription(FPath* path);
    void forgetCachedDescription();
    bool openDescription(FPath* path);
    bool hasWaitingRequests();
    bool isOtherProductActive(VlmrApplication* application) const;
    void refuseOtherProduct();
    int readTracks(Xml::Element& root, UploadRequest& configuration);
    void waitForLogin(FPath* path);

    VlmrApplication* findProduct(const ConstString& name) const;
    void scanApplication(Xml::Element& element, UploadRequest& record);
    void scanConfiguration(Xml::Element& element);
    void scanSharing(UploadRequest& request, const FString& value);
    void scanSwitch(UploadRequest& request, const char16* name, const FString& value, bool& target);
    void scanPublishers(UploadRequest& request, Xml::Element& element);
    bool checkAudioFile(UploadRequest& request);

    void logOut(const FString& url);
    void storeToken(const FString& productName, const FString& token);
    void saveTokens(const FAttributes& tokens, bool isUnreadable);
    void addTokenFileWarning();
    void fatalRedirectError(int code);
    bool openWaitingDescription();

    bool guiMode = false;
    bool modalAlertActive = false;
    FPath* requestFile = nullptr;
    UploadThread* uploadThread = nullptr;
    CmArray applications{0, 10};
    CmArray requests{0, 10};
    UploadRequest* currentRequest = nullptr;
    CmArray finishedRequests{0, 10};
    CmArray failedRequests{0, 10};
    FLock requestQueueLock{"request queue lock"};
    bool fileReceived = false;
    IProgress* progress = nullptr;
    bool cancelRequested = false;
    FString fatalErrorText;
    FLock errorLock{"FLock"};
    CmArray uploadErrors{0, 10};
    CmArray generalErrors{0, 10};
    bool quitAtIdle = false;
    bool loginDone = false;
    bool curlInitialized = false;
    bool requireLogin = false;
    bool deleteRequestFile = true;
    std::atomic<bool> ending{false};
    /// A login or logout could not be stored, which the user is told at the end.
    bool tokenFileFailed = false;
    /// What the translator was told; it keeps the pointer.
    FString storedLanguage;
};
