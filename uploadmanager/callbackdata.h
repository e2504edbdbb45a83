#pragma once

#include "foundation/text/string.h"
#include "uploadmanager/silencewatch.h"

class PUploadManagerApplication;
class UploadRequest;

/// What a transfer shares with the callbacks of libcurl. It belongs to the thread that runs the transfer.
struct CallbackData
{
    /// Where errors go.
    PUploadManagerApplication* app = nullptr;
    /// Null in the check of a token.
    UploadRequest* request = nullptr;
    /// "error" once a reply has been judged a failure.
    String error;
    /// That of the connection, which libcurl owns; -1 where nothing is sent.
    int socket = -1;
    /// A new one for each transfer.
    SilenceWatch silence;
};
