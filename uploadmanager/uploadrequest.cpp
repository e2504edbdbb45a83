#include "uploadmanager/uploadrequest.h"

UploadRequest::UploadRequest() : license("all-rights-reserved"), sharing("private")
{
    publishers.retainElements();
    keywords.retainElements();
}
