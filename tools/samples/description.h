#pragma once

#include <string>
#include <utility>
#include <vector>

/// Puts together an export description, element by element, as a host program would write it.
///
/// Texts are UTF-8 and are escaped here; names are taken as they stand. One thread at a time.
class SampleDescription
{
public:
    using Elements = std::vector<std::pair<std::string, std::string>>;

    /// `product` is empty for a description that names no product.
    explicit SampleDescription(std::string product = "Loomrit");

    SampleDescription& language(const std::string& code);
    SampleDescription& version(const std::string& text);

    /// Adds elements to the configuration that all tracks start from.
    SampleDescription& configuration(const Elements& elements);
    SampleDescription& configurationPublisher(const std::string& name);

    /// Adds a track with these elements, in this order. Its `publisher` is left out where empty.
    SampleDescription& track(const Elements& elements, const std::vector<std::string>& keywords = {},
                             const std::string& publisher = "soundcloud");

    std::string text() const;

    /// False if the file could not be written.
    bool write(const std::string& path) const;

private:
    std::string application;
    std::string versionText = "1.0";
    std::string configurationText;
    std::string tracks;
};

/// Every element that a track knows, with `audio` as its file and `cover` as its artwork.
SampleDescription::Elements everyElement(const std::string& audio, const std::string& cover);

/// `text` with the characters that XML reserves as entities.
std::string escapedForXml(const std::string& text);
