#pragma once

/// The numbers of "Internal program error."; users read them to support, so none is ever renumbered.
enum FatalCode
{
    kFatalProgressDialog = 1,
    kFatalNullPath = 2,
    kFatalConfiguration = 3,
    kFatalTrack = 4,
    /// Also of the token file, for which nothing ends: it is told among the warnings.
    kFatalCache = 5,
    kFatalNoTrack = 6,
    kFatalNoDescription = 7,
    kFatalCannotOpen = 8,
    kFatalRedirectWithoutData = 9,
    kFatalNotAFile = 11,
    kFatalAddRequest = 12,
    kFatalNextRequest = 13,
    kFatalRequestFailed = 14,
    kFatalConfigurationMemory = 15,
    kFatalProduct = 16,
    kFatalCurlGlobal = 17,
    kFatalCurlTokenCheck = 18,
    kFatalRetryWithoutThread = 19,
    kFatalCurlUpload = 20,
    kFatalPublisher = 21,
    kFatalRedirectUrl = 22,
    /// Plus the code of libcurl.
    kFatalCurl = 1000,
};
