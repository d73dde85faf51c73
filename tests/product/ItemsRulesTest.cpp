#include "items/FileUtils.h"
#include "tests/product/ProductFixture.h"

using platform::Url;
using tavrin::FileUtils;
using testing::Contains;
using testing::StartsWith;

namespace test {
namespace {

TEST(FilenameRules, refuseWhatNoFolderShouldHold) {
    for (const std::string_view name : {"",
                                        ".",
                                        ".hidden",
                                        "a/b",
                                        "a:b",
                                        "/",
                                        "tab\there",
                                        "line\nbreak",
                                        "\r",
                                        "del\x7F",
                                        "next\u0085line",
                                        "c1 \u009F",
                                        "line\u2028separator",
                                        "paragraph\u2029",
                                        "\uFFFE",
                                        "\uFDD0",
                                        "\U0001FFFF",
                                        "cut \xE2\x82",
                                        "\xFF",
                                        "long form \xC0\xAF",
                                        "\xED\xA0\x80",
                                        "\xF4\x90\x80\x80",
                                        "stray \x80"})
        EXPECT_FALSE(FileUtils::isValidFilename(name)) << name;
    EXPECT_FALSE(FileUtils::isValidFilename(std::string_view("nul\0", 4)));
    for (const std::string_view name :
         {"Report 2015.pdf", "a", " ", "a.b.c", "ends.", "\u00DCbung", "\u0645\u0644\u0641",
          "\u65E5\u672C", "\U0001F4C4 page", "e\u0301", "what?*|<>\"\\", "-rf", "~", "\uFFFD"})
        EXPECT_TRUE(FileUtils::isValidFilename(name)) << name;
    EXPECT_TRUE(FileUtils::isValidFilename(std::string(5000, 'x'))) << "the file system's business";
}

struct Rules : HouseTest {
    /// Libraries with document types and folders of all kinds.
    void givenLibraries() {
        givenContainer("Pages", R"({"identifier": "com.example.pages", "names": {"": "Paper"},
            "documents": "Documents",
            "documentTypes": [{"contentTypes": ["public.image"]},
                              {"contentTypes": ["public.image", "public.pdf", 7]}]})");
        givenContainer("All", R"({"identifier": "com.example.all",
            "documentTypes": [{"contentTypes": [7, "public.data"]}]})");
        givenContainer("Content", R"({"identifier": "com.example.content",
            "documentTypes": [{"contentTypes": ["public.content"]}]})");
        givenContainer("Open", R"({"identifier": "com.example.open"})");
        givenContainer("Closed", R"({"identifier": "com.example.closed", "documents": null,
            "documentTypes": []})");
        givenContainer("Broken", R"({"identifier": "com.example.broken",
            "documentTypes": [{"contentTypes": ["public.pdf"]}, {"contentTypes": "public.pdf"}]})");
        signIn();
        clearLog();
    }
    bool takes(std::string_view path) const {
        return FileUtils::isValidExtensionForContainer(url(path));
    }
    std::string locationOf(std::string_view path) const {
        return FileUtils::displayableLocationForURL(url(path)).value_or("nowhere");
    }
};

TEST_F(Rules, knowPicturesFilmsAndSoundByTheirExtension) {
    withoutAccount();
    listenClosely();
    for (const char* name : {"a.png", "A.JPEG", "b.svg", "c.mp4", "d.mov", "e.wav", "f.mp3"})
        EXPECT_TRUE(FileUtils::isAudioVideoImageFile(Url::file(std::string("/x/") + name))) << name;
    for (const char* name : {"png", ".png", "a.txt", "a.pdf", "a.unheardof", "a.", "a.png.zip"})
        EXPECT_FALSE(FileUtils::isAudioVideoImageFile(Url::file(std::string("/x/") + name)))
            << name;
    EXPECT_TRUE(logged("7 Extension png (public.png) conforms to public.image"));
    EXPECT_THAT(logLines(), Contains(StartsWith("7 Extension txt (public.plain-text) does not")));
}

TEST_F(Rules, letALibraryTakeTheTypesThatItNames) {
    givenLibraries();
    const std::vector<std::pair<std::string, bool>> cases = {
        {"a.zip", true}, // the default library takes everything
        {"/Pages/Documents/a.png", true},
        {"/Pages/Documents/a.pdf", true},
        {"/Pages/Documents/a.txt", false},
        {"/Pages/Documents/a.unheardof", false},
        {"/Pages/Documents/README", true},
        {"/Pages/Documents/.png", true},
        {"/All/a.unheardof", true},
        {"/Content/a.zip", true},
        {"/Open/a.zip", true},
        {"/Closed/a.pdf", false},
        {"/Closed/README", true},
        {"/Broken/a.pdf", false},
    };
    for (const auto& [path, taken] : cases)
        EXPECT_EQ(takes(path), taken) << path;
    EXPECT_TRUE(logged("6 Extension png conforms to public.image"));
    EXPECT_TRUE(logged("6 Container supports all types (public.data)"));
    EXPECT_TRUE(logged("3 Expected array of strings"));
    EXPECT_THAT(logLines(), Contains(StartsWith("3 Expected a set of content types")));
}

TEST_F(Rules, refuseEveryKnownTypeOutsideAllLibraries) {
    givenLibraries();
    const Url outside = Url::file(home / "a.pdf");
    EXPECT_FALSE(FileUtils::isValidExtensionForContainer(outside));
    EXPECT_TRUE(FileUtils::isValidExtensionForContainer(Url::file(home / "a")));
    EXPECT_EQ(FileUtils::containerIdForURL(outside), std::nullopt);
    EXPECT_EQ(FileUtils::containerIdForURL(url("/")), std::nullopt);
    EXPECT_EQ(FileUtils::containerIdForURL(url("/Open/x/y.txt")), "com.example.open");
    EXPECT_EQ(FileUtils::containerIdForURL(url("x")), "com.pelmora.documents");
    EXPECT_EQ(FileUtils::displayableLocationForURL(outside), std::nullopt);
}

TEST_F(Rules, writeTheWayToAnItemWithoutItsOwnName) {
    givenLibraries();
    listenClosely();
    EXPECT_EQ(locationOf("/Pages/Documents/Letters/2015/Offer.pages"),
              "Documents \u25B8 Paper \u25B8 Letters \u25B8 2015");
    EXPECT_TRUE(logged("7 PathBar: Documents \u25B8 Paper \u25B8 Letters \u25B8 2015"));
    EXPECT_EQ(locationOf("/Pages/Documents/Offer.pages"), "Documents \u25B8 Paper");
    EXPECT_EQ(locationOf("/Pages/Documents"), "Documents \u25B8 Paper");
    EXPECT_EQ(locationOf("/Pages"), "Documents \u25B8 Paper");
    EXPECT_EQ(locationOf("/Closed/a/b"), "Documents \u25B8 Closed");
    EXPECT_EQ(locationOf("Offer.pages"), "Documents");
    EXPECT_EQ(locationOf("A/\u65E5\u672C/Offer.pages"), "Documents \u25B8 A \u25B8 \u65E5\u672C");
    EXPECT_EQ(locationOf("/"), "nowhere");
}

} // namespace
} // namespace test
