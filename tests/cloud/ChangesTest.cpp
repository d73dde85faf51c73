#include "platform/cloud/Eviction.h"
#include "platform/cloud/KeyValueCloudStore.h"
#include "platform/files/FileCoordinator.h"
#include "tests/cloud/ServiceFixture.h"
#include "tests/cloud/StoreFixture.h"

#include <thread>

using namespace platform;

namespace {

struct Changes : test::ServiceFixture {
    CancelFlag cancel;

    CloudDocumentService& documents() { return cloud->documents(); }
    bool isPromised(const std::string& path) { return documents().isPromised(url(path)); }
    std::string local(const std::string& path) {
        return home.read(url(path).path().substr(home.path().size() + 1));
    }
    void givenLocal(const std::string& path, const std::string& content) {
        home.write(url(path).path().substr(home.path().size() + 1), content);
    }
    void givenFetched(const std::string& path) {
        ASSERT_EQ(cloud->contents().makeLocal(url(path), cancel), std::nullopt);
    }
    /// "only here" marks what the remote is not known to have.
    std::vector<std::string> kept() const {
        std::vector<std::string> names;
        const std::string folder = cloud->status()->folder + "/kept";
        const auto entries = FileManager::entries(folder);
        for (const DirectoryEntry& moment : *entries)
            names.push_back(moment.name);
        std::sort(names.begin(), names.end());
        return names;
    }
};

TEST_F(Changes, AnEvictedDocumentIsAPromiseThatBringsTheSameContentBack) {
    givenRemote("A/one.txt", "content");
    givenStore();
    givenFetched("A/one.txt");
    ASSERT_EQ(documents().evictItem(url("A/one.txt")), std::nullopt);
    EXPECT_TRUE(isPromised("A/one.txt"));
    EXPECT_EQ(documents().evictItem(url("A/one.txt")), std::nullopt) << "a promise already";
    givenFetched("A/one.txt");
    EXPECT_EQ(local("A/one.txt"), "content");
}

TEST_F(Changes, NothingIsEvictedThatTheRemoteDoesNotHaveByteForByte) {
    givenRemote("A/edited.txt", "content");
    givenRemote("A/newer.txt", "content");
    givenRemote("A/gone.txt", "content");
    givenRemote("A/away.txt", "content");
    givenStore();
    for (const char* name : {"A/edited.txt", "A/newer.txt", "A/gone.txt", "A/away.txt"})
        givenFetched(name);
    givenLocal("A/edited.txt", "cOntent");
    givenLocal("A/new.txt", "mine");
    givenRemote("A/newer.txt", "CONTENT");
    ASSERT_EQ(FileManager::removeItem(Url::file(home / "remote/A/gone.txt")), std::nullopt);
    for (const char* name : {"A/edited.txt", "A/newer.txt", "A/gone.txt", "A/new.txt"}) {
        EXPECT_TRUE(documents().evictItem(url(name))->is(ErrorCode::notUploadedYet)) << name;
        EXPECT_FALSE(isPromised(name)) << name;
    }
    ASSERT_EQ(FileManager::moveItem(Url::file(home / "remote"), Url::file(home / "elsewhere")),
              std::nullopt);
    EXPECT_TRUE(documents().evictItem(url("A/away.txt"))->is(ErrorCode::serverNotAvailable));
    EXPECT_EQ(local("A/away.txt"), "content");
}

TEST_F(Changes, TheRemotesOwnBytesProveWhatNoRecordDoes) {
    givenRemote("A/one.txt", "content");
    givenStore();
    ASSERT_EQ(documents().removeItem(url("A/one.txt")), std::nullopt);
    givenRemote("A/two.txt", "content");
    givenLocal("A/two.txt", "content"); // both have it, and nobody ever compared them
    ASSERT_EQ(readAll(), std::nullopt);
    EXPECT_EQ(documents().evictItem(url("A/two.txt")), std::nullopt);
    EXPECT_TRUE(isPromised("A/two.txt"));
}

TEST_F(Changes, WhatTheUserDeletesStaysAmongTheKeptAndDoesNotComeBack) {
    givenRemote("A/sent.txt", "sent");
    givenRemote("A/promise.txt", "promise");
    givenRemote("B/inner/c.txt", "c");
    givenStore();
    givenFetched("A/sent.txt");
    givenLocal("B/inner/unsent.txt", "unsent");
    for (const char* name : {"A/sent.txt", "A/promise.txt", "B"})
        EXPECT_EQ(documents().removeItem(url(name)), std::nullopt) << name;
    EXPECT_TRUE(documents().removeItem(url("Documents"))->is(ErrorCode::unsupportedOperation));
    EXPECT_TRUE(documents().removeItem(url("A/sent.txt"))->is(ErrorCode::noSuchItem));
    ASSERT_EQ(kept().size(), 2U);
    const std::string folder = cloud->status()->folder.substr(home.path().size() + 1) + "/kept/";
    EXPECT_EQ(home.read(folder + kept()[0] + "/A/sent.txt"), "sent");
    EXPECT_TRUE(kept()[1].ends_with("only here"));
    EXPECT_EQ(home.read(folder + kept()[1] + "/B/inner/unsent.txt"), "unsent");
    ASSERT_EQ(readAll(), std::nullopt);
    for (const char* name : {"A/sent.txt", "A/promise.txt", "B/inner/c.txt"})
        EXPECT_FALSE(isPromised(name)) << name;
}

TEST_F(Changes, ALibraryGoesOnBothSidesOrNotAtAll) {
    givenRemote("Music/one.mp3", "1");
    givenRemote("Music/Album/two.mp3", "2");
    givenStore();
    givenLocal("Music/unsent.mp3", "unsent");
    const auto container = *documents().containerForItemAtURL(url("Music"));
    const Url remote = Url::file(home / "remote");
    ASSERT_EQ(FileManager::moveItem(remote, Url::file(home / "elsewhere")), std::nullopt);
    EXPECT_TRUE(documents()
                    .deleteAllContentsOnClientAndServer(*container)
                    ->is(ErrorCode::serverNotAvailable));
    EXPECT_TRUE(isPromised("Music/one.mp3"));
    ASSERT_EQ(FileManager::moveItem(Url::file(home / "elsewhere"), remote), std::nullopt);
    EXPECT_EQ(documents().deleteAllContentsOnClientAndServer(*container), std::nullopt);
    EXPECT_FALSE(home.has("remote/Music"));
    EXPECT_FALSE(FileManager::exists(url("Music").path()));
    EXPECT_EQ(kept().size(), 1U) << "what was never sent";
    const auto fixed = *documents().containerForItemAtURL(url("Documents"));
    EXPECT_TRUE(documents().deleteAllContentsOnClientAndServer(*fixed)->is(
        ErrorCode::unsupportedOperation));
}

struct Following : Changes {
    /// Lets time pass until it holds.
    void until(const std::function<bool()>& holds) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(30);
        while (!holds()) {
            ASSERT_LT(std::chrono::steady_clock::now(), deadline) << "it never came";
            clock.advance(std::chrono::milliseconds(100));
            std::this_thread::yield();
        }
    }
};

TEST_F(Following, WhatChangesOnEitherSideArrivesOnTheOtherUnasked) {
    givenRemote("A/one.txt", "1");
    givenStore();
    givenLocal("A/new.txt", "new");
    until([&] { return home.has("remote/A/new.txt"); });
    givenRemote("A/theirs.txt", "theirs");
    until([&] { return isPromised("A/theirs.txt"); });
    ASSERT_EQ(documents().moveItem(url("A/theirs.txt"), url("A/ours.txt")), std::nullopt);
    until([&] { return home.has("remote/A/ours.txt"); });
    ASSERT_EQ(documents().removeItem(url("A/one.txt")), std::nullopt);
    until([&] { return !home.has("remote/A/one.txt"); });
    ASSERT_EQ(FileManager::removeItem(Url::file(home / "remote/A/ours.txt")), std::nullopt);
    until([&] { return !isPromised("A/ours.txt"); });
}

TEST_F(Following, FoldersAreFollowedUnderTheirNewNamesAndInTheirOldOnes) {
    givenRemote("A/in/one.txt", "1");
    givenRemote("B/two.txt", "2");
    givenStore();
    ASSERT_EQ(FileManager::moveItem(url("A/in"), url("B/moved")), std::nullopt);
    until([&] { return home.has("remote/B/moved/one.txt"); });
    givenLocal("B/moved/new.txt", "new");
    until([&] { return home.has("remote/B/moved/new.txt"); });
    givenLocal("A/in/again/deep.txt", "deep");
    until([&] { return home.has("remote/A/in/again/deep.txt"); });
    givenLocal("A/in/again/deep.txt", "edited");
    until([&] { return home.read("remote/A/in/again/deep.txt") == "edited"; });
    ASSERT_EQ(FileManager::removeItem(url("B/moved/new.txt")), std::nullopt);
    until([&] { return !home.has("remote/B/moved/new.txt"); });
}

TEST_F(Following, AQuestionStandsUntilItIsAnswered) {
    for (const char* name : {"A/1", "A/2", "A/3", "B/4"})
        givenRemote(name, name);
    givenStore();
    ASSERT_EQ(FileManager::removeItem(url("A")), std::nullopt);
    ASSERT_EQ(readAll(), std::nullopt);
    ASSERT_TRUE(cloud->status()->question);
    EXPECT_NE(problem().find("vanished"), std::string::npos);
    EXPECT_TRUE(home.has("remote/A/1"));
    ASSERT_EQ(cloud->answer(DeletionAnswer::deleteThem), std::nullopt);
    ASSERT_EQ(readAll(), std::nullopt);
    EXPECT_FALSE(home.has("remote/A"));
    EXPECT_EQ(problem(), "");
}

struct Values : Changes {
    int notices = 0;
    Observation observation = notifications.observe(keyValueStoreDidChangeExternallyNotification,
                                                    [this](const auto&) { ++notices; });
    KeyValueCloudStore& values() { return cloud->keyValues(); }
    bool remoteHas(const std::string& text) {
        return home.read("remote/.pelmora/keyvalue.json").find(text) != std::string::npos;
    }
};

TEST_F(Values, TheLastWriterOfAKeyWinsAndOtherKeysStay) {
    givenRemote(".pelmora/keyvalue.json", R"({"theirs": 1, "both": "theirs"})");
    givenStore();
    runUntil([&] { return notices == 1; });
    EXPECT_EQ(values().value("theirs").integer(), 1);
    ASSERT_EQ(FileManager::moveItem(Url::file(home / "remote"), Url::file(home / "elsewhere")),
              std::nullopt);
    values().setValue("both", "ours");
    stop();
    home.write("elsewhere/.pelmora/keyvalue.json", R"({"theirs": 2, "both": "newer"})");
    start();
    EXPECT_EQ(*values().value("both").text(), "ours") << "also while the account is away";
    ASSERT_EQ(FileManager::moveItem(Url::file(home / "elsewhere"), Url::file(home / "remote")),
              std::nullopt);
    ASSERT_EQ(readAll(), std::nullopt);
    runUntil([&] { return notices == 2; });
    EXPECT_EQ(values().value("theirs").integer(), 2);
    EXPECT_TRUE(remoteHas("ours"));
    values().setValue("theirs", {});
    EXPECT_TRUE(values().value("theirs").isNone());
}

TEST_F(Values, WhatAnotherDeviceSetsIsTold) {
    givenStore();
    values().setValue("ours", 1);
    EXPECT_EQ(notices, 0);
    stop(); // waits for what is on its way
    start();
    ASSERT_EQ(readAll(), std::nullopt);
    stop();
    start();
    ASSERT_EQ(readAll(), std::nullopt);
    ASSERT_EQ(values().value("ours").integer(), 1);
    home.write("remote/.pelmora/keyvalue.json", R"({"ours": 1, "theirs": "new"})");
    ASSERT_EQ(readAll(), std::nullopt);
    runUntil([&] { return notices == 1; });
    EXPECT_EQ(*values().value("theirs").text(), "new");
}

struct Evictions : test::StoreFixture {};

TEST_F(Evictions, StoppedAtAnyStepTheDocumentOrItsPromiseIsThere) {
    for (int step = 1;; ++step) {
        givenRemote("A/one.txt", "content");
        ASSERT_EQ(open(), std::nullopt);
        ASSERT_EQ(list(), std::nullopt);
        ASSERT_EQ(fetch("A/one.txt"), std::nullopt);
        close();
        const int code = test::inAnotherProcess([&] {
            disk = test::dyingFileSystem((step + 1) / 2, step % 2 == 0);
            return open() || Eviction(*context, cancel).evict("A/one.txt") ? 1 : 0;
        });
        ASSERT_TRUE(code == 0 || code == test::diedOnTheWay);
        ASSERT_EQ(open(), std::nullopt);
        EXPECT_NE(local("A/one.txt").has_value(), sidecar("A/one.txt").has_value()) << step;
        EXPECT_EQ(state("A/one.txt")->local->promise, sidecar("A/one.txt").has_value()) << step;
        EXPECT_EQ(stagedFiles(), 0U) << step;
        EXPECT_EQ(fetch("A/one.txt"), std::nullopt) << step;
        EXPECT_EQ(local("A/one.txt"), "content") << step;
        close();
        if (code == 0)
            break;
        ASSERT_EQ(FileManager::removeItem(Url::file(layout.folder)), std::nullopt);
    }
}

} // namespace
