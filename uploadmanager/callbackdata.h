#pragma once

#include "foundation/text/string.h"

#include <chrono>

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
    /// How many bytes had gone out when last some went, when that was, and how often it was looked at since.
    double sent = -1.0;
    std::chrono::steady_clock::time_point sentAt;
    int looks = 0;
};
