#pragma once

#include "uploadmanager/callbackdata.h"

#include <curl/curl.h>

class VlmrApplication;
class ConstString;
class FNPath;
class FUrl;

/// The multipart form of one track, built field by field in the order that the service is sent.
///
/// A field that libcurl refuses is left out and told as upload errors; the upload goes on without it. One thread.
class UploadForm
{
public:
    /// `data` names the request; `application`, which may be null, holds the token. Both outlive the form.
    UploadForm(CallbackData& data, VlmrApplication* application);
    ~UploadForm();
    UploadForm(const UploadForm&) = delete;
    UploadForm& operator=(const UploadForm&) = delete;

    /// Null where not one field could be added.
    curl_httppost* get() const { return first; }

private:
    void addAsset();
    void addToken(VlmrApplication* application);
    void addArtwork();
    void addDescription();
    void addReleaseDate();
    void addLinks();
    void addFlags();
    void addTags();

    void addFile(const char* name, const FNPath& path);
    void addText(const char* name, const ConstString& text);
    void addTextIfAny(const char* name, const ConstString& text);
    void addUrl(const char* name, const FUrl& url);
    void addNumber(const char* name, double number);
    void addFlag(const char* name, bool value);

    CallbackData& callbackData;
    curl_httppost* first = nullptr;
    curl_httppost* last = nullptr;
};

/// Adds one field to a form; where libcurl refuses it, two upload errors tell of the field.
void vlmr_curl_formadd2(curl_httppost** first, curl_httppost** last, CURLformoption option1, const char* name,
                        CURLformoption option2, const char* value, CallbackData& data);
