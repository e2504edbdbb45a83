#pragma once

#include "foundation/text/utranslatedstring.h"

// The words of the program. Each asks the translator once, at its first use: none may be asked before the language of
// the run is known.
extern UTranslatedString stringUploadingToSoundCloud;
extern UTranslatedString strUploadingFile;
extern UTranslatedString strAskRetry;
extern UTranslatedString stringDoYouWantToCancelUpload;
extern UTranslatedString stringCannotStartDirectly;
extern UTranslatedString strFileWasNotFound;
extern UTranslatedString strUploadFailedForFile;
extern UTranslatedString strSoundCloudCommunicationError;
extern UTranslatedString strSoundCloudStatuscode;
extern UTranslatedString strSoundCloudErrorCode;
extern UTranslatedString strCouldNotOpenLoginScreen;
extern UTranslatedString strCouldNotOpenEditPage;
extern UTranslatedString strCheckMetaDataOnline;
extern UTranslatedString strRetryFailed;
extern UTranslatedString strNoMemory;
extern UTranslatedString strFeatureNotSupported;
extern UTranslatedString strCouldNotSetMetaDataForFile;
extern UTranslatedString strParameterCouldNotBeSetForFile;
extern UTranslatedString strParameterCouldNotBeSet;
extern UTranslatedString strParameterWillBeSetToValue;
extern UTranslatedString strInternalError;
extern UTranslatedString strImageFileCouldNotBeUploaded;
extern UTranslatedString strImageMustBeOfType;
