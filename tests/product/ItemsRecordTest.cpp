#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "items/VXItem.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/files/FileManager.h"
#include "platform/ui/qt/Bridge.h"
#include "tests/product/ProductFixture.h"

#include <QBuffer>
#include <QImage>

#include <filesystem>
#include <stdexcept>

using platform::ResourceKey;
using platform::Url;
using platform::Value;
using tavrin::FileUtils;
using tavrin::VXItem;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

namespace test {
namespace {

struct Record : HouseTest {
    VXItem item(std::string_view relative) const { return VXItem(url(relative)); }
    void mark(const std::string& file, const char* name, std::string_view value) const {
        EXPECT_EQ(platform::setExtendedAttribute(Url::file(file), name, value), std::nullopt);
    }
    void givenLink(std::string_view link, const std::string& target) const {
        std::filesystem::create_symlink(target, path(link));
    }
};

/// Nothing is known of it but its URL.
void expectCleared(const VXItem& item) {
    EXPECT_EQ(item.localizedName(), std::nullopt);
    EXPECT_EQ(item.typeIdentifier(), std::nullopt);
    EXPECT_EQ(item.localizedTypeDescription(), std::nullopt);
    EXPECT_EQ(item.fileSize(), std::nullopt);
    EXPECT_EQ(item.friendlyFileSize(), std::nullopt);
    EXPECT_EQ(item.creationDate(), std::nullopt);
    EXPECT_EQ(item.contentModificationDate(), std::nullopt);
    EXPECT_EQ(item.friendlyCreationDate(platform::DateStyle::longStyle), std::nullopt);
    EXPECT_EQ(item.parentDirectoryURL(), std::nullopt);
    EXPECT_EQ(item.tags(), std::nullopt);
    EXPECT_EQ(item.promiseURL(), std::nullopt);
    EXPECT_FALSE(item.isContainer() || item.isDirectory() || item.isPackage() ||
                 item.isBookmark() || item.isPromise() || item.isDownloaded());
    EXPECT_FALSE(item.thumbnailFetched());
    EXPECT_TRUE(item.hasHiddenExtension());
    EXPECT_TRUE(item.renameable());
}

TEST_F(Record, needsAUrlAndKnowsNothingWithoutOne) {
    EXPECT_THROW(
        try { VXItem(); } catch (const std::invalid_argument& refusal) {
            EXPECT_STREQ(refusal.what(), "Don't call -[VXItem init].");
            throw;
        },
        std::invalid_argument);
    signIn();
    VXItem none{std::nullopt};
    expectCleared(none);
    EXPECT_FALSE(none.canPreview());
    EXPECT_EQ(none.resolvedURL(), std::nullopt);
    EXPECT_TRUE(none.thumbnail().empty());
    EXPECT_FALSE(none.canGenerateThumbnail());
}

TEST_F(Record, describesAFileOnTheDevice) {
    signIn();
    const std::string file = givenFile("Notes/Milk.txt", std::string(1'234'567, 'm'));
    mark(file, "user.xdg.tags", "Red, Work");
    const VXItem milk = item("Notes/Milk.txt");
    EXPECT_EQ(milk.localizedName(), "Milk.txt");
    EXPECT_EQ(milk.typeIdentifier(), "public.plain-text");
    EXPECT_EQ(milk.localizedTypeDescription(), "Plain text document");
    EXPECT_EQ(milk.fileSize(), 1'234'567U);
    EXPECT_EQ(milk.friendlyFileSize(), "1.2 MB");
    EXPECT_EQ(milk.parentDirectoryURL(), url("Notes"));
    EXPECT_EQ(milk.resolvedURL(), url("Notes/Milk.txt"));
    EXPECT_EQ(milk.promiseURL(), url("Notes/Milk.txt"));
    EXPECT_THAT(*milk.tags(), ElementsAre("Red", "Work"));
    EXPECT_TRUE(milk.isDownloaded() && milk.canPreview() && milk.renameable());
    EXPECT_FALSE(milk.isPromise() || milk.isDirectory() || milk.isContainer() ||
                 milk.isBookmark() || milk.hasHiddenExtension());
    EXPECT_GE(milk.contentModificationDate(), milk.creationDate());
    const platform::Date july = platform::Date::fromSeconds(1'438'357'383);
    EXPECT_THAT(*VXItem::friendlyDate(july, platform::DateStyle::longStyle),
                AllOf(HasSubstr("July 31, 2015"), HasSubstr(":43")));
    EXPECT_THAT(logRecords(), IsEmpty());
    mark(file, "user.pelmora.hidden-extension", "");
    const VXItem hidden = item("Notes/Milk.txt");
    EXPECT_TRUE(hidden.hasHiddenExtension());
    EXPECT_EQ(hidden.localizedName(), "Milk");
}

TEST_F(Record, describesAPromiseWithoutFetchingIt) {
    givenRemote("Notes/Report.pdf", "seven b");
    mark(home / "remote/Documents/Notes/Report.pdf", "user.xdg.tags", "Green");
    signIn();
    const VXItem report = item("Notes/Report.pdf");
    EXPECT_TRUE(report.isPromise());
    EXPECT_EQ(report.promiseURL(), documents().physicalURL(url("Notes/Report.pdf")));
    EXPECT_EQ(report.resolvedURL(), url("Notes/Report.pdf"));
    EXPECT_FALSE(report.isDownloaded());
    EXPECT_EQ(report.localizedName(), "Report.pdf");
    EXPECT_EQ(report.typeIdentifier(), "public.pdf");
    EXPECT_EQ(report.friendlyFileSize(), "7 bytes");
    EXPECT_TRUE(report.contentModificationDate().has_value());
    EXPECT_EQ(report.parentDirectoryURL(), url("Notes"));
    EXPECT_THAT(report.tags().value_or(std::vector<std::string>()), ElementsAre("Green"));
    EXPECT_TRUE(report.canPreview() && report.renameable());
    EXPECT_FALSE(FileUtils::exists(url("Notes/Report.pdf")));
}

TEST_F(Record, tellsFoldersPackagesAndContainersApart) {
    givenContainer("Music", R"({"identifier": "com.example.music", "names": {"": "Tunes"},
                                "documents": "Songs"})");
    givenRemote("/Music/Songs/a.wav");
    givenRemote("Plan.rtfd/TXT.rtf");
    signIn();
    givenFile("Local.rtfd/TXT.rtf");
    givenFolder("Empty");
    const VXItem folder = item("Empty");
    EXPECT_TRUE(folder.isDirectory() && folder.renameable() && !folder.isPackage());
    EXPECT_EQ(folder.fileSize(), std::nullopt);
    EXPECT_EQ(folder.friendlyFileSize(), std::nullopt);
    for (const auto& [name, here] :
         {std::pair("Plan.rtfd", false), std::pair("Local.rtfd", true)}) {
        const VXItem package = item(name);
        EXPECT_TRUE(package.isPackage() && !package.isDirectory()) << name;
        EXPECT_EQ(package.isDownloaded(), here) << name;
    }
    const VXItem library = item("/Music/Songs");
    EXPECT_TRUE(library.isContainer() && library.isDirectory() && !library.renameable());
    EXPECT_EQ(library.localizedName(), "Tunes");
    EXPECT_FALSE(item("/Music/Songs/a.wav").isContainer());
    EXPECT_TRUE(item("").isContainer());
}

TEST_F(Record, forbidsAParticipantToRenameWhatIsShared) {
    for (const char* role : {"owner", "participant"}) {
        givenRemote(std::string(role) + ".txt");
        mark(home / ("remote/Documents/" + std::string(role) + ".txt"), "user.pelmora.shared",
             role);
    }
    signIn();
    EXPECT_TRUE(item("owner.txt").renameable());
    EXPECT_FALSE(item("participant.txt").renameable());
}

TEST_F(Record, readsTheDocumentBehindABookmark) {
    givenContainer("Travel", R"({"identifier": "com.example.travel"})");
    givenRemote("/Travel/there.pdf", "four");
    signIn();
    home.write("outside.txt", "123456789");
    givenLink("Out", home / "outside.txt");
    givenLink("Promised", path("/Travel/there.pdf"));
    givenLink("Placeholder", documents().physicalURL(url("/Travel/there.pdf"))->path());
    const VXItem out = item("Out");
    EXPECT_TRUE(out.isBookmark());
    EXPECT_EQ(out.url(), url("Out"));
    EXPECT_EQ(out.resolvedURL(), Url::file(home / "outside.txt"));
    EXPECT_EQ(out.localizedName(), "outside.txt");
    EXPECT_EQ(out.fileSize(), 9U);
    for (const char* link : {"Promised", "Placeholder"}) {
        const VXItem there = item(link);
        EXPECT_TRUE(there.isBookmark() && there.isPromise()) << link;
        EXPECT_EQ(there.resolvedURL(), url("/Travel/there.pdf")) << link;
        EXPECT_EQ(there.fileSize(), 4U) << link;
    }
}

TEST_F(Record, takesABookmarkThatLeadsNowhereAsItIs) {
    signIn();
    givenLink("Gone", "/nowhere/at/all.txt");
    const VXItem gone = item("Gone");
    EXPECT_FALSE(gone.isBookmark());
    EXPECT_EQ(gone.resolvedURL(), url("Gone"));
    EXPECT_EQ(tavrin::tavrin_URLByResolvingBookmark(url("Gone")), std::nullopt);
}

TEST_F(Record, saysOfAVanishedFileWhatItsNameSays) {
    signIn();
    givenFile("Milk.txt");
    VXItem milk = item("Milk.txt");
    remove("Milk.txt");
    EXPECT_EQ(milk.localizedName(), "Milk.txt") << "a snapshot";
    milk.cacheValues();
    expectCleared(milk);
    EXPECT_EQ(milk.resolvedURL(), url("Milk.txt"));
    EXPECT_TRUE(milk.canPreview());
    EXPECT_THAT(logLines(),
                ElementsAre(StartsWith("4 promisedItemResourceValuesForKeys failed on file://")));
}

TEST_F(Record, readsAFileOutsideTheStorePlainly) {
    signIn();
    const VXItem outside(Url::file(home.write("outside.txt", "123456789")));
    EXPECT_EQ(outside.localizedName(), "outside.txt");
    EXPECT_EQ(outside.fileSize(), 9U);
    EXPECT_FALSE(outside.isDownloaded()) << "no status";
    EXPECT_TRUE(outside.renameable());
    EXPECT_EQ(logRecords().size(), 1U);
}

TEST_F(Record, refreshesWhenItsUrlChangesAndOnlyThen) {
    signIn();
    const std::string file = givenFile("a.txt", "1");
    givenFile("b.txt", "22");
    VXItem record = item("a.txt");
    std::filesystem::resize_file(file, 5);
    EXPECT_TRUE(record.thumbnail().empty());
    record.setUrl(url("a.txt"));
    EXPECT_EQ(record.fileSize(), 1U);
    EXPECT_TRUE(record.thumbnailFetched());
    record.setUrl(url("b.txt"));
    EXPECT_EQ(record.localizedName(), "b.txt");
    EXPECT_FALSE(record.thumbnailFetched());
    record.setUrl(url("a.txt"));
    EXPECT_EQ(record.fileSize(), 5U);
    record.setUrl(std::nullopt);
    expectCleared(record);
}

Value pngOf(int width, int height) {
    QImage picture(width, height, QImage::Format_RGB32);
    picture.fill(Qt::red);
    QBuffer buffer;
    picture.save(&buffer, "PNG");
    const auto* const bytes = reinterpret_cast<const std::byte*>(buffer.data().constData());
    return platform::Bytes(bytes, bytes + buffer.size());
}

TEST_F(Record, takesTheLargePictureAndNoOther) {
    signIn();
    listenClosely();
    VXItem record = item("");
    const std::vector<Value> without = {
        {},
        7,
        Value::Map{},
        Value::Map{{"512x512", pngOf(2, 2)}},
        Value::Map{{"1024x1024", "no picture"}},
        Value::Map{{"1024x1024", platform::Bytes(9, std::byte{1})}}};
    for (const Value& each : without) {
        record.updateThumbnailImage(each);
        EXPECT_TRUE(record.thumbnail().empty());
    }
    record.updateThumbnailImage(Value::Map{{"1024x1024", pngOf(8, 4)}, {"512x512", pngOf(2, 2)}});
    EXPECT_EQ(record.thumbnail().size(), (platform::Size{8, 4}));
    record.updateThumbnailImage(Value::Map{});
    EXPECT_FALSE(record.thumbnail().empty()) << "keeps what it has";
    EXPECT_TRUE(logged("7 URL Thumbs: ()"));
}

TEST_F(Record, asksForOneAttributeOfAPromiseOrAFile) {
    givenRemote("far.txt", "123");
    signIn();
    EXPECT_EQ(FileUtils::getResourceValue(ResourceKey::fileSize, url("far.txt")).integer(), 3);
    const Url outside = Url::file(home.write("near.txt", "12"));
    EXPECT_EQ(FileUtils::getResourceValue(ResourceKey::fileSize, outside).integer(), 2);
    EXPECT_TRUE(FileUtils::getResourceValue(ResourceKey::fileSize, url("none.txt")).isNone());
    EXPECT_TRUE(FileUtils::getResourceValue(ResourceKey::fileSize, std::nullopt).isNone());
}

} // namespace
} // namespace test
