#include "uploadmanager/uploadtexts.h"

UTranslatedString stringUploadingToSoundCloud("Uploading audio file(s) to SoundCloud...");
UTranslatedString strUploadingFile("Uploading \"%s\" (%i of %i)");
UTranslatedString strAskRetry("Some files could not be uploaded. Do you want to retry?");
UTranslatedString
    stringDoYouWantToCancelUpload("Do you want to cancel the upload?\n"
                                  "Tracks that were uploaded before the current track will remain uploaded.");
UTranslatedString stringCannotStartDirectly("You cannot start the Vellamoor Upload Manager directly.");
UTranslatedString strFileWasNotFound("The file \"%s\" could not be found.");
UTranslatedString strUploadFailedForFile("The file \"%s\" could not be uploaded to SoundCloud.");
UTranslatedString strSoundCloudCommunicationError("Error communicating with SoundCloud server.");
UTranslatedString strSoundCloudStatuscode("SoundCloud answered:");
UTranslatedString strSoundCloudErrorCode("SoundCloud error code: %i");
UTranslatedString
    strCouldNotOpenLoginScreen("Could not open default web browser to show SoundCloud login screen.");
UTranslatedString
    strCouldNotOpenEditPage("Could not open SoundCloud edit page for uploaded audio file \"%s\".");
UTranslatedString strCheckMetaDataOnline("Be sure to check the edit page on SoundCloud.");
UTranslatedString strRetryFailed("Retry failed.");
UTranslatedString strNoMemory("Out of memory.");
UTranslatedString strFeatureNotSupported(
    "You cannot upload tracks from 2 different Vellamoor applications at the same time.\n"
    "Please wait until the current upload has finished.");
UTranslatedString
    strCouldNotSetMetaDataForFile("Could not set SoundCloud parameter \"%s\" to \"%s\" for file \"%s\".");
UTranslatedString strParameterCouldNotBeSetForFile(
    "The parameter \"%s\" could not be set to the requested value for file \"%s\".");
UTranslatedString
    strParameterCouldNotBeSet("The parameter \"%s\" could not be set to the requested value for any file.");
UTranslatedString strParameterWillBeSetToValue("The parameter will be set to \"%s\".");
UTranslatedString strInternalError("Internal program error.\nError Code: %i");
UTranslatedString strImageFileCouldNotBeUploaded("The artwork image for \"%s\" could not be uploaded.");
UTranslatedString strImageMustBeOfType("The artwork file has to be of type \"jpeg\", \"png\" or \"gif\".");
