#pragma once

#include "containers/sequence/cmarray.h"
#include "containers/value/cmdate.h"
#include "foundation/text/fstring.h"
#include "storage/path/fnpath.h"
#include "storage/url/furl.h"

class VlmrApplication;

/// One track with all that the service is told of it.
///
/// The configuration of a description fills one as a template, and each track begins as a copy of that. Requests are
/// shared by reference between the queue, the upload thread and messages; none changes after it entered the queue.
class UploadRequest : public CmObject
{
    DECLARE_COPYABLE(UploadRequest, CmObject)

    UploadRequest();
    UploadRequest(const UploadRequest& other) = default;

    FNPath path;
    /// Borrowed from the application, which keeps its products to the end.
    VlmrApplication* application = nullptr;
    CmArray publishers{0, 10};
    FString title;
    FString description;
    FNPath artworkPath;
    /// Beats a minute; below 0 while unknown.
    double tempo = -1.0;
    FString rootKey;
    FString signature;
    FString genre;
    FString trackType;
    CmArray keywords{0, 10};
    FString isrc;
    FString labelName;
    FString labelCode;
    CmDate releaseDate{0u};
    FString license;
    FUrl purchaseUrl;
    FUrl videoUrl;
    FString sharing;
    bool commentable = true;
    bool streamable = true;
    bool downloadable = false;
};
