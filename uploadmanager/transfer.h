#pragma once

#include "uploadmanager/callbackdata.h"

#include <cstddef>
#include <curl/curl.h>

// What all transfers have in common. The functions may be called by the main thread (token check) and by the upload
// thread.

/// 0 where `code` is success or an abort by the progress callback; else -1, and the fatal error 1000 plus the code is
/// set. A failed option thus never stops the flow by itself.
int checkCurlError(CURLcode code, CallbackData& data);

/// The certificates and the host name of the service are checked, against the certificates shipped with the program.
void setVerification(CURL* curl, CallbackData& data);
/// The reply goes to `libcurl_write_callback` with `data`.
void setReplyCallback(CURL* curl, CallbackData& data);
/// `data` is told the socket of each new connection.
void noteSocket(CURL* curl, CallbackData& data);

/// Runs what `curl` was set up for. An error is a fatal one; a silent network ends it with libcurl's code of a timeout.
void performTransfer(CURL* curl, CallbackData& data);

/// Takes a chunk of a reply; `data` is a CallbackData or null. Each chunk is read by itself as one XML document.
/// Always gives the whole size, so that no reply breaks a transfer.
size_t libcurl_write_callback(char* buffer, size_t size, size_t count, void* data);

/// Gives non-zero to abort where the network is silent for too long, and posts nothing; `data` is a CallbackData.
int stopSilentTransfer(void* data, double dltotal, double dlnow, double ultotal, double ulnow);

/// The same, posts the progress to the application, asks about a cancel, and fails a file that ends too early.
int libcurl_progress_callback(void* data, double dltotal, double dlnow, double ultotal, double ulnow);
