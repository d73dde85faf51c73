#include "platform/documents/preview/CleanHtml.h"
#include "platform/documents/preview/MarkdownText.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/RichDocument.h"
#include "platform/documents/preview/TextWidget.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QBuffer>
#include <QtTest/QTest>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <string>

using namespace platform;
using ::testing::HasSubstr;
using ::testing::Not;

namespace {

std::string clean(const std::string& html) {
    const auto out = cleanHtml(QString::fromStdString(html), {});
    return out ? out->toStdString() : "<too much>";
}

std::string repeated(const std::string& piece, int times) {
    std::string out;
    for (int i = 0; i < times; ++i)
        out += piece;
    return out;
}

std::string markdown(const std::string& text) {
    return htmlOfMarkdown(text, [] { return false; }).value_or("<too much>");
}

TEST(CleanHtml, keepsTextAndStructureAndNothingThatActs) {
    EXPECT_EQ(clean("<p onclick=x()>a <b>b</b>"), "<p>a <b>b</b></p>");
    EXPECT_EQ(clean("<script>x<y</script><style>p{}</style>a<!-- <b> -->b"), "ab");
    EXPECT_EQ(clean("<svg><p>x</p></svg><iframe src=a>x</iframe>c"), "c");
    EXPECT_EQ(clean("<link rel=stylesheet href=x><base href=y><form>a<input></form>"),
              "<div>a</div>");
    EXPECT_EQ(clean("1 < 2 && 3 &amp; &unterminated"),
              "1 &lt; 2 &amp;&amp; 3 &amp; &amp;unterminated");
    EXPECT_EQ(clean("<ul><li>a<li>b</ul><p>c<p>d"),
              "<ul><li>a</li><li>b</li></ul><p>c</p><p>d</p>");
    EXPECT_THAT(clean("a&#0;&#xFDD0;\xEF\xB7\x91"
                      "b"),
                Not(HasSubstr("#")));
    EXPECT_EQ(clean("</p></table></b>x<"), "x&lt;");
}

TEST(CleanHtml, followsLinksToTheWebAndToMailAlone) {
    EXPECT_EQ(clean("<a href='https://a.org/?x=1&amp;y=2'>a</a>"),
              "<a href=\"https://a.org/?x=1&amp;y=2\">a</a>");
    EXPECT_EQ(clean("<a href='#there'>a</a>"), "<a href=\"#there\">a</a>");
    for (const char* const address :
         {"javascript:x()", "file:///etc/passwd", "other.html", "tavrinapp://x", "data:text/html,x",
          "//host/share", " javascript:x", "https:", "HTTPS://", "mailto:"})
        EXPECT_EQ(clean(std::string("<a href=\"") + address + "\">a</a>"), "<span>a</span>")
            << address;
}

TEST(CleanHtml, isBoundedInEveryDirection) {
    EXPECT_LT(clean(repeated("<div>", 100'000) + "x").size(), 2000U);
    EXPECT_LT(clean(repeated("<table><tr><td>", 1000) + "x").size(), 25'000U)
        << "one table of rows";
    EXPECT_EQ(clean(repeated("<table><tr><td>", 10'000)), "<too much>");
    EXPECT_EQ(clean(repeated("<pre>x</pre>", 10'000)), "<too much>");
    EXPECT_EQ(clean(repeated("<i>x</i>", 200'000)), "<too much>");
    EXPECT_EQ(clean("<table>" + repeated("<tr><td>", 50'000) + repeated("<td>", 60)), "<too much>");
    EXPECT_EQ(clean(repeated(
                  "<table><tr>" + repeated("<td>", 64) + repeated("<tr>", 200) + "</table>", 20)),
              "<too much>");
    EXPECT_EQ(clean("<table><tr><td colspan=2000000000>x"), clean("<table><tr><td colspan=64>x"));
    EXPECT_THAT(clean(std::string(1000, 'x')), HasSubstr("\xE2\x80\x8B")) << "may be broken";
    for (const char* const open : {"<", "<a ", "<a b=\"", "<!--", "&", "</", "<script>", "<p a='"})
        clean(repeated(open, 100'000));
}

TEST(Markdown, knowsTablesTasksAndBareAddresses) {
    EXPECT_EQ(markdown("# A b!"), "<h1 id=\"a-b\">A b!</h1>");
    EXPECT_THAT(markdown("|a|b|\n|---|---:|\n|1|2|"), HasSubstr("<td align=\"right\">2</td>"));
    EXPECT_THAT(markdown("- [x] a\n- [ ] b"), HasSubstr("<li class=\"checked\">a"));
    EXPECT_THAT(markdown("see https://a.org now"), HasSubstr("<a href=\"https://a.org\">"));
    EXPECT_THAT(markdown("~~a~~ `<b>` <b>c</b>"),
                HasSubstr("<del>a</del> <code>&lt;b&gt;</code> <b>"));
    EXPECT_THAT(markdown("![a *b* ![c](d)](e \"f\")"), HasSubstr("<img src=\"e\" alt=\"a b c\">"));
}

TEST(Markdown, doesNotGrowBeyondMeasure) {
    const std::string wide = "|" + repeated("a|", 20'000) + "\n|" + repeated("---|", 20'000) + "\n";
    EXPECT_EQ(markdown(wide + repeated("|x\n", 20'000)), "<too much>");
    for (const char* const piece : {"[", "![", "*a ", "> ", "- ", "`a ", "<", "&", "|", "_", "~~a"})
        markdown(repeated(piece, 20'000));
    EXPECT_FALSE(htmlOfMarkdown("a\n\nb", [] { return true; }));
}

struct RichFolder : ::testing::Test {
    test::ScreenHouse house;
    void SetUp() override {
        house.signIn();
        house.openWindow();
    }
    /// Whether the red of the picture at that address is seen.
    bool showsPicture(const std::string& address) {
        const std::string path = house.givenFile("Text.html", "<p>Text</p><img width=200 src=\"" +
                                                                  address + "\"><p>More</p>");
        PreviewToken token(*house.clock);
        RichDocument document;
        EXPECT_TRUE(document.read(Url::file(path), path, RichFormat::html, token).value());
        document.layOut({360, 1}, 0);
        const QImage page = document.draw(0, document.pageSize().height(), 360);
        for (int y = 0; y < page.height(); ++y)
            for (int x = 0; x < page.width(); ++x)
                if (page.pixelColor(x, y) == QColor(Qt::red))
                    return true;
        return false;
    }
};

TEST_F(RichFolder, picturesComeFromTheTextAndItsOwnFolderAlone) {
    QImage red(40, 40, QImage::Format_RGB32);
    red.fill(Qt::red);
    const std::string beside = house.path("Red picture.png");
    ASSERT_TRUE(red.save(QString::fromStdString(beside)));
    const std::string outside = house.home / "Red.png";
    ASSERT_TRUE(red.save(QString::fromStdString(outside)));
    std::filesystem::create_symlink(outside, house.path("Link.png"));
    house.givenFolder("Below");
    ASSERT_TRUE(red.save(QString::fromStdString(house.path("Below/Red.png"))));
    QByteArray bytes;
    QBuffer buffer(&bytes);
    red.save(&buffer, "png");
    EXPECT_TRUE(showsPicture("Red picture.png"));
    EXPECT_TRUE(showsPicture("./Red%20picture.png"));
    EXPECT_TRUE(showsPicture("data:image/png;base64," + bytes.toBase64().toStdString()));
    for (const std::string& address :
         {outside, "file://" + outside, std::string("Link.png"), std::string("Below/Red.png"),
          "file://" + beside, beside, std::string("qrc:/Red picture.png"), std::string(".."),
          std::string("http://localhost/Red picture.png"),
          std::string("//localhost/Red picture.png")})
        EXPECT_FALSE(showsPicture(address)) << address;
}

struct RichPreview : test::Preview {
    ZoomWidget* page() { return find<ZoomWidget>(); }
    bool isShown(const std::string& name, const std::string& content) {
        house.givenFile(name, content);
        screen->seen.clear();
        show(name);
        return untilShown() && !view().showsPage();
    }
    /// Waits until something that is as dark as letters is drawn.
    bool untilDrawn() {
        return house.until([&] {
            const QImage seen = page()->grab().toImage();
            for (int y = 0; y < seen.height(); ++y)
                for (int x = 0; x < seen.width(); ++x)
                    if (seen.pixelColor(x, y).lightness() < 80)
                        return true;
            return false;
        });
    }
};

TEST_F(RichPreview, aTextIsLaidOutForItsViewAndItsLetters) {
    ASSERT_TRUE(isShown("Long.md", "# Title\n\n" + repeated("Some words of a text. ", 2000)));
    ASSERT_TRUE(untilDrawn());
    ASSERT_TRUE(house.until([&] { return page()->content().contentSize().width() == 360; }));
    const double tall = page()->content().contentSize().height();
    house.window->resize({900, 640});
    EXPECT_TRUE(house.until([&] { return page()->content().contentSize().height() < tall * 0.8; }));
    const double before = page()->content().contentSize().height();
    QTest::keyClick(page(), Qt::Key_Plus);
    EXPECT_TRUE(house.until([&] { return page()->content().contentSize().height() > before; }));
    EXPECT_EQ(page()->zoom(), 1) << "the letters grow, not the page";
}

TEST_F(RichPreview, aChangedTextStaysAtItsPlace) {
    std::string text;
    for (int i = 0; i < 300; ++i)
        text += "Paragraph " + std::to_string(i) + "\n\n";
    ASSERT_TRUE(isShown("Long.md", text));
    ASSERT_TRUE(house.until([&] { return page()->content().contentSize().width() == 360; }));
    for (int i = 0; i < 5; ++i)
        QTest::keyClick(page(), Qt::Key_PageDown);
    const double top = page()->visibleRect().top();
    house.givenFile("Long.md", text + "One more\n");
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    EXPECT_NEAR(page()->visibleRect().top(), top, 1);
}

TEST_F(RichPreview, whatIsTooLongOrTooIntricateIsShownAsItsSource) {
    ASSERT_TRUE(isShown("Huge.md", repeated("words ", 400'000)));
    EXPECT_TRUE(find<TextWidget>());
    ASSERT_TRUE(
        isShown("Cells.html", "<table>" + repeated("<tr><td>", 50'000) + repeated("<td>", 60)));
    EXPECT_TRUE(find<TextWidget>());
    ASSERT_TRUE(isShown("Word.html", std::string(500'000, 'x')));
    EXPECT_TRUE(page());
    ASSERT_TRUE(isShown("Nothing.html", "<script>1</script>"));
}

TEST_F(RichPreview, aTouchFollowsLinksWithinTheText) {
    ASSERT_TRUE(isShown("Links.md", "[below](#the-end)\n\n" + repeated("words\n\n", 200) +
                                        "## The end\n\nHere."));
    ASSERT_TRUE(untilDrawn());
    QTest::mouseClick(page(), Qt::LeftButton, {}, {30, 32});
    EXPECT_TRUE(house.until([&] { return page()->visibleRect().top() > 1000; }));
}

} // namespace
