#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/thumbnails/ThumbnailLoader.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"
#include "platform/launch/ThumbnailCache.h"
#include "platform/launch/ThumbnailMarks.h"
#include "platform/launch/TypeRegistry.h"
#include "tests/documents/ListFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QImage>

#include <filesystem>

namespace test {
namespace {

using namespace platform;
using namespace std::chrono_literals;
namespace fs = std::filesystem;

struct Thumbnails : ListFixture {
    Thumbnails() { open(); }

    /// A document that was changed long ago, `age` before the others.
    void given(const std::string& name, const std::string& content, int age = 0) {
        house.givenFile(name, content);
        dateBack(name, age);
    }
    void dateBack(const std::string& name, int age = 0) const {
        fs::last_write_time(house.path(name), longAgo - std::chrono::seconds(age));
    }
    ThumbnailRequest request(const std::string& name, int pixels = 40) const {
        ThumbnailRequest request;
        request.url = house.url(name);
        request.modified = FileManager::attributes(request.url.path(), FollowLinks::yes)->modified;
        request.typeIdentifier = TypeRegistry::identifierForFileName(name);
        request.pixels = pixels;
        return request;
    }
    Image answer(const ThumbnailRequest& wanted) {
        std::optional<Image> answered;
        ThumbnailLoader loader(
            house.services().mainQueue,
            [&](const ThumbnailRequest&, const Image& image) { answered = image; });
        loader.want({wanted});
        EXPECT_TRUE(house.until([&] { return answered.has_value(); }));
        return answered.value_or(Image());
    }
    static ThumbnailCache cache() { return ThumbnailCache::current(); }
    std::optional<Bytes> kept(const std::string& name, ThumbnailSize size) const {
        const ThumbnailRequest asked = request(name);
        return cache().find(asked.url, asked.modified, size);
    }
    /// The picture in sight; empty while the type's icon stands there.
    Image inRow(std::string_view name) const { return state().lookOf(rowNamed(name)).thumbnail; }

    const fs::file_time_type longAgo = fs::file_time_type::clock::now() - 24h;
};

TEST_F(Thumbnails, AreKeptWhereTheDeskLooksForThem) {
    given("A ;ä.png", pngPicture(400, 200));
    EXPECT_EQ(answer(request("A ;ä.png")).size(), (Size{40, 20}));
    const auto png = kept("A ;ä.png", ThumbnailSize::normal);
    ASSERT_TRUE(png);
    const auto marks = readThumbnailMarks(*png);
    EXPECT_EQ(marks->width, 128);
    EXPECT_EQ(marks->uri, "file://" + percentEncoded(house.path("A ;ä.png"), "/"));
    const fs::path folder = house.home / "cache/thumbnails/normal";
    EXPECT_EQ(fs::status(folder).permissions(), fs::perms::owner_all);
    EXPECT_EQ(fs::status(fs::directory_iterator(folder)->path()).permissions(),
              fs::perms::owner_read | fs::perms::owner_write);
    answer(request("A ;ä.png", 1024));
    EXPECT_EQ(readThumbnailMarks(*kept("A ;ä.png", ThumbnailSize::xxLarge))->width, 400)
        << "a small picture is not enlarged";
}

TEST_F(Thumbnails, AreOfTheWholeDocumentUpright) {
    given("Turned.jpg", turnedPhoto(300, 200));
    given("Report.pdf", pdfOfPages(3));
    given("Mark.svg", "<svg xmlns='http://www.w3.org/2000/svg' viewBox='0 0 800 400'>"
                      "<rect width='800' height='400'/></svg>");
    EXPECT_EQ(answer(request("Turned.jpg", 128)).size(), (Size{128, 85}));
    EXPECT_EQ(answer(request("Report.pdf", 128)).size(), (Size{90, 127}));
    EXPECT_EQ(answer(request("Mark.svg", 128)).size(), (Size{128, 64}));
}

TEST_F(Thumbnails, OfATextAreItsFirstLinesOnWhite) {
    given("Long.txt", "First line\n\n\n\n" + std::string(2'000'000, 'x'));
    given("Guide.md", "# A heading\n\nand a text");
    given("Page.html", "<h1>A heading</h1><p>and a text");
    given("Program.cpp", "int main() {}\n");
    for (const char* const name : {"Long.txt", "Guide.md", "Page.html", "Program.cpp"}) {
        ASSERT_EQ(answer(request(name, 128)).size(), (Size{91, 128})) << name;
        const Bytes png = *kept(name, ThumbnailSize::normal);
        const QImage page = QImage::fromData(reinterpret_cast<const uchar*>(png.data()),
                                             static_cast<int>(png.size()));
        EXPECT_EQ(page.pixelColor(1, 1), QColor(Qt::white)) << name;
        int letters = 0;
        for (int y = 0; y < 20; ++y)
            for (int x = 0; x < page.width(); ++x)
                letters += page.pixelColor(x, y).lightness() < 200 ? 1 : 0;
        EXPECT_GT(letters, 5) << name;
    }
}

TEST_F(Thumbnails, OfAPackageAreThePictureThatItBringsAlong) {
    given("Sketch.rtfd/Data/Thumbnail.png", pngPicture(300, 100));
    given("Bare.rtfd/Text.rtf", "text");
    given("Sly.rtfd/Text.rtf", "text");
    fs::create_symlink(house.path("Sketch.rtfd/Data/Thumbnail.png"),
                       house.path("Sly.rtfd/preview.png"));
    for (const char* const name : {"Sketch.rtfd", "Bare.rtfd", "Sly.rtfd"})
        dateBack(name);
    const auto package = [&](const std::string& name) {
        ThumbnailRequest wanted = request(name, 128);
        wanted.typeIdentifier = TypeRegistry::identifierForFile(house.path(name));
        EXPECT_TRUE(TypeRegistry::conformsTo(wanted.typeIdentifier, types::package));
        return answer(wanted);
    };
    EXPECT_EQ(package("Sketch.rtfd").size(), (Size{128, 42}));
    EXPECT_TRUE(package("Bare.rtfd").empty());
    EXPECT_TRUE(package("Sly.rtfd").empty()) << "a link leads out of it";
}

TEST_F(Thumbnails, AreMadeAnewInPlaceOfWhatIsNoneOfThem) {
    given("A.png", pngPicture(400, 200));
    given("B.png", pngPicture(100, 200));
    answer(request("A.png", 128));
    answer(request("B.png", 128));
    const Bytes good = *kept("A.png", ThumbnailSize::normal);
    Bytes torn(good.begin(), good.begin() + 300);
    Bytes scratched = good;
    std::fill(scratched.end() - 200, scratched.end() - 20, std::byte{7});
    int pixels = 127; // another size each time: what was answered before is remembered
    for (const Bytes& bad : {Bytes(), torn, scratched, *kept("B.png", ThumbnailSize::normal)}) {
        ASSERT_EQ(cache().store(house.url("A.png"), ThumbnailSize::normal, bad), std::nullopt);
        EXPECT_EQ(answer(request("A.png", --pixels)).size().width, pixels);
        EXPECT_EQ(kept("A.png", ThumbnailSize::normal), good);
    }
    ASSERT_EQ(cache().store(house.url("A.png"), ThumbnailSize::normal, good), std::nullopt);
    given("A.png", pngPicture(200, 400), 60);
    EXPECT_EQ(answer(request("A.png", 128)).size(), (Size{64, 128})) << "another date, another one";
}

TEST_F(Thumbnails, AreNotTriedAgainUntilTheDocumentChanges) {
    given("A.png", "no picture");
    EXPECT_TRUE(answer(request("A.png")).empty());
    EXPECT_TRUE(cache().knowsFailure(house.url("A.png"), request("A.png").modified));
    given("A.png", pngPicture(400, 200));
    EXPECT_TRUE(answer(request("A.png", 64)).empty()) << "as far as its date tells";
    given("A.png", pngPicture(400, 200), 60);
    EXPECT_FALSE(answer(request("A.png", 64)).empty());
    given("Locked.png", pngPicture(40, 40));
    const ThumbnailRequest locked = request("Locked.png");
    house.remove("Locked.png");
    EXPECT_TRUE(answer(locked).empty());
    EXPECT_FALSE(cache().knowsFailure(locked.url, locked.modified))
        << "it could not be read at all";
}

TEST_F(Thumbnails, AreNotKeptOfWhatMayStillChangeWithinItsDate) {
    house.givenFile("Now.png", pngPicture(400, 200));
    EXPECT_FALSE(answer(request("Now.png")).empty());
    EXPECT_FALSE(fs::exists(house.home / "cache/thumbnails"));
}

TEST_F(Thumbnails, OfAPromiseAreWhatWasMadeWhileItWasHere) {
    given("Coast.png", pngPicture(400, 200));
    ThumbnailRequest wanted = request("Coast.png");
    wanted.promised = true;
    EXPECT_TRUE(answer(wanted).empty()) << "nothing is made of it";
    answer(request("Coast.png", 512));
    house.remove("Coast.png");
    wanted.pixels = 64;
    EXPECT_EQ(answer(wanted).size(), (Size{64, 32}));
    wanted.pixels = 1024;
    EXPECT_EQ(answer(wanted).size(), (Size{400, 200})) << "the largest that there is";
}

TEST_F(Thumbnails, OfThumbnailsAreNotMade) {
    const std::string inCache = house.home.write("cache/thumbnails/normal/x.png", pngPicture(9, 9));
    fs::last_write_time(inCache, longAgo);
    ThumbnailRequest wanted = request("/");
    wanted.url = Url::file(inCache);
    wanted.modified = FileManager::attributes(inCache, FollowLinks::yes)->modified;
    wanted.typeIdentifier = "public.png";
    EXPECT_TRUE(answer(wanted).empty());
}

TEST_F(Thumbnails, ThatNobodyWantsAnyMoreAreNotMade) {
    std::vector<ThumbnailRequest> all;
    for (int i = 0; i < 40; ++i) {
        given(std::to_string(i) + ".png", pngPicture(600, 400));
        all.push_back(request(std::to_string(i) + ".png"));
    }
    std::vector<std::string> answered;
    ThumbnailLoader loader(house.services().mainQueue,
                           [&](const ThumbnailRequest& done, const Image&) {
                               answered.emplace_back(done.url.lastPathComponent());
                           });
    loader.want(all);
    loader.want({all[39], all[38]});
    ASSERT_TRUE(house.until([&] { return answered.size() >= 2; }));
    EXPECT_THAT(answered, testing::UnorderedElementsAre("39.png", "38.png"));
    EXPECT_FALSE(kept("20.png", ThumbnailSize::normal));
}

TEST_F(Thumbnails, StandInTheRowsOfTheirOwnDocumentsOnly) {
    given("A.png", pngPicture(400, 200));
    given("B.png", pngPicture(200, 400));
    given("C.zip", "no picture");
    showList();
    const auto isWide = [&](std::string_view name) {
        const Size size = inRow(name).size();
        return size.width > size.height;
    };
    ASSERT_TRUE(house.until([&] { return !inRow("A.png").empty() && !inRow("B.png").empty(); }));
    EXPECT_TRUE(isWide("A.png") && !isWide("B.png") && inRow("C.zip").empty());
    house.rename("A.png", "D.png");
    ASSERT_TRUE(untilShown({"B.png", "C.zip", "D.png"}));
    EXPECT_TRUE(isWide("D.png")) << "it does not blink when it gets another name";
    given("B.png", pngPicture(400, 100), 90);
    ASSERT_TRUE(house.until([&] { return inRow("B.png").size() == Size{40, 10}; }));
}

} // namespace
} // namespace test
