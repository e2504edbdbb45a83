#include "tests/uploadmanager/applicationfixture.h"

#include "foundation/object/iptr.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/xmldocument.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/wiretext.h"

namespace
{
std::string wire(const ConstString& text)
{
    return toWireText(text).text8();
}

Texts words(const CmArray& array)
{
    return ApplicationProbe::texts(array);
}

class ExportDescription : public ApplicationTest
{
protected:
    void SetUp() override
    {
        ApplicationTest::SetUp();
        audio = write("Night Train.wav", "RIFF");
    }

    /// Reads a description with one track of the given content behind its path.
    IPtr<UploadRequest> scan(const std::string& track, const std::string& configuration = "")
    {
        text = "<AudioExportDescription><Application><ProductFamily>Zentor</ProductFamily></Application>"
               "<Configuration><Publishers><Publisher name='soundcloud'/></Publishers>" +
               configuration + "</Configuration><Track><Path>" + audio + "</Path>" + track +
               "</Track></AudioExportDescription>";
        return scanText();
    }
    IPtr<UploadRequest> scanText()
    {
        FMemoryStream stream(text.data(), static_cast<int>(text.size()));
        Xml::Document document;
        EXPECT_TRUE(document.load(&stream));
        Xml::Element* root = document.getRootElement();
        IPtr<UploadRequest> configuration = adopt(app->scanUploadManagerConfiguration(root));
        if (!configuration)
            return nullptr;
        return adopt(app->scanUploadRequest(root->firstElement(u"Track"), *configuration));
    }
    Texts errors() { return ApplicationProbe::generalErrors(*app); }

    std::string audio;
    std::string text;
};
} // namespace

TEST_F(ExportDescription, FillsEveryFieldOfATrack)
{
    std::string cover = write("cover.PNG", "png");
    IPtr<UploadRequest> request = scan(
        "<MediaTrackTitle>夜の汽車 🚂</MediaTrackTitle><AudioISRC>QZES8</AudioISRC><LabelCode>LC 1</LabelCode>"
        "<MediaComment>Second</MediaComment><UrlArtwork>" +
        cover +
        "</UrlArtwork><MusicalTempo>98,5</MusicalTempo><MusicalRootKey>Am</MusicalRootKey>"
        "<MusicalSignature>4/4</MusicalSignature><MediaGenre>House</MediaGenre>"
        "<UploadTrackType>spoken</UploadTrackType><LabelName>Quay</LabelName>"
        "<MediaKeywords><Keyword>rock</Keyword><Keyword/><Keyword>rock</Keyword><Other>x</Other></"
        "MediaKeywords>"
        "<ReleaseYear>2012</ReleaseYear><ReleaseMonth>3</ReleaseMonth><ReleaseDay>9</ReleaseDay>"
        "<UrlPurchase>http://shop.example/a</UrlPurchase><UrlVideo>https://v.example/b</UrlVideo>"
        "<Sharing>public</Sharing><Commentable>TRUE</Commentable><Streamable>false</Streamable>"
        "<Downloadable>true</Downloadable>");
    ASSERT_TRUE(request);
    EXPECT_EQ(wire(request->title), "夜の汽車 🚂");
    EXPECT_EQ(wire(request->isrc), "QZES8");
    EXPECT_EQ(wire(request->labelCode), "LC 1");
    EXPECT_EQ(wire(request->description), "Second");
    EXPECT_EQ(wire(getPathText(&request->artworkPath)), cover) << "the suffix counts in any case";
    EXPECT_EQ(request->tempo, 98.5);
    EXPECT_EQ(wire(request->rootKey), "Am");
    EXPECT_EQ(wire(request->signature), "4/4");
    EXPECT_EQ(wire(request->genre), "House");
    EXPECT_EQ(wire(request->trackType), "spoken");
    EXPECT_EQ(wire(request->labelName), "Quay");
    EXPECT_EQ(words(request->keywords), (Texts{"rock", "rock"}));
    EXPECT_TRUE(request->releaseDate == CmDate(9, 3, 2012));
    EXPECT_EQ(wire(getPathText(&request->purchaseUrl)), "http://shop.example:80/a");
    EXPECT_EQ(wire(request->sharing), "public");
    EXPECT_FALSE(request->commentable) << "any other word is silently false";
    EXPECT_FALSE(request->streamable);
    EXPECT_TRUE(request->downloadable);
    EXPECT_EQ(request->application, ApplicationProbe::product(*app, "Zentor"));
    EXPECT_EQ(errors(), Texts());
}

TEST_F(ExportDescription, StartsEachTrackFromTheConfiguration)
{
    IPtr<UploadRequest> request =
        scan("<Publishers><Publisher name='other'/><Publisher/></Publishers><ReleaseYear>2012</ReleaseYear>",
             "<Sharing>public</Sharing><Downloadable>true</Downloadable><Commentable>false</Commentable>");
    ASSERT_TRUE(request);
    EXPECT_EQ(wire(request->title), "Night Train") << "the file's name without its extension";
    EXPECT_EQ(wire(request->license), "all-rights-reserved");
    EXPECT_EQ(wire(request->sharing), "public");
    EXPECT_TRUE(request->downloadable);
    EXPECT_TRUE(request->streamable);
    EXPECT_FALSE(request->commentable);
    EXPECT_EQ(request->tempo, -1.0);
    EXPECT_FALSE(request->releaseDate.isValid()) << "a year alone is no date";
    EXPECT_EQ(words(request->publishers), (Texts{"soundcloud", "other"}));
}

TEST_F(ExportDescription, WarnsOfWhatItCannotUse)
{
    IPtr<UploadRequest> request = scan("<MusicalTempo>-3</MusicalTempo><MediaLicense>cc-by</"
                                       "MediaLicense><UploadTrackType>Loop</UploadTrackType>"
                                       "<Streamable>yes</Streamable><Sharing>Public</Sharing>",
                                       "<Downloadable>1</Downloadable>");
    ASSERT_TRUE(request);
    EXPECT_EQ(request->tempo, -1.0);
    EXPECT_TRUE(request->streamable);
    std::string online = "Be sure to check the edit page on SoundCloud.";
    auto forFile = [&](const std::string& name)
    {
        return "The parameter \"" + name + "\" could not be set to the requested value for file \"" + audio +
               "\".";
    };
    EXPECT_EQ(errors(),
              (Texts{"The parameter \"Downloadable\" could not be set to the requested value for any file.",
                     "The parameter will be set to \"false\".", online, forFile("MusicalTempo"), online,
                     forFile("MediaLicense"), "The parameter will be set to \"all-rights-reserved\".", online,
                     forFile("UploadTrackType"), online, forFile("Streamable"),
                     "The parameter will be set to \"true\".", online, forFile("Sharing"),
                     "The parameter will be set to \"private\".", online}));
}

TEST_F(ExportDescription, LeavesOutArtworkThatIsMissingOrOfAnotherType)
{
    std::string missing = home + "/none.png";
    std::string dot = write(".png", "png");
    std::string other = write("cover.png.bmp", "bmp");
    IPtr<UploadRequest> request = scan("<UrlArtwork>" + missing + "</UrlArtwork><UrlArtwork>" + dot +
                                       "</UrlArtwork><UrlArtwork>" + other + "</UrlArtwork>");
    ASSERT_TRUE(request);
    EXPECT_TRUE(request->artworkPath.getName().isEmpty());
    std::string type = "The artwork file has to be of type \"jpeg\", \"png\" or \"gif\".";
    EXPECT_EQ(errors(), (Texts{"The file \"" + missing + "\" could not be found.",
                               "The artwork image for \"" + dot + "\" could not be uploaded.", type,
                               "The artwork image for \"" + other + "\" could not be uploaded.", type}));
}

TEST_F(ExportDescription, RefusesTracksWithoutFileOrService)
{
    audio = home + "/gone.wav";
    EXPECT_FALSE(scan(""));
    EXPECT_EQ(errors(), (Texts{"The file \"" + audio + "\" could not be found."}));
    EXPECT_EQ(ApplicationProbe::fatalError(*app), "");

    audio = write("here.wav", "RIFF");
    text = "<AudioExportDescription><Application><ProductFamily>Fennic</ProductFamily></"
           "Application><Track><Path>" +
           audio + "</Path></Track></AudioExportDescription>";
    EXPECT_FALSE(scanText());
    EXPECT_EQ(ApplicationProbe::fatalError(*app), "Internal program error.\nError Code: 21");
}

TEST_F(ExportDescription, NeedsAKnownProduct)
{
    text = "<AudioExportDescription><Application><ProductFamily>plenar</ProductFamily></Application>"
           "</AudioExportDescription>";
    EXPECT_FALSE(scanText());
    EXPECT_EQ(ApplicationProbe::fatalError(*app), "Internal program error.\nError Code: 16");
}
