#include "uploadmanager/trackscanner.h"

#include "storage/filesystem/fnfilesystem.h"
#include "uploadmanager/descriptionform.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/wiretext.h"

#include <algorithm>
#include <iterator>

namespace
{
constexpr const char16* kOnlyLicense = u"all-rights-reserved";

// The words that the service takes for the kind of a track.
constexpr const char16* kTrackTypes[] = {
    u"other",   u"sample", u"sound effect", u"loop", u"stem",  u"in progress", u"demo",
    u"podcast", u"spoken", u"recording",    u"live", u"remix", u"original",
};

constexpr const char16* kArtworkSuffixes[] = {u".png", u".gif", u".jpg", u".jpeg"};

// At least one character must stand before the suffix.
bool hasArtworkSuffix(const FPath& path)
{
    FString name(path.getName());
    return std::any_of(std::begin(kArtworkSuffixes), std::end(kArtworkSuffixes),
                       [&](ConstString suffix)
                       {
                           int index = name.findPrev(-1, suffix, -1, kCaseInsensitive);
                           return index > 0 &&
                                  static_cast<unsigned>(index) + suffix.length() == name.length();
                       });
}
} // namespace

const TrackScanner::Entry TrackScanner::kEntries[] = {
    {u"Path", &TrackScanner::scanPath},
    {u"UrlArtwork", &TrackScanner::scanArtwork},
    {u"MusicalTempo", &TrackScanner::scanTempo},
    {u"UploadTrackType", &TrackScanner::scanTrackType},
    {u"MediaKeywords", &TrackScanner::scanKeywords},
    {u"ReleaseYear", &TrackScanner::scanYear},
    {u"ReleaseMonth", &TrackScanner::scanMonth},
    {u"ReleaseDay", &TrackScanner::scanDay},
    {u"MediaLicense", &TrackScanner::scanLicense},
    {u"UrlPurchase", &TrackScanner::scanPurchaseUrl},
    {u"UrlVideo", &TrackScanner::scanVideoUrl},
};

// Elements whose text is taken as it stands.
const TrackScanner::TextEntry TrackScanner::kTextEntries[] = {
    {u"MediaTrackTitle", &UploadRequest::title},  {u"AudioISRC", &UploadRequest::isrc},
    {u"LabelCode", &UploadRequest::labelCode},    {u"MediaComment", &UploadRequest::description},
    {u"MusicalRootKey", &UploadRequest::rootKey}, {u"MusicalSignature", &UploadRequest::signature},
    {u"MediaGenre", &UploadRequest::genre},       {u"LabelName", &UploadRequest::labelName},
};

TrackScanner::TrackScanner(PUploadManagerApplication& application, UploadRequest& target)
    : app(application),
      request(target)
{
}

void TrackScanner::scan(Xml::Element& element)
{
    FString value = getElementText(element);
    for (const TextEntry& entry : kTextEntries)
        if (isElementNamed(element, entry.name))
            request.*entry.target = value;
    for (const Entry& entry : kEntries)
        if (isElementNamed(element, entry.name))
            (this->*entry.scan)(element, value);
}

void TrackScanner::applyReleaseDate()
{
    if (!year || !month || !day)
        return;
    request.releaseDate.setYear(static_cast<int>(year));
    request.releaseDate.setMonth(static_cast<int>(month));
    request.releaseDate.setDay(static_cast<int>(day));
}

void TrackScanner::scanPath(Xml::Element&, const FString& value)
{
    request.path = FNPath(value.text16(), FPath::kFile);
}

void TrackScanner::scanArtwork(Xml::Element&, const FString& value)
{
    FNPath path(value.text16(), FPath::kFile);
    FString text;
    if (!gFileSystem->fileExists(&path))
    {
        text.printf(strFileWasNotFound.text(), value.text16());
        app.addGeneralError(text.text16());
        return;
    }
    if (hasArtworkSuffix(path))
    {
        request.artworkPath = path;
        return;
    }
    text.printf(strImageFileCouldNotBeUploaded.text(), getPathText(&path).text16());
    app.addGeneralError(text.text16());
    app.addGeneralError(strImageMustBeOfType.text());
}

void TrackScanner::scanTempo(Xml::Element&, const FString& value)
{
    double tempo = 0.0;
    if (value.scanFloat(tempo, 0, true) && tempo > 0.0)
        request.tempo = tempo;
    else
        warn(u"MusicalTempo", nullptr);
}

void TrackScanner::scanTrackType(Xml::Element&, const FString& value)
{
    bool isKnown = std::any_of(std::begin(kTrackTypes), std::end(kTrackTypes),
                               [&](const char16* word) { return value.compare(word) == 0; });
    if (isKnown)
        request.trackType = value;
    else
        warn(u"UploadTrackType", nullptr);
}

void TrackScanner::scanKeywords(Xml::Element& element, const FString&)
{
    FString child(u"Keyword");
    app.scanElements(element, child, request.keywords, nullptr);
}

void TrackScanner::scanYear(Xml::Element&, const FString& value)
{
    value.scanUInt32(year);
}

void TrackScanner::scanMonth(Xml::Element&, const FString& value)
{
    value.scanUInt32(month);
}

void TrackScanner::scanDay(Xml::Element&, const FString& value)
{
    value.scanUInt32(day);
}

void TrackScanner::scanLicense(Xml::Element&, const FString& value)
{
    if (value.compare(kOnlyLicense) == 0)
        request.license = value;
    else
        warn(u"MediaLicense", request.license.text16());
}

void TrackScanner::scanPurchaseUrl(Xml::Element&, const FString& value)
{
    request.purchaseUrl = FUrl(value.text16());
}

void TrackScanner::scanVideoUrl(Xml::Element&, const FString& value)
{
    request.videoUrl = FUrl(value.text16());
}

void TrackScanner::warn(const char16* parameter, const char16* fallback)
{
    app.addParameterWarning(&request, FString(parameter), fallback);
}
