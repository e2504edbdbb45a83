#include "uploadmanager/deprecatedcurl.h"

#pragma GCC diagnostic ignored "-Wdeprecated-declarations"

const CURLformoption kFormName = CURLFORM_COPYNAME;
const CURLformoption kFormFile = CURLFORM_FILE;
const CURLformoption kFormContents = CURLFORM_COPYCONTENTS;

CURLcode setProgressFunction(CURL* curl, ProgressFunction function)
{
    return curl_easy_setopt(curl, CURLOPT_PROGRESSFUNCTION, function);
}

CURLcode setForm(CURL* curl, curl_httppost* form)
{
    return curl_easy_setopt(curl, CURLOPT_HTTPPOST, form);
}

int addFormField(curl_httppost** first, curl_httppost** last, CURLformoption option1, const char* name,
                 CURLformoption option2, const char* value)
{
    return curl_formadd(first, last, option1, name, option2, value, CURLFORM_END);
}

void freeForm(curl_httppost* form)
{
    curl_formfree(form);
}
