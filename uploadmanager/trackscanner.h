#pragma once

#include "uploadmanager/uploadrequest.h"

class PUploadManagerApplication;

namespace Xml
{
class Element;
}

/// Reads the elements of one track into its request; what can't be used is told as warnings, and reading goes on.
///
/// Main thread; lives on the stack of a scan.
class TrackScanner
{
public:
    TrackScanner(PUploadManagerApplication& application, UploadRequest& target);

    /// Takes one child of the track; one that has no meaning is passed over.
    void scan(Xml::Element& element);
    /// Sets the date where year, month and day were all given.
    void applyReleaseDate();

private:
    using Scan = void (TrackScanner::*)(Xml::Element& element, const FString& value);
    struct Entry
    {
        const char16* name;
        Scan scan;
    };
    struct TextEntry
    {
        const char16* name;
        FString UploadRequest::*target;
    };
    static const Entry kEntries[];
    static const TextEntry kTextEntries[];

    void scanPath(Xml::Element& element, const FString& value);
    void scanArtwork(Xml::Element& element, const FString& value);
    void scanTempo(Xml::Element& element, const FString& value);
    void scanTrackType(Xml::Element& element, const FString& value);
    void scanKeywords(Xml::Element& element, const FString& value);
    void scanYear(Xml::Element& element, const FString& value);
    void scanMonth(Xml::Element& element, const FString& value);
    void scanDay(Xml::Element& element, const FString& value);
    void scanLicense(Xml::Element& element, const FString& value);
    void scanPurchaseUrl(Xml::Element& element, const FString& value);
    void scanVideoUrl(Xml::Element& element, const FString& value);

    void warn(const char16* parameter, const char16* fallback);

    PUploadManagerApplication& app;
    UploadRequest& request;
    unsigned year = 0;
    unsigned month = 0;
    unsigned day = 0;
};
