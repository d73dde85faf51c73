#include "platform/base/Process.h"
#include "platform/documents/preview/OfficeConverter.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QtTest/QTest>

#include <gmock/gmock.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <future>
#include <sys/stat.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::HasSubstr;
namespace fs = std::filesystem;

namespace {

/// Does what an office program is asked to do, as the first word of the document says.
constexpr const char* fakeOffice = R"(#!/bin/sh
here=$(dirname "$0")
for each; do document=$each; done
while [ $# -gt 1 ]; do [ "$1" = --outdir ] && out=$2; shift; done
echo "$document" >>"$here/log"
case $(cat "$document") in
hang*) echo started >"$here/started"; sleep 1000 ;;
broken*) exit 1 ;;
nothing*) exit 0 ;;
garbage*) echo "no pages" >"$out/document.pdf" ;;
*) cp "$here/pages.pdf" "$out/document.pdf" ;;
esac
)";

/// An office program in a $PATH of its own.
class Office {
public:
    Office() : before_(environmentVariable("PATH").value_or("")) {
        folder.write("soffice", fakeOffice);
        fs::permissions(folder / "soffice", fs::perms::owner_all);
        ::mkfifo((folder / "started").c_str(), 0600);
        setEnvironmentVariable("PATH", folder.path() + ":/usr/bin:/bin");
    }
    ~Office() { setEnvironmentVariable("PATH", before_); }
    void givenPages(int pages) const { folder.write("pages.pdf", test::pdfOfPages(pages)); }
    void uninstall() const { setEnvironmentVariable("PATH", folder.makeFolder("empty")); }
    std::size_t runs() const {
        const std::string log = folder.has("log") ? folder.read("log") : "";
        return static_cast<std::size_t>(std::count(log.begin(), log.end(), '\n'));
    }
    void waitUntilItHangs() const { folder.read("started"); }

    test::TemporaryFolder folder;

private:
    std::string before_;
};

struct OfficePreview : test::Preview {
    Office office;
    void SetUp() override {
        Preview::SetUp();
        office.givenPages(4);
    }
    std::string cache() const { return house.home / "cache/com.pelmora.Tavrin/office-pages"; }
    std::size_t cachedFiles() const {
        return static_cast<std::size_t>(
            std::count_if(fs::directory_iterator(cache()), fs::directory_iterator(),
                          [](const auto& each) { return each.path().extension() == ".pdf"; }));
    }
};

TEST_F(OfficePreview, isThereWhereAnOfficeProgramIs) {
    const auto canShow = [&](const char* name) {
        return PlatformPreviewController::canPreview(house.url(name));
    };
    const auto names = {"a.odt", "a.ods",  "a.odp", "a.doc",  "a.docx",
                        "a.xls", "a.xlsx", "a.ppt", "a.pptx", "a.rtf"};
    for (const char* const name : names)
        EXPECT_TRUE(canShow(name)) << name;
    office.uninstall();
    for (const char* const name : names)
        EXPECT_FALSE(canShow(name)) << name;
    EXPECT_TRUE(canShow("a.txt"));
    house.givenFile("a.docx", "x");
    show("a.docx");
    EXPECT_TRUE(untilPage("cannot be shown here"));
}

TEST_F(OfficePreview, showsThePagesThatTheProgramMakesAndMakesThemOnce) {
    house.givenFile("Letter; rm -rf.odt", "letter");
    show("Letter; rm -rf.odt");
    ASSERT_TRUE(untilShown());
    EXPECT_EQ(view().place(), "1 of 4");
    show("Letter; rm -rf.odt");
    ASSERT_TRUE(untilShown(2));
    EXPECT_EQ(office.runs(), 1U);
    EXPECT_THAT(office.folder.read("log"), HasSubstr("/document.odt\n"));
}

TEST_F(OfficePreview, aChangedDocumentIsMadeAnewAtTheSamePlace) {
    house.givenFile("Letter.odt", "letter");
    show("Letter.odt");
    ASSERT_TRUE(untilShown());
    auto* const zoom = find<ZoomWidget>();
    QTest::keyClick(zoom, Qt::Key_PageDown);
    const double top = zoom->visibleRect().top();
    office.givenPages(7);
    house.givenFile("Letter.odt", "a longer letter");
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    EXPECT_EQ(office.runs(), 2U);
    EXPECT_EQ(zoom->visibleRect().top(), top);
    QTest::keyClick(zoom, Qt::Key_End);
    EXPECT_EQ(view().place(), "7 of 7");
    EXPECT_EQ(cachedFiles(), 2U);
}

TEST_F(OfficePreview, saysWhenNothingComesOfIt) {
    for (const char* const content : {"broken", "nothing"}) {
        house.givenFile("Bad.doc", content);
        show("Bad.doc");
        EXPECT_TRUE(untilPage("damaged, or need a password")) << content;
    }
    house.givenFile("Bad.doc", "garbage");
    show("Bad.doc");
    EXPECT_TRUE(untilPage("“Bad.doc” is damaged"));
    EXPECT_EQ(cachedFiles(), 0U) << "what cannot be shown is not kept";
    house.givenFile("Empty.doc", "");
    show("Empty.doc");
    EXPECT_TRUE(untilPage("nothing in this document"));
}

TEST_F(OfficePreview, leavesNothingBesideTheCacheAndMayBeLeft) {
    house.givenFile("Letter.odt", "letter");
    house.givenFile("Hang.odt", "hang");
    show("Letter.odt");
    ASSERT_TRUE(untilShown());
    show("Hang.odt");
    office.waitUntilItHangs();
    show("Letter.odt");
    ASSERT_TRUE(untilShown(2)) << "the one that hangs was ended";
    house.show({});
    screen.reset();
    house.navigation.reset();
    house.window.reset();
    house.application.reset(); // waits for what is left
    for (const auto& each : fs::directory_iterator(cache()))
        EXPECT_FALSE(each.path().filename().string().starts_with("work-")) << each.path();
}

TEST(OfficeConversion, hasItsTime) {
    const Office office;
    const test::TemporaryFolder folder;
    ManualClock clock;
    const auto token = std::make_shared<PreviewToken>(clock);
    OfficeConverter converter(*officeProgram(), OfficeCache(folder / "cache"), clock);
    const std::string work = converter.cache().makeWorkFolder().value();
    const Url document = Url::file(folder.write("Long.odt", "hang"));
    auto pages =
        std::async(std::launch::async, [&] { return converter.convert(document, work, *token); });
    office.waitUntilItHangs();
    clock.advance(10min);
    EXPECT_TRUE(pages.get().error().is(ErrorCode::timedOut));
}

TEST(OfficeCaches, keepWhatWasUsedLast) {
    const test::TemporaryFolder folder;
    const OfficeCache cache(folder / "cache");
    ASSERT_TRUE(cache.makeWorkFolder());
    const auto put = [&](const std::string& name, int age) {
        const std::string made = folder.write("made", "");
        fs::resize_file(made, 80'000'000); // takes no room
        fs::last_write_time(made, fs::file_time_type::clock::now() - std::chrono::hours(age));
        EXPECT_FALSE(cache.put(made, folder / ("cache/" + name)));
    };
    put("oldest.pdf", 9);
    put("used.pdf", 8);
    EXPECT_TRUE(cache.has(folder / "cache/used.pdf"));
    put("new.pdf", 1);
    EXPECT_FALSE(folder.has("cache/oldest.pdf"));
    EXPECT_TRUE(folder.has("cache/used.pdf"));
    EXPECT_TRUE(folder.has("cache/new.pdf"));
}

} // namespace
