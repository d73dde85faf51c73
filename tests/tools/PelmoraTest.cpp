#include "platform/cloud/StoreFolder.h"
#include "platform/files/FileManager.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>
#include <sys/wait.h>

using namespace platform;
namespace fs = std::filesystem;

namespace {

/// Runs the program as a person would, in a home of its own.
struct Pelmora : ::testing::Test {
    test::TemporaryFolder home;
    std::string out;
    std::string err;

    Pelmora() { home.makeFolder("remote"); }

    int run(const std::string& arguments) {
        const std::string command = "env -i HOME=" + home.path() +
                                    " PATH=$PATH " PELMORA_PROGRAM " " + arguments + " >" +
                                    (home / "out") + " 2>" + (home / "err") + " </dev/null";
        const int status = std::system(command.c_str());
        out = home.read("out");
        err = home.read("err");
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    void givenSignedIn() {
        home.write("remote/Letters/a.txt", "content");
        home.write("remote/Letters/b.txt", "more");
        ASSERT_EQ(run("sign-in folder " + (home / "remote") + " --name Nora"), 0) << err;
    }
    std::string store() const {
        for (const auto& entry : fs::directory_iterator(home / ".local/share/pelmora"))
            return entry.path().string() + "/Shelfroot/";
        return {};
    }
    void expectOneClearLine() const {
        EXPECT_TRUE(err.starts_with("pelmora: ")) << err;
        EXPECT_EQ(err.find("terminate"), std::string::npos);
    }
};

TEST_F(Pelmora, RefusesBadInputInWords) {
    for (const std::string bad :
         {"", "dance", "sign-in", "sign-in tape /tmp", "sign-in folder /tmp --rate-limit fast",
          "sign-in folder /tmp --name", "sign-in folder /tmp --speed 3", "status now", "download",
          "ls a b", "sample", "sample ''"})
        EXPECT_EQ(run(bad), 2) << bad;
    EXPECT_EQ(run("sign-in folder /no/such/folder"), 1);
    expectOneClearLine();
    EXPECT_EQ(run("sign-in folder " + home.path()), 1) << "the stores would lie in their remote";
    for (const std::string without : {"status", "ls", "download x", "refresh", "sign-out"}) {
        EXPECT_EQ(run(without), 3) << without;
        expectOneClearLine();
    }
    home.write(".config/pelmora/account.json", "{\"kind\": ");
    EXPECT_EQ(run("status"), 3);
    expectOneClearLine();
}

TEST_F(Pelmora, HelpsWithEveryCommand) {
    EXPECT_EQ(run("--help"), 0);
    for (const std::string command :
         {"sign-in", "sign-out", "status", "ls", "refresh", "download", "tag", "tags", "sample"}) {
        EXPECT_NE(out.find(command), std::string::npos);
        const std::string overview = out;
        EXPECT_EQ(run(command + " --help"), 0);
        EXPECT_TRUE(out.starts_with("usage: pelmora " + command)) << out;
        out = overview;
    }
}

TEST_F(Pelmora, SignsInListsDownloadsAndSignsOut) {
    givenSignedIn();
    EXPECT_EQ(run("ls Letters"), 0) << err;
    EXPECT_NE(out.find("-    7 bytes"), std::string::npos) << out;
    EXPECT_EQ(run("download Letters/a.txt"), 0) << err;
    EXPECT_EQ(home.read(fs::relative(store() + "Letters/a.txt", home.path()).string()), "content");
    EXPECT_EQ(run("download Letters/none.txt Letters"), 1);
    expectOneClearLine();
    EXPECT_TRUE(FileManager::exists(store() + "Letters/b.txt")) << "the others are fetched";
    EXPECT_EQ(run("status"), 0);
    EXPECT_NE(out.find("On device: 2"), std::string::npos) << out;
    home.write("remote/Letters/new.txt", "new");
    EXPECT_EQ(run("refresh Letters"), 0) << err;
    EXPECT_EQ(run("ls Letters/new.txt"), 0) << err;
    EXPECT_EQ(run("sign-out"), 0);
    EXPECT_EQ(run("sign-out"), 3);
    EXPECT_TRUE(FileManager::exists(store() + "Letters/a.txt")) << "signing out takes nothing";
}

TEST_F(Pelmora, ARemoteThatIsAwayIsSaidAndLosesNothing) {
    givenSignedIn();
    ASSERT_EQ(run("ls"), 0);
    fs::rename(home / "remote", home / "unplugged");
    EXPECT_EQ(run("download Letters/a.txt"), 1);
    expectOneClearLine();
    EXPECT_EQ(run("ls Letters"), 0);
    EXPECT_NE(out.find("a.txt"), std::string::npos);
    fs::rename(home / "unplugged", home / "remote");
    EXPECT_EQ(run("download Letters/a.txt"), 0) << err;
}

TEST_F(Pelmora, AStoreInUseIsReadAndNotChanged) {
    givenSignedIn();
    ASSERT_EQ(run("ls"), 0);
    const Result<StoreLock> lock =
        StoreLock::acquire({Url::file(store()).deletingLastPathComponent()->path()});
    ASSERT_TRUE(lock);
    EXPECT_EQ(run("download Letters/a.txt"), 4);
    EXPECT_NE(err.find(std::to_string(getpid())), std::string::npos) << err;
    EXPECT_EQ(run("ls Letters"), 0);
    EXPECT_EQ(run("status"), 0);
}

TEST_F(Pelmora, TagsDocumentsAndKeepsTheListOfTags) {
    givenSignedIn();
    ASSERT_EQ(run("download Letters/a.txt"), 0) << err;
    for (const std::string name : {"\"Red; / 🚣\" red", "Later none", "\"Red; / 🚣\" orange"})
        ASSERT_EQ(run("tags " + name), 0) << err;
    EXPECT_EQ(run("tags"), 0);
    EXPECT_EQ(out, "orange  Red; / 🚣\nnone    Later\n");
    EXPECT_NE(home.read("remote/.pelmora/keyvalue.json").find("Later"), std::string::npos);
    EXPECT_EQ(run("tags --remove Later"), 0) << err;
    EXPECT_EQ(run("tags --remove Later"), 1);
    EXPECT_EQ(run("tag Letters/a.txt \"Red; / 🚣\" Later"), 0) << err;
    EXPECT_EQ(extendedAttribute(store() + "Letters/a.txt", "user.xdg.tags"), "Red; / 🚣,Later");
    EXPECT_EQ(run("tag Letters/a.txt"), 0) << err;
    EXPECT_EQ(extendedAttribute(store() + "Letters/a.txt", "user.xdg.tags"), std::nullopt);
    EXPECT_EQ(run("tag Letters/b.txt Later"), 1) << "a promise";
    EXPECT_EQ(run("tag Letters/none.txt"), 1);
    for (const std::string bad : {"tag", "tag Letters/a.txt one,two", "tags One", "tags One pink"})
        EXPECT_EQ(run(bad), 2) << bad;
    home.write("remote/.pelmora/keyvalue.json", R"({"KolviTagDict": {"KolviTagDictVersion": 3}})");
    EXPECT_EQ(run("tags New red"), 1);
    expectOneClearLine();
    EXPECT_EQ(home.read("remote/.pelmora/keyvalue.json").find("New"), std::string::npos);
}

TEST_F(Pelmora, TheSampleIsAStoreToTryThingsWith) {
    ASSERT_EQ(run("sample " + (home / "sample")), 0) << err;
    EXPECT_EQ(run("sample " + (home / "sample")), 1) << "it is there already";
    EXPECT_EQ(fs::file_size(home / "sample/Documents/Ship's Log.txt"), 6'291'455U);
    EXPECT_EQ(fs::file_size(home / "sample/Documents/Coast Panorama.png"), 6'291'456U);
    EXPECT_GT(fs::file_size(home / "sample/Documents/Old Laptop.img"), 100U << 20U);
    ASSERT_EQ(run("sign-in folder " + (home / "sample")), 0);
    ASSERT_EQ(run("ls Documents"), 0) << err;
    EXPECT_EQ(run("status"), 0);
    EXPECT_EQ(out.find("Left out"), std::string::npos) << out;
    EXPECT_EQ(run("download Letters Photos Documents/Names Documents/Archive Music"), 0) << err;
    const Result<Bytes> wav =
        FileManager::contents(Url::file(store() + "Music/Documents/Kitchen Tune.wav"), 4);
    ASSERT_TRUE(wav);
    EXPECT_EQ(std::string(reinterpret_cast<const char*>(wav->data()), 4), "RIFF");
}

} // namespace
