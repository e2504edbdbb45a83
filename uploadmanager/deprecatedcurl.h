#pragma once

#include <curl/curl.h>

// The form interface and the older progress callback of libcurl: deprecated, but the newer ones send a form whose
// fields and file names are written differently, and the service was made against these. The warnings are silenced
// here and nowhere else.

using ProgressFunction = int (*)(void* data, double dltotal, double dlnow, double ultotal, double ulnow);

/// Options of a field: its name, a file as its content, a text as its content.
extern const CURLformoption kFormName;
extern const CURLformoption kFormFile;
extern const CURLformoption kFormContents;

inline constexpr int kFormFieldAdded = 0;

CURLcode setProgressFunction(CURL* curl, ProgressFunction function);
CURLcode setForm(CURL* curl, curl_httppost* form);
/// kFormFieldAdded, or the code of libcurl for why the field was refused.
int addFormField(curl_httppost** first, curl_httppost** last, CURLformoption option1, const char* name,
                 CURLformoption option2, const char* value);
void freeForm(curl_httppost* form);
