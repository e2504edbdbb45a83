#include "tools/samples/description.h"

#include <fstream>

namespace
{

std::string element(const std::string& name, const std::string& text)
{
    return "<" + name + ">" + escapedForXml(text) + "</" + name + ">";
}

std::string publishers(const std::string& name)
{
    return "<Publishers><Publisher name=\"" + escapedForXml(name) + "\"/></Publishers>";
}

std::string lines(const SampleDescription::Elements& elements)
{
    std::string text;
    for (const auto& [name, value] : elements)
        text += "    " + element(name, value) + "\n";
    return text;
}

} // namespace

std::string escapedForXml(const std::string& text)
{
    std::string result;
    for (const char character : text)
    {
        switch (character)
        {
        case '<':
            result += "&lt;";
            break;
        case '>':
            result += "&gt;";
            break;
        case '&':
            result += "&amp;";
            break;
        case '"':
            result += "&quot;";
            break;
        default:
            result.push_back(character);
        }
    }
    return result;
}

SampleDescription::SampleDescription(std::string product)
{
    if (!product.empty())
        application = "    " + element("ProductFamily", product) + "\n";
}

SampleDescription& SampleDescription::language(const std::string& code)
{
    application += "    " + element("Language", code) + "\n";
    return *this;
}

SampleDescription& SampleDescription::version(const std::string& text)
{
    versionText = text;
    return *this;
}

SampleDescription& SampleDescription::configuration(const Elements& elements)
{
    configurationText += lines(elements);
    return *this;
}

SampleDescription& SampleDescription::configurationPublisher(const std::string& name)
{
    configurationText += "    " + publishers(name) + "\n";
    return *this;
}

SampleDescription& SampleDescription::track(const Elements& elements,
                                            const std::vector<std::string>& keywords,
                                            const std::string& publisher)
{
    tracks += "  <Track>\n" + lines(elements);
    if (!keywords.empty())
    {
        tracks += "    <MediaKeywords>";
        for (const std::string& keyword : keywords)
            tracks += element("Keyword", keyword);
        tracks += "</MediaKeywords>\n";
    }
    if (!publisher.empty())
        tracks += "    " + publishers(publisher) + "\n";
    tracks += "  </Track>\n";
    return *this;
}

std::string SampleDescription::text() const
{
    std::string result = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<AudioExportDescription version=\"" +
                         versionText + "\">\n";
    result += "  <Application>\n" + application + "  </Application>\n";
    if (!configurationText.empty())
        result += "  <Configuration>\n" + configurationText + "  </Configuration>\n";
    return result + tracks + "</AudioExportDescription>\n";
}

bool SampleDescription::write(const std::string& path) const
{
    std::ofstream file(path, std::ios::binary);
    file << text();
    return file.flush().good();
}

SampleDescription::Elements everyElement(const std::string& audio, const std::string& cover)
{
    return {{"Path", audio},
            {"MediaTrackTitle", "Evening Walk (夕方の散歩)"},
            {"AudioISRC", "DEXX12000001"},
            {"LabelCode", "LC 01234"},
            {"MediaComment", "Recorded live & in one take."},
            {"UrlArtwork", cover},
            {"MusicalTempo", "120"},
            {"MusicalRootKey", "A"},
            {"MusicalSignature", "4/4"},
            {"MediaGenre", "Ambient"},
            {"UploadTrackType", "original"},
            {"LabelName", "House Label"},
            {"ReleaseYear", "2012"},
            {"ReleaseMonth", "3"},
            {"ReleaseDay", "14"},
            {"MediaLicense", "all-rights-reserved"},
            {"UrlPurchase", "https://shop.example:8443/evening"},
            {"UrlVideo", "http://video.example:8080/watch"},
            {"Commentable", "false"},
            {"Sharing", "public"},
            {"Streamable", "false"},
            {"Downloadable", "true"}};
}
