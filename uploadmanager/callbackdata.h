#pragma once

#include "foundation/text/string.h"

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
};
