#include "platform/documents/DocumentPickerUnavailableViewController.h"
#include "platform/documents/preview/TextWidget.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QWheelEvent>
#include <QtTest/QTest>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::HasSubstr;

namespace {

using test::Preview;

TEST_F(Preview, knowsByTheNameAloneWhatItCanShow) {
    for (const char* const name : {"a.png", "a.JPG", "a.pdf", "a.txt", "notes.md", "a.csv"})
        EXPECT_TRUE(PlatformPreviewController::canPreview(Url::file(std::string("/none/") + name)))
            << name;
    for (const char* const name : {"a", "a.unheard-of", "a.exe"})
        EXPECT_FALSE(PlatformPreviewController::canPreview(Url::file(std::string("/none/") + name)))
            << name;
    EXPECT_FALSE(PlatformPreviewController::canPreview(Url::file("/none/folder.txt", true)));
}

TEST_F(Preview, showsAPictureUprightAndFitted) {
    // The larger one is seen before all of its pixels have been read.
    for (const int width : {1600, 3200}) {
        house.givenFile("Photo.jpg", test::turnedPhoto(width, width * 3 / 4));
        show("Other.txt");
        screen->seen.clear();
        show("Photo.jpg");
        ASSERT_TRUE(untilShown());
        auto* const zoom = find<ZoomWidget>();
        const auto isUpright = [&] {
            const QColor top = colorAt(*zoom, 0.2, 0.32);
            const QColor bottom = colorAt(*zoom, 0.2, 0.68);
            return top.blue() > top.green() && bottom.green() > bottom.blue();
        };
        EXPECT_EQ(zoom->content().contentSize(), QSizeF(width, width * 3 / 4));
        EXPECT_NEAR(zoom->zoom(), 360.0 / width, 1e-6);
        EXPECT_TRUE(isUpright()) << "sky above, meadow below";
        const QImage coarse = zoom->grab().toImage();
        EXPECT_TRUE(width < 2000 || house.until([&] { return zoom->grab().toImage() != coarse; }));
        EXPECT_TRUE(isUpright());
        EXPECT_EQ(screen->seen.size(), 1U);
    }
}

TEST_F(Preview, theWheelZoomsAPictureAroundThePointerAndZeroFitsIt) {
    house.givenFile("Photo.png", test::pngPicture(1600, 1200));
    show("Photo.png");
    ASSERT_TRUE(untilShown());
    auto* const zoom = find<ZoomWidget>();
    const double fitted = zoom->zoom();
    QWheelEvent turn({90, 260}, {90, 260}, {}, {0, 600}, Qt::NoButton, Qt::NoModifier,
                     Qt::NoScrollPhase, false);
    QCoreApplication::sendEvent(zoom, &turn);
    EXPECT_GT(zoom->zoom(), 2 * fitted);
    EXPECT_NEAR(zoom->visibleRect().left() + 90 / zoom->zoom(), 400, 1);
    QTest::keyClick(zoom, Qt::Key_0);
    EXPECT_EQ(zoom->zoom(), fitted);
    house.window->resize({640, 360});
    house.settle();
    EXPECT_NE(zoom->zoom(), fitted) << "stays fitted to the window";
}

TEST_F(Preview, aPinchMakesLargerWhatIsBetweenTheFingers) {
    house.givenFile("Photo.png", test::pngPicture(1600, 1200));
    show("Photo.png");
    ASSERT_TRUE(untilShown());
    auto* const zoom = find<ZoomWidget>();
    const double fitted = zoom->zoom();
    static QPointingDevice* const fingers = QTest::createTouchDevice();
    QTest::touchEvent(zoom, fingers).press(0, {150, 250}, zoom).press(1, {210, 250}, zoom);
    QTest::touchEvent(zoom, fingers).move(0, {120, 250}, zoom).move(1, {240, 250}, zoom);
    QTest::touchEvent(zoom, fingers).release(0, {120, 250}, zoom).release(1, {240, 250}, zoom);
    EXPECT_NEAR(zoom->zoom() / fitted, 2, 0.01);
}

TEST_F(Preview, showsPagesOnWhiteAndTellsWhichOneIsInView) {
    house.givenFile("Report.pdf", test::pdfOfPages(4));
    show("Report.pdf");
    ASSERT_TRUE(untilShown());
    auto* const zoom = find<ZoomWidget>();
    EXPECT_EQ(view().place(), "1 of 4");
    const QImage seen = zoom->grab().toImage();
    int letters = 0; // of the title, there with the document
    for (int x = 0; x < seen.width(); ++x)
        letters += seen.pixelColor(x, 27).lightness() < 100 ? 1 : 0;
    EXPECT_GT(letters, 0);
    EXPECT_EQ(colorAt(*zoom, 0.9, 0.5), QColor(Qt::white));
    QTest::keyClick(zoom, Qt::Key_End);
    EXPECT_EQ(view().place(), "4 of 4");
}

TEST_F(Preview, aChangedDocumentIsReadAgainAtTheSamePlace) {
    house.givenFile("Report.pdf", test::pdfOfPages(9));
    show("Report.pdf");
    ASSERT_TRUE(untilShown());
    auto* const zoom = find<ZoomWidget>();
    QTest::keyClick(zoom, Qt::Key_PageDown);
    QTest::keyClick(zoom, Qt::Key_PageDown);
    const double top = zoom->visibleRect().top();
    house.givenFile("Report.pdf", test::pdfOfPages(6));
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    EXPECT_EQ(find<ZoomWidget>()->visibleRect().top(), top);
    QTest::keyClick(zoom, Qt::Key_End);
    EXPECT_EQ(view().place(), "6 of 6");
}

TEST_F(Preview, showsTextOfAnyLengthByWindows) {
    house.givenFile("Long.txt", test::longText(400'000));
    show("Long.txt");
    ASSERT_TRUE(untilShown());
    auto* const text = find<TextWidget>();
    ASSERT_TRUE(house.until([&] { return !text->grab().isNull() && text->topOffset() == 0; }));
    QTest::keyClick(text, Qt::Key_End);
    ASSERT_TRUE(house.until([&] { return text->topOffset() > 5'000'000; }));
    const std::uint64_t end = text->topOffset();
    for (int i = 0; i < 40; ++i)
        QTest::keyClick(text, Qt::Key_PageUp);
    EXPECT_LT(text->topOffset(), end);
    QTest::keyClick(text, Qt::Key_Home);
    EXPECT_TRUE(house.until([&] { return text->topOffset() == 0; }));
}

TEST_F(Preview, saysWhyADocumentCannotBeShown) {
    house.givenFile("Broken.png", "no picture");
    house.givenFile("Broken.pdf", "no pages");
    house.givenFile("Nothing.txt", "");
    house.givenFile("Program.exe", "MZ");
    house.givenFolder("Folder.txt");
    show("Broken.png");
    EXPECT_TRUE(untilPage("damaged"));
    show("Broken.pdf");
    EXPECT_TRUE(untilPage("damaged"));
    show("Nothing.txt");
    EXPECT_TRUE(untilPage("nothing in this document"));
    show("Gone.txt");
    EXPECT_TRUE(untilPage("no longer there"));
    show("Folder.txt");
    EXPECT_TRUE(untilPage("folder"));
    show("Promised.txt");
    EXPECT_TRUE(untilPage("not on this device"));
    show("Program.exe");
    EXPECT_TRUE(untilPage("cannot be shown here"));
    EXPECT_THAT(view().pageText(), HasSubstr("2 bytes"));
    EXPECT_TRUE(screen->seen.empty());
}

TEST_F(Preview, aPictureCutOffInTheMiddleIsAPageOrAPictureButNoCrash) {
    const std::string whole = test::turnedPhoto(800, 600);
    for (std::size_t length : {1UL, 20UL, 200UL, whole.size() / 2}) {
        house.givenFile("Cut.jpg", whole.substr(0, length));
        screen->seen.clear();
        show("Cut.jpg");
        EXPECT_TRUE(house.until([&] { return view().showsPage() || !screen->seen.empty(); }));
        show("Other.txt");
        house.settle();
    }
}

TEST_F(Preview, maybeLeftWhileItReads) {
    house.givenFile("Photo.jpg", test::turnedPhoto(4000, 3000));
    house.givenFile("Report.pdf", test::pdfOfPages(40));
    for (int i = 0; i < 6; ++i) {
        show(i % 2 ? "Photo.jpg" : "Report.pdf");
        house.show({});
    }
    screen.reset();
    house.settle();
}

std::shared_ptr<Button> visibleButton(const View& view, const std::string& title) {
    for (const auto& each : view.subviews()) {
        if (each->isHidden())
            continue;
        if (auto button = std::dynamic_pointer_cast<Button>(each);
            button && button->title() == title)
            return button;
        if (auto inner = visibleButton(*each, title))
            return inner;
    }
    return nullptr;
}

TEST_F(Preview, offersOtherProgramsForADocumentThatIsThereAndCannotBeShown) {
    house.givenFile("Program.exe", "MZ");
    show("Program.exe");
    ASSERT_TRUE(untilPage("cannot be shown here"));
    const auto open = visibleButton(view(), "Open With…");
    ASSERT_TRUE(open);
    open->sendActions(ControlEvent::touchUpInside);
    house.settle();
    show("Gone.exe");
    EXPECT_FALSE(visibleButton(view(), "Open With…"));
}

TEST_F(Preview, withoutADocumentItSaysSo) {
    screen->reloadData();
    house.show({screen});
    EXPECT_TRUE(untilPage("no document"));
}

TEST(TextEncodings, areToldByTheirMarksAndByTheirBytes) {
    EXPECT_EQ(detectEncoding("plain").encoding, TextEncoding::utf8);
    EXPECT_EQ(detectEncoding("na\xC3\xAFve").encoding, TextEncoding::utf8);
    EXPECT_EQ(detectEncoding("na\xC3").encoding, TextEncoding::utf8) << "cut in a character";
    EXPECT_EQ(detectEncoding("na\xEFve").encoding, TextEncoding::windows1252);
    EXPECT_EQ(detectEncoding("\xEF\xBB\xBFx").markLength, 3U);
    EXPECT_EQ(detectEncoding(std::string_view("a\0b\0c\0", 6)).encoding,
              TextEncoding::utf16LittleEndian);
    EXPECT_EQ(detectEncoding(std::string_view("\xFE\xFF\0a", 4)).encoding,
              TextEncoding::utf16BigEndian);
}

struct TextFiles : ::testing::Test {
    test::TemporaryFolder folder;
    TextFile open(const std::string& content) {
        const std::string path = folder.write("t.txt", content);
        return std::move(TextFile::open(Url::file(path), path)).value();
    }
    /// The whole text, put together from windows.
    static std::string forward(const TextFile& file) {
        std::string all;
        std::uint64_t at = file.start();
        while (at < file.size()) {
            const std::vector<TextLine> lines = file.linesFrom(at);
            if (lines.empty())
                return all + "<stuck>";
            for (const TextLine& line : lines) {
                EXPECT_EQ(line.offset, at);
                at = line.end;
                all += line.text.toStdString() + "\n";
            }
        }
        return all;
    }
};

TEST_F(TextFiles, windowsPutTogetherAreTheWholeTextInEveryEncoding) {
    const std::string text = test::longText(20'000);
    EXPECT_EQ(forward(open(text)), text);
    EXPECT_EQ(forward(open("\xEF\xBB\xBF" + text)), text);
    std::string wide("\xFF\xFE");
    for (const char each : text)
        wide += {each, '\0'};
    EXPECT_EQ(forward(open(wide)), text);
}

TEST_F(TextFiles, windowsBackwardMeetTheWindowsForward) {
    const TextFile file = open(test::longText(20'000));
    std::uint64_t at = file.size();
    while (at > file.start()) {
        const std::vector<TextLine> lines = file.linesBefore(at);
        ASSERT_FALSE(lines.empty());
        EXPECT_EQ(lines.back().end, at);
        for (std::size_t i = 1; i < lines.size(); ++i)
            ASSERT_EQ(lines[i].offset, lines[i - 1].end);
        at = lines.front().offset;
    }
    const std::vector<TextLine> around = file.linesAround(file.size() / 2);
    EXPECT_LE(around.front().offset, file.size() / 2);
    EXPECT_GT(around.back().end, file.size() / 2);
}

TEST_F(TextFiles, oneEndlessLineComesInPiecesAndGarbageIsVisible) {
    const TextFile file = open(std::string(1'000'000, 'x'));
    const std::string all = forward(file);
    EXPECT_EQ(std::count(all.begin(), all.end(), 'x'), 1'000'000);
    EXPECT_GT(std::count(all.begin(), all.end(), '\n'), 100);
    const TextFile garbage = open(std::string("a\x01\x02 b\n\x7F\x80\xFF", 9));
    EXPECT_EQ(garbage.linesFrom(0).size(), 2U);
    EXPECT_TRUE(garbage.linesFrom(0)[0].text.startsWith(QStringLiteral("a␁␂")));
}

struct Placeholder : ::testing::Test {
    test::ScreenHouse house;
};

TEST_F(Placeholder, isMadeByItsNameAndSaysWhatToDo) {
    house.withoutAccount();
    house.openWindow();
    EXPECT_EQ(makeScreenByClassName("NoSuchScreen"), nullptr);
    const auto screen = makeScreenByClassName("DocumentPickerUnavailableViewController");
    ASSERT_TRUE(screen);
    house.show({screen});
    std::string texts;
    for (const auto& each : screen->view()->subviews()) {
        if (const auto label = std::dynamic_pointer_cast<Label>(each))
            texts += label->text() + '\n';
        for (const auto& inner : each->subviews())
            if (const auto label = std::dynamic_pointer_cast<Label>(inner))
                texts += label->text() + '\n';
    }
    EXPECT_THAT(texts, HasSubstr("Pelmora is not enabled"));
    EXPECT_THAT(texts, HasSubstr("pelmora sign-in folder PATH"));
    EXPECT_THAT(texts, HasSubstr(house.platform->accounts().problem().value_or("")));
}

} // namespace
