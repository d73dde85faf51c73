#include "preview/PreviewThumbnailViewController.h"
#include "tests/documents/SampleDocuments.h"
#include "tests/product/PreviewFixture.h"

#include <QColor>
#include <QImage>

using tavrin::FileInfoCell;
using tavrin::FileInfoStackView;
using tavrin::VXItem;
using testing::ElementsAre;

namespace test {
namespace {

struct Details : PreviewTest {
    void givenDetails(const std::string& name, platform::Size size = phone) {
        signIn();
        givenFile(name, "some content");
        launch(size);
        open("Documents");
        preview(name, tavrin::detailsMode);
    }
    static std::vector<std::string> names(const FileInfoStackView& rows) {
        std::vector<std::string> names;
        for (const auto& row : rows.arrangedSubviews())
            names.push_back(dynamic_cast<FileInfoCell&>(*row).nameLabel()->text());
        return names;
    }
    /// In the window's coordinates.
    static platform::Rect place(const platform::View& view) {
        return view.convertToWindow(view.bounds());
    }
};

TEST_F(Details, showsARowForEachValueThatThereIs) {
    givenDetails("Milk.txt");
    const FileInfoStackView& rows = *details()->fileInfoView();
    EXPECT_THAT(names(rows), ElementsAre("Kind", "Size", "Where", "Created", "Modified"));
    const auto item = std::make_shared<VXItem>(url("Milk.txt"));
    item->setCreationDate(std::nullopt);
    item->setFriendlyFileSize(std::nullopt);
    item->setTags(std::vector<std::string>{"red one", "two"});
    details()->fileInfoView()->setItem(item);
    EXPECT_THAT(names(rows), ElementsAre("Kind", "Where", "Modified", "Tags"));
    EXPECT_EQ(rows.creationDateCell(), nullptr);
    details()->fileInfoView()->setItem(nullptr);
    EXPECT_THAT(names(rows), ElementsAre("Kind", "Where", "Modified", "Tags"));
    advance(20ms);
    double width = -1;
    for (const auto& row : rows.arrangedSubviews()) {
        const double here = dynamic_cast<FileInfoCell&>(*row).nameLabel()->bounds().width;
        EXPECT_TRUE(width < 0 || width == here) << "all names form one column";
        width = here;
    }
}

TEST_F(Details, putsADotBeforeEachTag) {
    launch();
    VXItem item(platform::Url::file(home / "A.txt"));
    EXPECT_EQ(FileInfoStackView::buildTagsWithImagesString(item, FileInfoCell::font()),
              std::nullopt);
    item.setTags(std::vector<std::string>{"one", "2 and 3"});
    const auto line = FileInfoStackView::buildTagsWithImagesString(item, FileInfoCell::font());
    ASSERT_EQ(line->runs.size(), 4U);
    EXPECT_FALSE(line->runs[0].image.empty());
    EXPECT_EQ(line->runs[1].text, "one ");
    EXPECT_FALSE(line->runs[2].image.empty());
    EXPECT_EQ(line->runs[3].text, "2 and 3");
    EXPECT_EQ(line->runs[3].baselineOffset, -FileInfoCell::font().descender());
}

TEST_F(Details, choosesTheLongestDatesThatFit) {
    givenDetails("Milk.txt");
    const auto item = std::make_shared<VXItem>(url("Milk.txt"));
    item->setCreationDate(platform::Date::fromSeconds(1'695'000'000)); // in September
    item->setContentModificationDate(platform::Date::fromSeconds(1'715'000'000));
    const auto rows = std::make_shared<FileInfoStackView>();
    rows->setAxis(platform::Axis::vertical);
    nav().view()->addSubview(rows);
    rows->setItem(item);
    const auto width = platform::LayoutConstraint::constant(*rows, platform::LayoutAttribute::width,
                                                            platform::LayoutRelation::equal, 0);
    width->setActive(true);
    using enum platform::DateStyle;
    const auto widthOf = [&](platform::DateStyle style) {
        const platform::Font font = FileInfoCell::font();
        return std::max(font.width(*item->friendlyCreationDate(style)),
                        font.width(*item->friendlyContentModificationDate(style)));
    };
    const double names = 10 + FileInfoCell::font().width("Modified");
    for (const auto& [room, style] : {std::pair{widthOf(longStyle) + 3, longStyle},
                                      {widthOf(longStyle) - 5, medium},
                                      {widthOf(medium) + 3, medium},
                                      {widthOf(medium) - 5, shortStyle},
                                      {widthOf(shortStyle) - 20, shortStyle}}) {
        SCOPED_TRACE(room);
        width->setConstant(names + room);
        advance(100ms);
        EXPECT_EQ(rows->creationDateCell()->valueLabel()->text(),
                  item->friendlyCreationDate(style));
        EXPECT_EQ(rows->modifiedDateCell()->valueLabel()->text(),
                  item->friendlyContentModificationDate(style));
    }
}

TEST_F(Details, renamesByTheNameAndFollows) {
    givenDetails("Milk.txt");
    const auto screen = details();
    tap(*screen->filenameTextField());
    advance(1s);
    ASSERT_NE(alert(), nullptr);
    for (int i = 0; i < 8; ++i)
        press(Key::backspace);
    type("Bread");
    tap(*button("Done"));
    EXPECT_TRUE(whileTimePasses([&] { return screen->originalFilename() == "Bread.txt"; }));
    EXPECT_EQ(screen->filenameTextField()->text(), "Bread.txt");
    EXPECT_EQ(details(), screen);
    EXPECT_EQ(manager().presentedItemURL(), url("Bread.txt"));
    EXPECT_TRUE(std::filesystem::exists(path("Bread.txt")));
}

TEST_F(Details, leavesTheNameOfALibraryAlone) {
    givenDetails("Milk.txt");
    const auto item = std::make_shared<VXItem>(url("Milk.txt"));
    item->setRenameable(false);
    manager().setItem(item, false);
    tap(*details()->filenameTextField());
    advance(1s);
    EXPECT_EQ(topPresented(), nullptr);
}

TEST_F(Details, offersTheApplicationWhereThereIsRoomForIt) {
    home.write("data/applications/pen.desktop", "[Desktop Entry]\nType=Application\nName=Pen\n"
                                                "Exec=/bin/true %f\nMimeType=text/plain;\n");
    givenDetails("Milk.txt", tablet);
    givenFile("Milk.pdf");
    for (const bool onTablet : {true, false}) {
        if (!onTablet) {
            application->setIdiom(platform::DeviceIdiom::phone);
            window().resize(phone);
            back();
            preview("Milk.txt", tavrin::detailsMode);
        }
        EXPECT_EQ(details()->hairlineViews().size(), onTablet ? 3U : 2U);
        EXPECT_EQ(details()->navigationItem().rightBarButtonItems().size(), onTablet ? 5U : 1U);
        clearLog();
        tap(*button("Open in “Pen”"));
        EXPECT_EQ(timesLogged("6 Opening document " + told("Milk.txt") + " in default app"), 1U);
        back();
        preview("Milk.pdf", tavrin::detailsMode);
        EXPECT_EQ(details()->openInAppButton(), nullptr);
        EXPECT_EQ(details()->hairlineViews().size(), 2U);
        back();
        preview("Milk.txt", tavrin::detailsMode);
    }
}

TEST_F(Details, drawsTheLinesAcrossTheScreen) {
    givenDetails("Milk.txt");
    const auto isLine = [this](double x, const platform::View& line) {
        const platform::Bytes png = window().snapshotPng(1);
        const QImage picture = QImage::fromData(
            QByteArray(reinterpret_cast<const char*>(png.data()), static_cast<int>(png.size())));
        const QColor color =
            picture.pixelColor(static_cast<int>(x), static_cast<int>(place(line).y));
        return color != QColor(Qt::white);
    };
    for (const auto& line : details()->hairlineViews())
        EXPECT_TRUE(isLine(0, *line) && isLine(200, *line) && isLine(389, *line));
    window().resize({844, 390});
    advance(1s);
    for (const auto& line : details()->hairlineViews()) {
        EXPECT_TRUE(isLine(843, *line) && isLine(place(*line).x + 1, *line));
        EXPECT_FALSE(isLine(place(*line).x - 2, *line));
    }
}

TEST_F(Details, leansTheNamesTowardTheirValues) {
    givenDetails("Milk.txt");
    for (const bool rightToLeft : {false, true}) {
        application->setRightToLeft(rightToLeft);
        back();
        preview("Milk.txt", tavrin::detailsMode);
        const FileInfoCell& cell = *details()->fileInfoView()->modifiedDateCell();
        EXPECT_EQ(cell.nameLabel()->textAlignment(),
                  rightToLeft ? platform::TextAlignment::left : platform::TextAlignment::right);
        EXPECT_EQ(place(*cell.nameLabel()).x > place(*cell.valueLabel()).x, rightToLeft);
    }
}

TEST_F(Details, showsThePictureOnceItIsMade) {
    signIn();
    givenFile("Coast.png", pngPicture(1600, 800));
    std::filesystem::last_write_time(path("Coast.png"),
                                     std::filesystem::file_time_type::clock::now() - 24h);
    EXPECT_TRUE(VXItem(url("Coast.png")).thumbnail().empty()) << "nobody waits for it";
    launch(phone);
    open("Documents");
    preview("Coast.png", tavrin::detailsMode);
    const platform::ImageView& shown = *details()->thumbnailView()->thumbnailView();
    ASSERT_TRUE(until([&] { return shown.image().size() == platform::Size{1024, 512}; }));
    EXPECT_EQ(manager().item()->thumbnail(), shown.image());
    EXPECT_EQ(VXItem(url("Coast.png")).thumbnail().size(), (platform::Size{1024, 512}));
    const platform::Rect place = Details::place(shown);
    EXPECT_TRUE(place.width > 0 && place.maxX() <= 390 &&
                place.maxY() <= Details::place(*details()->fileDetailsView()).y);
}

TEST_F(Details, showsThePictureThatWasMadeBeforeTheContentLeft) {
    givenRemote("Coast.png", pngPicture(1600, 800));
    std::filesystem::last_write_time(remoteFile("Coast.png"),
                                     std::filesystem::file_time_type::clock::now() - 24h);
    start();
    EXPECT_TRUE(VXItem(url("Coast.png")).thumbnail().empty());
    EXPECT_TRUE(isPromise("Coast.png")) << "nothing is fetched for a picture";
    preview("Coast.png");
    ASSERT_TRUE(untilFullPreview());
    back();
    const platform::Size whole{1024, 512};
    preview("Coast.png", tavrin::detailsMode);
    ASSERT_TRUE(until(
        [&] { return details()->thumbnailView()->thumbnailView()->image().size() == whole; }));
    back();
    ASSERT_FALSE(documents().evictItem(url("Coast.png")));
    preview("Coast.png", tavrin::detailsMode);
    EXPECT_EQ(details()->thumbnailView()->thumbnailView()->image().size(), whole);
    EXPECT_TRUE(isPromise("Coast.png"));
}

TEST_F(Details, showsAPieOnTheThumbnailOnlyWhenAsked) {
    givenDetails("Milk.txt");
    const auto screen = std::make_shared<tavrin::PreviewThumbnailViewController>();
    screen->setItemManager(manager().weak_from_this());
    nav().pushViewController(screen, false);
    advance(1s);
    const tavrin::ThumbnailImageView& thumbnail = *screen->thumbnailView();
    EXPECT_FALSE(thumbnail.thumbnailView()->image().empty()) << "the type's icon";
    thumbnail.progressView()->setProgress(0.7F);
    screen->thumbnailView()->updateProgress(0.5);
    EXPECT_EQ(thumbnail.progressView()->progress(), 0.7F) << "hidden, it takes no report";
    screen->showProgress(true);
    EXPECT_EQ(thumbnail.progressView()->progress(), 0);
    screen->thumbnailView()->updateProgress(0.5);
    EXPECT_EQ(thumbnail.progressView()->progress(), 0.5F);
    advance(20ms);
    EXPECT_EQ(place(*thumbnail.progressView()).maxX(), place(*thumbnail.thumbnailView()).maxX());
    EXPECT_EQ(place(*thumbnail.progressView()).maxY(), place(*thumbnail.thumbnailView()).maxY());
    EXPECT_EQ(thumbnail.progressView()->bounds().width, 22);
}

TEST_F(Details, letsEveryRowBeReachedAtTwiceTheTextSize) {
    givenDetails("Milk.txt");
    const auto screen = details();
    for (const platform::Size size : {phone, platform::Size{844, 390}, {360, 640}, {640, 360}}) {
        SCOPED_TRACE(size.width);
        window().resize(size);
        advance(1s);
        const auto& rows = screen->fileInfoView()->arrangedSubviews();
        for (const double scale : {1.0, 2.0}) {
            application->setTextScale(scale);
            advance(1s);
            for (std::size_t i = 1; i < rows.size(); ++i)
                EXPECT_GE(place(*rows[i]).y, place(*rows[i - 1]).maxY()) << "none over another";
            const double last = place(*rows.back()).maxY();
            const double toolbar = nav().toolbarFrame().height;
            const bool roomy = scale == 1 && size.height > 360;
            EXPECT_TRUE(!roomy || last <= size.height - toolbar);
            const auto& page = screen->view()->subviews();
            auto& box = dynamic_cast<platform::ScrollBox&>(*page.back());
            box.scrollTo(10'000);
            EXPECT_LE(last - box.offset(), size.height - toolbar);
            EXPECT_TRUE(!roomy || box.offset() == 0);
            box.scrollTo(0);
        }
    }
}

TEST_F(Details, standsBelowUprightAndBesideAcross) {
    givenDetails("Milk.txt", {768, 1024});
    const auto screen = details();
    for (const auto& line : screen->hairlineViews()) {
        EXPECT_EQ(place(*line).x, 0);
        EXPECT_EQ(place(*line).width, 768);
        EXPECT_EQ(line->bounds().height, 1 / window().screenScale());
    }
    EXPECT_LT(place(*screen->thumbnailView()).maxY(), place(*screen->fileDetailsView()).y);
    window().resize({1024, 768});
    advance(1s);
    const platform::Rect column = place(*screen->fileDetailsView());
    EXPECT_NEAR(column.width, screen->thumbnailView()->bounds().width, 1);
    EXPECT_LT(place(*screen->thumbnailView()).x, column.x);
    for (const auto& line : screen->hairlineViews()) {
        EXPECT_EQ(place(*line).x, column.x);
        EXPECT_EQ(place(*line).maxX(), 1024);
    }
    EXPECT_EQ(screen->filenameTextField()->textAlignment(), platform::TextAlignment::natural);
    window().resize({768, 1024});
    advance(1s);
    EXPECT_EQ(place(*screen->hairlineViews().front()).width, 768);
}

} // namespace
} // namespace test
