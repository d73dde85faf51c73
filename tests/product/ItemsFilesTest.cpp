#include "items/FileUtils.h"
#include "items/VXItem.h"
#include "platform/cloud/CloudDocumentService.h"
#include "tests/files/Presenter.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>
#include <fstream>
#include <iterator>

using platform::ErrorCode;
using platform::Failure;
using tavrin::FileUtils;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::MatchesRegex;
using testing::StartsWith;

namespace test {
namespace {

struct Files : HouseTest {
    std::string contents(std::string_view relative) const {
        std::ifstream file(path(relative), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }
    Failure move(std::string_view from, std::string_view to) const {
        return FileUtils::move(url(from), url(to));
    }
    static bool isCode(const Failure& failure, ErrorCode code) {
        return failure && failure->is(code);
    }
    bool isPromised(std::string_view relative) const {
        return documents().isPromised(url(relative));
    }
    std::optional<std::string> freeNameFor(std::string_view name) const {
        return FileUtils::stringByUniquingPathInsideDirectory(path(""), name);
    }
};

TEST_F(Files, countsUpFromTwoBeforeTheLastExtension) {
    givenRemote("Cloud.pdf");
    signIn();
    for (const char* name : {"Report.pdf", "archive.tar.gz", "Notes", ".hidden", "Ends.", "a b.c d",
                             "\u0645\u0644\u0641.txt", "a.txt", "a 2.txt", "a 3.txt", "a 5.txt"})
        givenFile(name);
    std::filesystem::create_symlink("/nowhere", path("Link"));
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"Report.pdf", "Report 2.pdf"},
        {"archive.tar.gz", "archive.tar 2.gz"},
        {"Notes", "Notes 2"},
        {".hidden", ".hidden 2"},
        {"Ends.", "Ends. 2"},
        {"a b.c d", "a b 2.c d"},
        {"\u0645\u0644\u0641.txt", "\u0645\u0644\u0641 2.txt"},
        {"a.txt", "a 4.txt"},
        {"a 2.txt", "a 2 2.txt"},
        {"Cloud.pdf", "Cloud 2.pdf"},
        {"Link", "Link 2"}};
    for (const auto& [taken, free] : cases) {
        EXPECT_EQ(freeNameFor(taken), free);
        EXPECT_EQ(FileUtils::generateUniquePath(url(taken)), url(free));
    }
    EXPECT_EQ(freeNameFor("report.pdf"), std::nullopt);
    EXPECT_EQ(freeNameFor("a 4.txt"), std::nullopt);
    EXPECT_EQ(FileUtils::generateUniquePath(url("free.txt")), url("free.txt"));
}

TEST_F(Files, moveAndSayEachStep) {
    signIn();
    listenClosely();
    givenFile("a.txt", "milk");
    givenFolder("Sub");
    clearLog();
    EXPECT_EQ(move("a.txt", "Sub/b.txt"), std::nullopt);
    EXPECT_EQ(contents("Sub/b.txt"), "milk");
    EXPECT_FALSE(FileUtils::exists(url("a.txt")));
    const std::string from = url("a.txt").absoluteString() + "'";
    const std::string to = url("Sub/b.txt").absoluteString() + "'";
    EXPECT_THAT(logLines(), ElementsAre("7 Moving src1:  '" + from, "7 Moving dest1: '" + to,
                                        "7 Moving src2:  '" + from, "7 Moving dest2: '" + to,
                                        "6 Move successful"));
    clearLog();
    EXPECT_EQ(move("Sub/b.txt", "Sub/b.txt"), std::nullopt);
    EXPECT_EQ(logLines().back(), "7 Move: src and dest are the same");
    EXPECT_EQ(contents("Sub/b.txt"), "milk");
}

TEST_F(Files, moveToTheFirstFreeNumber) {
    givenRemote("Sub/far.txt", "in the cloud");
    signIn();
    listenClosely();
    for (const char* name : {"Sub/a.txt", "Sub/a 2.txt", "Sub/a 3.txt"})
        givenFile(name, name);
    givenFile("a.txt", "new");
    EXPECT_EQ(move("a.txt", "Sub/a.txt"), std::nullopt);
    EXPECT_TRUE(logged("7 Avail  dest1: '" + url("Sub/a 4.txt").absoluteString() + "'"));
    EXPECT_EQ(contents("Sub/a 4.txt"), "new");
    EXPECT_EQ(contents("Sub/a.txt"), "Sub/a.txt");
    givenFile("far.txt", "another");
    EXPECT_EQ(move("far.txt", "Sub/far.txt"), std::nullopt);
    EXPECT_EQ(contents("Sub/far 2.txt"), "another");
    EXPECT_TRUE(isPromised("Sub/far.txt")) << "what is only promised holds its name";
}

TEST_F(Files, moveAPromiseAsItIs) {
    givenRemote("far.txt");
    givenRemote("Sub/far.txt");
    signIn();
    EXPECT_EQ(move("far.txt", "Sub/far.txt"), std::nullopt);
    EXPECT_TRUE(logged("6 Move: source filename does not exist, must be a fault."));
    EXPECT_TRUE(isPromised("Sub/far 2.txt"));
    EXPECT_TRUE(isPromised("Sub/far.txt"));
    EXPECT_FALSE(FileUtils::isTaken(url("far.txt")));
    EXPECT_EQ(tavrin::VXItem(url("Sub/far 2.txt")).fileSize(), 12U);
}

TEST_F(Files, neverPutAFileInAFoldersPlaceNorAFolderInAFiles) {
    signIn();
    givenFile("file", "x");
    givenFile("Folder/inner.txt", "y");
    EXPECT_TRUE(isCode(move("file", "Folder"), ErrorCode::unsupportedOperation));
    EXPECT_TRUE(isCode(move("Folder", "file"), ErrorCode::unsupportedOperation));
    EXPECT_THAT(logLines(), ElementsAre("3 Move: must move a file to a file (dest is a dir)",
                                        "3 Move: must move a dir to a dir (dest is a file)"));
    EXPECT_EQ(contents("file"), "x");
    EXPECT_EQ(contents("Folder/inner.txt"), "y");
}

TEST_F(Files, stayWhereTheyAreWhenAMoveFails) {
    signIn();
    givenFile("a.txt", "milk");
    givenFile("Folder/inner.txt", "y");
    const std::string endless(300, 'n');
    EXPECT_TRUE(move("a.txt", "Missing/a.txt").has_value());
    EXPECT_TRUE(move("a.txt", endless).has_value());
    EXPECT_TRUE(move("Folder", "Folder/Sub").has_value());
    EXPECT_TRUE(isCode(move("none.txt", "b.txt"), ErrorCode::noSuchItem));
    EXPECT_EQ(contents("a.txt"), "milk");
    EXPECT_EQ(contents("Folder/inner.txt"), "y");
    EXPECT_THAT(logLines(), Contains(StartsWith("4 Dossa Move failed: ")).Times(4));
    EXPECT_THAT(logLines(), Contains(StartsWith("4 Move failed: ")).Times(4));
}

TEST_F(Files, takeWhoeverShowsThemAlong) {
    signIn();
    givenFile("a.txt");
    const auto presenter = Presenter::present(url("a.txt"));
    EXPECT_EQ(move("a.txt", "b.txt"), std::nullopt);
    presenter->drain();
    EXPECT_THAT(presenter->notices(), ElementsAre("moved to b.txt"));
}

TEST_F(Files, makeFoldersWithThoseAboveThem) {
    signIn();
    listenClosely();
    EXPECT_EQ(FileUtils::mkdir(url("A/B/C")), std::nullopt);
    const std::string folder = url("A/B/C").absoluteString() + "'";
    EXPECT_TRUE(FileUtils::isDir(url("A/B/C")));
    EXPECT_THAT(logLines(),
                ElementsAre("7 Creating directory: '" + folder, "6 Created directory: '" + folder,
                            "7 Coordinated Write returned (null)"));
    clearLog();
    givenFile("file", "x");
    const Failure failure = FileUtils::mkdir(url("file/Sub"));
    EXPECT_TRUE(failure.has_value());
    EXPECT_THAT(logLines().at(1), StartsWith("3 failed to create directory:'"));
    EXPECT_EQ(contents("file"), "x");
}

TEST_F(Files, goWithAllThatIsInThem) {
    givenRemote("Folder/far.txt");
    signIn();
    givenFile("Folder/Sub/inner.txt");
    EXPECT_EQ(FileUtils::remove(url("Folder")), std::nullopt);
    EXPECT_FALSE(FileUtils::exists(url("Folder")));
    EXPECT_THAT(logLines(), ElementsAre("6 Deleted item: '" + url("Folder").absoluteString() + "'",
                                        "6 Coordinated Write returned (null)"));
    clearLog();
    EXPECT_TRUE(isCode(FileUtils::remove(url("Folder")), ErrorCode::noSuchItem));
    EXPECT_THAT(logLines(), ElementsAre(StartsWith("3 failed to delete item:'"),
                                        StartsWith("6 Coordinated Write returned Pelmora")));
}

TEST_F(Files, stayWhenWhoeverShowsThemRefuses) {
    signIn();
    givenFile("a.txt", "milk");
    const auto presenter = Presenter::present(url("a.txt"));
    presenter->answer = platform::makeError(ErrorCode::itemBusy, "a.txt");
    EXPECT_TRUE(isCode(FileUtils::remove(url("a.txt")), ErrorCode::itemBusy));
    EXPECT_EQ(contents("a.txt"), "milk");
}

TEST_F(Files, leaveTheDeviceOnlyWhenTheCloudHasThem) {
    givenRemote("far.txt", "in the cloud");
    signIn();
    platform::CancelFlag cancel;
    ASSERT_EQ(platform->cloud().contents().makeLocal(url("far.txt"), cancel), std::nullopt);
    givenFile("own.txt", "mine alone");
    FileUtils::evictDocument(url("far.txt"));
    EXPECT_TRUE(isPromised("far.txt"));
    EXPECT_THAT(logLines(), IsEmpty());
    FileUtils::evictDocument(url("own.txt"));
    EXPECT_EQ(contents("own.txt"), "mine alone");
    EXPECT_THAT(logLines(), ElementsAre(StartsWith("4 Evict error: ")));
}

TEST_F(Files, tellTheirAttributesToTheLog) {
    withoutAccount();
    listenClosely();
    const std::string program = home.write("tavrin", "12345");
    FileUtils::logFileAttributes(program);
    const std::string date = "[0-9 :+-]+ \\(-?[0-9]+\\.[0-9]{6} seconds ago\\)";
    EXPECT_THAT(logLines(),
                ElementsAre(MatchesRegex("7 Date Created: " + date),
                            MatchesRegex("7 Date Modified: " + date), "7 Size: 5 bytes"));
    clearLog();
    FileUtils::logFileAttributes(home / "none");
    EXPECT_THAT(logLines(), ElementsAre(StartsWith("3 Cannot get attributes of " + home.path())));
    EXPECT_EQ(FileUtils::docDir()->lastPathComponent(), "Documents");
}

} // namespace
} // namespace test
