#include "platform/documents/preview/ArchiveRecords.h"
#include "platform/documents/preview/ChildWork.h"
#include "platform/documents/preview/ContentsPage.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleArchives.h"

#include <QScrollBar>
#include <QtTest/QTest>

#include <gmock/gmock.h>

#include <filesystem>
#include <future>
#include <poll.h>
#include <sys/syscall.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

namespace {

const std::vector<test::PackedItem> trip = {
    {"Trip/", "", true},
    {"Trip/Plan.txt", "By train."},
    {"Trip/Photos/10.jpg", std::string(3000, 'j')},
    {"Trip/Photos/9.jpg", std::string(2000, 'j')},
    {"Read me.txt", "Hello"},
};

struct ContentsPreview : test::Preview {
    ContentsPage& page() const { return *find<ContentsPage>(); }
    ContentsList& list() const { return page().list(); }
    /// The names from the top.
    std::vector<std::string> rows() const {
        std::vector<std::string> texts;
        const QAbstractItemModel& model = *list().model();
        for (QModelIndex at = model.index(0, 0, {}); at.isValid(); at = list().indexBelow(at))
            texts.push_back(model.data(at, Qt::DisplayRole).toString().toStdString());
        return texts;
    }
    std::string spoken(int row) const {
        const QAbstractItemModel& model = *list().model();
        return model.data(model.index(row, 0, {}), Qt::AccessibleTextRole).toString().toStdString();
    }
    void tapRow(int row) {
        QTest::mouseClick(list().viewport(), Qt::LeftButton, {},
                          list().visualRect(list().model()->index(row, 0, {})).center());
    }
    bool shows(const std::string& name, const std::string& content) {
        house.givenFile(name, content);
        screen->seen.clear();
        show(name);
        return untilShown();
    }
};

TEST_F(ContentsPreview, listsArchivesOfManyKinds) {
    const std::vector<std::array<const char*, 3>> kinds = {
        {"Trip.zip", "zip", ""},      {"Trip.7z", "7zip", ""},
        {"Trip.tar", "pax", ""},      {"Trip.tar.gz", "pax", "gzip"},
        {"Trip.tgz", "pax", "gzip"},  {"Trip.tar.bz2", "pax", "bzip2"},
        {"Trip.tar.xz", "pax", "xz"}, {"Trip.tar.zst", "pax", "zstd"},
        {"Trip.cpio", "cpio", ""},    {"Trip.iso", "iso9660", ""}};
    for (const auto& [name, format, compression] : kinds) {
        EXPECT_TRUE(PlatformPreviewController::canPreview(house.url(name))) << name;
        ASSERT_TRUE(shows(name, test::archiveOf(trip, format, compression))) << name;
        EXPECT_THAT(rows(),
                    ElementsAre("Trip", "Photos", "9.jpg", "10.jpg", "Plan.txt", "Read me.txt"))
            << name;
        EXPECT_THAT(page().headText(), HasSubstr("4 items, 5 KB unpacked")) << name;
        EXPECT_THAT(spoken(1), HasSubstr("5 bytes")) << name;
        EXPECT_THAT(spoken(1), HasSubstr("2023")) << name;
    }
}

TEST_F(ContentsPreview, aFileThatIsOnlyCompressedIsTheOneThingInIt) {
    ASSERT_TRUE(shows("Story.txt.gz", test::archiveOf({{"x", "Once"}}, "raw", "gzip")));
    EXPECT_THAT(rows(), ElementsAre("Story.txt"));
}

TEST_F(ContentsPreview, whatAnArchiveCallsItsFilesLeadsNowhereAndIsShownAsText) {
    std::string deep;
    for (int i = 0; i < 400; ++i)
        deep += "d/";
    const std::string odd = "tab\there\x1b[31m\nnext \xE2\x80\xAEgpj.exe";
    ASSERT_TRUE(shows(
        "Odd.tar",
        test::archiveOf(
            {{"../../etc/passwd", "x"}, {"/absolute/./file", "x"}, {odd, "x"}, {deep + "end", "x"}},
            "gnutar")));
    const std::vector<std::string> names = rows();
    EXPECT_THAT(names, Contains(".."));
    EXPECT_THAT(names, Contains("absolute"));
    EXPECT_THAT(names, Contains("tab␉here␛[31m␊next �gpj.exe"));
    EXPECT_EQ(list().contents().tree().find("/absolute/file").has_value(), true);
    EXPECT_LT(names.size(), 80U) << "the deep path ends in one long name";
}

TEST_F(ContentsPreview, saysWhatTakesAPassword) {
    ASSERT_TRUE(
        shows("Locked.zip", test::archiveOf(trip, "zip", "", "zip:encryption=traditional")));
    EXPECT_THAT(page().headText(), HasSubstr("password"));
    EXPECT_THAT(spoken(1), HasSubstr("Encrypted"));
    EXPECT_THAT(spoken(0), Not(HasSubstr("Encrypted"))) << "a folder";
}

TEST_F(ContentsPreview, showsWhatCanBeReadOfADamagedArchiveAndSaysSo) {
    std::string bytes = test::archiveOf(trip, "pax");
    bytes.resize(bytes.size() / 2);
    ASSERT_TRUE(shows("Half.tar", bytes));
    EXPECT_THAT(page().headText(), HasSubstr("damaged"));
    EXPECT_THAT(rows(), Contains("Plan.txt"));
    for (const char* const name : {"No.zip", "No.tar", "No.tar.gz", "No.7z", "No.rar"}) {
        house.givenFile(name, "no archive at all");
        show(name);
        EXPECT_TRUE(untilPage(std::string(name) + "” is damaged"));
    }
    house.givenFile("None.zip", test::archiveOf({}, "zip"));
    show("None.zip");
    EXPECT_TRUE(untilPage("nothing in this archive"));
}

TEST_F(ContentsPreview, anArchiveChangedAnywhereIsListedOrRefusedButNoHarm) {
    const std::string whole = test::archiveOf(trip, "zip");
    for (std::size_t at = 0; at < whole.size(); at += whole.size() / 12) {
        std::string bytes = whole;
        for (std::size_t i = at; i < std::min(at + 9, bytes.size()); ++i)
            bytes[i] = '\xFF';
        house.givenFile("Changed.zip", bytes);
        screen->seen.clear();
        show("Changed.zip");
        EXPECT_TRUE(house.until([&] { return view().showsPage() || !screen->seen.empty(); }));
        show("Other.txt");
    }
}

TEST_F(ContentsPreview, foldersOpenAndCloseByTapAndByKey) {
    std::vector<test::PackedItem> items = trip;
    for (int i = 0; i < 40; ++i)
        items.push_back({"Many/" + std::to_string(i) + ".txt", "x"});
    ASSERT_TRUE(shows("Large.zip", test::archiveOf(items, "zip")));
    EXPECT_THAT(rows(), ElementsAre("Many", "Trip", "Read me.txt"));
    tapRow(1);
    EXPECT_THAT(rows(), ElementsAre("Many", "Trip", "Photos", "Plan.txt", "Read me.txt"));
    tapRow(1);
    EXPECT_THAT(rows(), ElementsAre("Many", "Trip", "Read me.txt"));
    QTest::keyClick(&list(), Qt::Key_Home);
    QTest::keyClick(&list(), Qt::Key_Right);
    EXPECT_EQ(rows().size(), 43U);
    QTest::keyClick(&list(), Qt::Key_Return);
    EXPECT_EQ(rows().size(), 3U);
}

TEST_F(ContentsPreview, aChangedArchiveIsListedAgainWithTheSameFoldersOpenAndTheSamePlace) {
    std::vector<test::PackedItem> items = trip;
    for (int i = 10; i < 60; ++i)
        items.push_back({"Many/" + std::to_string(i) + ".txt", "x"});
    ASSERT_TRUE(shows("Large.zip", test::archiveOf(items, "zip")));
    tapRow(0);
    list().verticalScrollBar()->setValue(700);
    const QModelIndex before = list().indexAt({5, 5});
    const QString top = before.data().toString();
    items.push_back({"Many/00.txt", "new, above the place"});
    house.givenFile("Large.zip", test::archiveOf(items, "zip"));
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    EXPECT_EQ(list().indexAt({5, 5}).data().toString(), top);
    EXPECT_THAT(rows(), Contains("00.txt"));
}

TEST_F(ContentsPreview, maybeLeftWhileItIsListed) {
    house.givenFile("Large.tar.gz",
                    test::archiveOf({{"zeros", std::string(40'000'000, '\0')}}, "pax", "gzip"));
    for (int i = 0; i < 4; ++i) {
        show("Large.tar.gz");
        house.show({});
    }
    screen.reset();
    house.settle();
}

TEST_F(ContentsPreview, aPackageIsListedWithWhatIsPromisedAndWithoutWhatItsLinksLeadTo) {
    for (const char* const name : {"Note.rtfd", "Trip.package", "Trip.tavrinpack"}) {
        EXPECT_TRUE(PlatformPreviewController::canPreview(house.url(name)));
        EXPECT_TRUE(PlatformPreviewController::canPreview(house.url(name).markedAsDirectory(true)));
    }
    house.givenFile("Note.rtfd/TXT.rtf", "{}");
    house.givenFile("Note.rtfd/Pictures/1.png", std::string(4000, 'p'));
    house.givenFolder("Note.rtfd/Empty");
    std::filesystem::create_symlink(house.path(""), house.path("Note.rtfd/All"));
    show("Note.rtfd");
    ASSERT_TRUE(untilShown());
    EXPECT_THAT(rows(), ElementsAre("Empty", "Pictures", "1.png", "All", "TXT.rtf"));
    EXPECT_THAT(page().headText(), HasSubstr("3 items, 4 KB"));
    EXPECT_THAT(spoken(2), HasSubstr("Link"));
}

TEST_F(ContentsPreview, aPackageThatIsNoneOrHoldsNothingSaysSo) {
    house.givenFile("File.rtfd", "a file");
    house.givenFolder("Empty.package");
    show("File.rtfd");
    EXPECT_TRUE(untilPage("damaged"));
    show("Empty.package");
    EXPECT_TRUE(untilPage("nothing in this document"));
}

TEST(ArchiveRecords, comeOutOfAnyPiecesAsTheyWentIn) {
    std::string bytes;
    ArchiveRecord record;
    record.text = "a name\nwith a line in it";
    record.size = 12;
    appendRecord(bytes, record);
    record = {ArchiveRecord::Kind::folder, true, std::nullopt, -5, std::string(5000, 'n')};
    appendRecord(bytes, record);
    ArchiveRecordReader reader;
    std::vector<ArchiveRecord> got;
    for (const char each : bytes) {
        reader.add({&each, 1});
        while (auto next = reader.next())
            got.push_back(*next);
    }
    ASSERT_EQ(got.size(), 2U);
    EXPECT_EQ(got[0].text, "a name\nwith a line in it");
    EXPECT_EQ(got[0].size, 12U);
    EXPECT_TRUE(got[1].encrypted);
    EXPECT_EQ(got[1].modified, -5);
    EXPECT_EQ(got[1].text.size(), longestRecordText);
    reader.add("q- what\n");
    EXPECT_FALSE(reader.next());
    EXPECT_TRUE(reader.failed());
}

/// A child of the shell's, watched on a thread of its own.
struct Children : ::testing::Test {
    ManualClock clock;
    std::shared_ptr<PreviewToken> token = std::make_shared<PreviewToken>(clock);
    std::string output;
    std::promise<void> spoke;

    std::future<ChildEnd> run(const std::string& script) {
        return std::async(std::launch::async, [this, script] {
            return runChild({{"sh", "-c", script}, "/"}, *token, clock, 5s,
                            [this](std::string_view bytes) {
                                const bool first = output.empty() && !bytes.empty();
                                output += bytes;
                                if (first)
                                    spoke.set_value();
                                return true;
                            });
        });
    }
};

TEST_F(Children, areHeardUntilTheirEnd) {
    EXPECT_EQ(run("echo one; echo two").get(), ChildEnd::done);
    EXPECT_EQ(output, "one\ntwo\n");
    EXPECT_EQ(run("exit 3").get(), ChildEnd::failed);
    EXPECT_EQ(runChild({{"/no/such/program"}, "/"}, *token, clock, 5s, {}), ChildEnd::absent);
}

TEST_F(Children, areEndedWithWhatTheyStartedWhenTheirTimeIsUp) {
    auto end = run("sleep 1000 & echo $!; wait");
    spoke.get_future().wait();
    const FileDescriptor started(static_cast<int>(::syscall(SYS_pidfd_open, std::stoi(output), 0)));
    ASSERT_TRUE(started);
    clock.advance(6s);
    EXPECT_EQ(end.get(), ChildEnd::outOfTime);
    pollfd over{started.get(), POLLIN, 0};
    EXPECT_EQ(::poll(&over, 1, 20'000), 1);
}

TEST_F(Children, areEndedAtOnceWhenNobodyWantsThemAnyMore) {
    auto end = run("echo $$; sleep 1000 & wait");
    spoke.get_future().wait();
    token->cancel();
    EXPECT_EQ(end.get(), ChildEnd::cancelled);
}

} // namespace
