#include "platform/documents/preview/TextWidget.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/HostileDocuments.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QtTest/QTest>

#include <gtest/gtest.h>

#include <string>

using namespace platform;

namespace {

struct HostileDocument : test::Preview {
    bool showsPage(const std::string& name, const std::string& content, const std::string& text) {
        house.givenFile(name, content);
        show(name);
        return untilPage(text);
    }
    bool isShown(const std::string& name, const std::string& content) {
        house.givenFile(name, content);
        screen->seen.clear();
        show(name);
        return untilShown() && !view().showsPage();
    }
    QColor middle() { return colorAt(*find<ZoomWidget>(), 0.5, 0.5); }
};

TEST_F(HostileDocument, aPictureThatUnpacksToGigabytesIsTooLargeAndNotDamaged) {
    EXPECT_TRUE(showsPage("Bomb.png", test::pngThatClaims(60'000, 60'000), "too large"));
    EXPECT_TRUE(showsPage("Cut.png", test::pngThatClaims(60, 60), "damaged"));
}

TEST_F(HostileDocument, everyWayToHoldACameraComesOutUpright) {
    for (int orientation = 1; orientation <= 8; ++orientation) {
        ASSERT_TRUE(isShown("Photo.jpg", test::photoLying(orientation))) << orientation;
        auto* const zoom = find<ZoomWidget>();
        EXPECT_EQ(zoom->content().contentSize(), QSizeF(160, 120)) << orientation;
        const QPointF sun = QPointF(0.75 * 160 - 80, 0.25 * 120 - 60);
        const QImage seen = zoom->grab().toImage();
        const QColor color = seen.pixelColor((QPointF(seen.rect().center()) + sun).toPoint());
        EXPECT_GT(color.red(), color.blue() + 60) << orientation;
    }
}

TEST_F(HostileDocument, aMovingPictureStandsStillAtItsFirstFrame) {
    ASSERT_TRUE(isShown("Wave.gif", test::movingPicture()));
    EXPECT_EQ(middle(), QColor(Qt::red));
}

TEST_F(HostileDocument, drawingsThatGrowWithoutEndAreBounded) {
    std::string laughs = "<!DOCTYPE svg [<!ENTITY a0 \"ha\">";
    std::string uses = R"(<g id="g0"><rect width="100" height="100" fill="red"/></g>)";
    const auto text = [](int number) { return std::to_string(number); };
    for (int i = 1; i < 12; ++i) {
        laughs += "<!ENTITY a" + text(i) + " \"";
        uses += "<g id=\"g" + text(i) + "\">";
        for (int k = 0; k < 10; ++k) {
            laughs += "&a" + text(i - 1) + ";";
            uses += "<use xlink:href=\"#g" + text(i - 1) + "\"/>";
        }
        laughs += "\">";
        uses += "</g>";
    }
    EXPECT_TRUE(showsPage("Laughs.svg", test::drawing("<text>&a11;</text>", laughs + "]>"), ""));
    EXPECT_TRUE(isShown("Uses.svg", test::drawing("<defs>" + uses + "</defs>")));
    EXPECT_TRUE(showsPage("Packed.svgz", test::packedSpaces(80'000'000), "too large"));
    EXPECT_TRUE(isShown("Self.svg", test::drawing(R"(<g id="a"><use xlink:href="#a"/></g>)")));
}

TEST_F(HostileDocument, aDrawingWithoutEndHoldsNobodyForLong) {
    std::string path = "M0 0";
    for (unsigned i = 1, at = 1; i <= 360'000; ++i) {
        at = at * 1664525U + 1013904223U;
        path += (i % 6 == 1 ? " C " : " ") + std::to_string(static_cast<int>(at >> 18) - 8192);
    }
    const std::string look = R"(<path stroke="black" stroke-width="3000" stroke-dasharray="1 2" )";
    house.givenFile("Dashes.svg", test::drawing(look + "d=\"" + path + "\"/>"));
    show("Dashes.svg");
    for (int i = 0; i < 1000 && !view().showsPage(); ++i) {
        house.advance(std::chrono::seconds(1));
        house.waitBriefly();
    }
    EXPECT_NE(view().pageText().find("too large"), std::string::npos);
}

TEST_F(HostileDocument, aDrawingOfAnySizeIsShownSharp) {
    const std::string square = R"(<rect width="50" height="100" fill="#00f"/>)";
    std::string huge = test::drawing(square);
    huge.replace(huge.find("width=\"100\" height=\"100\""), 24,
                 R"(width="900000000" height="900000000" viewBox="0 0 50 100")");
    ASSERT_TRUE(isShown("Huge.svg", huge));
    EXPECT_EQ(middle(), QColor(Qt::blue));
    ASSERT_TRUE(isShown("Small.svg", test::drawing(square)));
    find<ZoomWidget>()->zoomBy(8);
    EXPECT_EQ(colorAt(*find<ZoomWidget>(), 0.49, 0.5), QColor(Qt::blue)) << "no blur at the edge";
}

TEST_F(HostileDocument, aDrawingReadsNoOtherFile) {
    const std::string other = house.givenFile("Secret.png", test::pngPicture(100, 100));
    for (const std::string& address : {other, "file://" + other, std::string("Secret.png")}) {
        ASSERT_TRUE(
            isShown("Spy.svg", test::drawing(R"(<rect width="100" height="100" fill="red"/>)"
                                             R"(<image width="100" height="100" xlink:href=")" +
                                             address + "\"/>")));
        EXPECT_EQ(middle(), QColor(Qt::red)) << address;
    }
}

TEST_F(HostileDocument, aHundredThousandPagesAreThereAtOnceAndToTheLast) {
    ASSERT_TRUE(isShown("Endless.pdf", test::pdfOfBlankPages(100'000)));
    EXPECT_EQ(view().place(), "1 of 100,000");
    QTest::keyClick(find<ZoomWidget>(), Qt::Key_End);
    EXPECT_EQ(view().place(), "100,000 of 100,000");
}

TEST_F(HostileDocument, aLockedDocumentSaysThatItIsLocked) {
    EXPECT_TRUE(showsPage("Locked.pdf", test::lockedPdf(), "password"));
}

TEST_F(HostileDocument, textWithoutLineEndsOrWithoutTextIsShown) {
    ASSERT_TRUE(isShown("One line.txt", std::string(64'000'000, 'x')));
    auto* const text = find<TextWidget>();
    QTest::keyClick(text, Qt::Key_End);
    EXPECT_TRUE(house.until([&] { return text->topOffset() > 63'900'000; }));
    ASSERT_TRUE(isShown("Zeros.txt", std::string(5'000'000, '\0')));
    std::string noise(1'000'000, '\0');
    for (std::size_t i = 0; i < noise.size(); ++i)
        noise[i] = static_cast<char>(i * 2654435761U >> 13);
    ASSERT_TRUE(isShown("Noise.txt", noise));
}

} // namespace
