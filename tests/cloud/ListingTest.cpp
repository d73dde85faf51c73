#include "tests/cloud/StoreFixture.h"

#include <algorithm>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

using namespace platform;

namespace {

struct Listing : test::StoreFixture {
    std::size_t promisesIn(const std::string& folder) const {
        const auto entries = FileManager::entries(url(folder).path());
        return static_cast<std::size_t>(
            std::count_if(entries->begin(), entries->end(), [&](const DirectoryEntry& entry) {
                return readMark(url(folder + '/' + entry.name).path(), store->mark).has_value();
            }));
    }
};

TEST_F(Listing, BringsFoldersAndPromisesWithWhatIsKnownOfThem) {
    const std::string file = givenRemote("Letters/2015/Offer.pdf", "twelve bytes");
    ASSERT_EQ(setExtendedAttribute(Url::file(file), "user.xdg.tags", "red,work"), std::nullopt);
    ASSERT_EQ(setExtendedAttribute(Url::file(file), "user.pelmora.shared", "participant"),
              std::nullopt);
    givenRemote("Letters/.container.json", R"({"identifier": "com.example.letters"})");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_TRUE(isPromised("Letters/2015/Offer.pdf"));
    EXPECT_EQ(local("Letters/.container.json"), R"({"identifier": "com.example.letters"})");
    const auto offer = state("Letters/2015/Offer.pdf");
    ASSERT_TRUE(offer && offer->remote && offer->local && offer->base);
    EXPECT_EQ(offer->remote->size, 12U);
    EXPECT_EQ(offer->remote->tags, "red,work");
    EXPECT_EQ(offer->remote->role, SharedRole::participant);
    EXPECT_TRUE(offer->local->promise);
    EXPECT_EQ(sidecar("Letters/2015/Offer.pdf")->mark.item, offer->item.id);
}

TEST_F(Listing, TakesTenThousandNamesOfAllKinds) {
    std::vector<std::string> names{std::string(255, 'x'),
                                   std::string(247, 'y'),
                                   "caf\xC3\xA9",
                                   "cafe\xCC\x81",
                                   "Report.pdf",
                                   "report.PDF",
                                   "bad \xFF\xFE",
                                   "line\nbreak",
                                   "  blanks ",
                                   ".hidden",
                                   "%s%n.txt",
                                   "\"quoted'",
                                   "\xD7\xA9\xD7\x9C\xD7\x95\xD7\x9D.txt",
                                   "\xE6\x96\x87\xE6\x9B\xB8",
                                   "-rf"};
    std::string longest;
    while (longest.size() + 3 <= 255)
        longest += "\xE6\x96\x87"; // cut only between characters
    names.push_back(longest);
    names.push_back(std::string(240, 'z') + ".tar.gz");
    for (int i = 0; names.size() < 10'000; ++i)
        names.push_back("Scan " + std::to_string(i) + ".png");
    for (const std::string& name : names)
        givenRemote("Scans/" + name);
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_EQ(promisesIn("Scans"), names.size());
    for (std::size_t i = 0; i < 17; ++i) {
        EXPECT_TRUE(isPromised("Scans/" + names[i])) << names[i];
        EXPECT_EQ(fetch("Scans/" + names[i]), std::nullopt) << names[i];
        EXPECT_EQ(local("Scans/" + names[i]), "") << names[i];
    }
}

TEST_F(Listing, ReportsWhatCannotBeAnItemAndGoesOn) {
    givenRemote("Mixed/a.txt", "a");
    givenRemote("Mixed/.a.txt.promise", "somebody's file");
    const std::string folder = home / "remote/Mixed/";
    ASSERT_EQ(symlink("/etc/passwd", (folder + "link").c_str()), 0);
    ASSERT_EQ(mkfifo((folder + "pipe").c_str(), 0600), 0);
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_EQ(refused("Mixed"), (std::vector<std::string>{".a.txt.promise", "link", "pipe"}));
    EXPECT_TRUE(isPromised("Mixed/a.txt"));
}

TEST_F(Listing, FirstLinkOfAFilledStoreReplacesNothing) {
    givenLocal("Letters/mine.txt", "mine");
    givenLocal("Letters/both.txt", "my version");
    givenLocal("Letters/.new.txt.promise", "my own hidden file");
    givenLocal("Letters/taken", "a file where the account has a folder");
    givenRemote("Letters/both.txt", "their version");
    givenRemote("Letters/new.txt", "new");
    givenRemote("Letters/taken/inner.txt", "inner");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_EQ(local("Letters/mine.txt"), "mine");
    EXPECT_EQ(local("Letters/both.txt"), "my version");
    EXPECT_FALSE(state("Letters/both.txt")->base) << "they have agreed on nothing yet";
    EXPECT_EQ(local("Letters/.new.txt.promise"), "my own hidden file");
    EXPECT_TRUE(isPromised("Letters/new.txt")) << "under the other form of its name";
    EXPECT_EQ(refused("Letters"), std::vector<std::string>{"taken"});
    EXPECT_EQ(fetch("Letters/new.txt"), std::nullopt);
    EXPECT_EQ(local("Letters/new.txt"), "new");
    EXPECT_EQ(local("Letters/.new.txt.promise"), "my own hidden file");
}

TEST_F(Listing, StoppedAtAnyStepGoesOnWhereItWas) {
    for (const std::string name : {"A/one", "A/two", "A/B/three", "A/.container.json", "C/four"})
        givenRemote(name, "{}");
    for (int step = 1;; ++step) {
        const bool after = step % 2 == 0;
        const int code = test::inAnotherProcess([&] {
            disk = test::dyingFileSystem((step + 1) / 2, after);
            return open() || list() ? 1 : 0;
        });
        const bool died = code == test::diedOnTheWay;
        ASSERT_TRUE(died || code == 0) << "step " << step << " ended with " << code;
        ASSERT_EQ(open(), std::nullopt) << "step " << step;
        ASSERT_EQ(list(), std::nullopt) << "step " << step;
        ASSERT_EQ(refresh(), std::nullopt) << "step " << step;
        EXPECT_EQ(promisesIn("A") + promisesIn("A/B") + promisesIn("C"), 4U) << "step " << step;
        EXPECT_EQ(sidecar("A/B/three")->mark.item, state("A/B/three")->item.id);
        EXPECT_EQ(store->database->counts().promises, 4) << "step " << step;
        close();
        if (!died)
            break;
        ASSERT_EQ(FileManager::removeItem(Url::file(layout.folder)), std::nullopt);
    }
}

TEST_F(Listing, ALostDatabaseIsMadeAnewAroundThePromisesOfTheOldOne) {
    givenRemote("A/one.txt", "1");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    const ItemId before = sidecar("A/one.txt")->mark.item;
    close();
    for (const char* part : {"", "-wal", "-shm"})
        unlink((layout.database() + part).c_str());
    givenRemote("A/two.txt", "2");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_EQ(state("A/one.txt")->item.id, before);
    EXPECT_TRUE(state("A/one.txt")->local->promise);
    EXPECT_EQ(fetch("A/one.txt"), std::nullopt);
    EXPECT_EQ(local("A/one.txt"), "1");
    EXPECT_EQ(promisesIn("A"), 1U);
}

TEST_F(Listing, ARemoteThatGoesAwayIsUnknownAndNotEmpty) {
    givenRemote("A/one.txt", "1");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    ASSERT_EQ(rename((home / "remote").c_str(), (home / "unplugged").c_str()), 0);
    EXPECT_TRUE(refresh()->is(ErrorCode::serverNotAvailable));
    EXPECT_TRUE(fetch("A/one.txt")->is(ErrorCode::serverNotAvailable));
    home.makeFolder("remote"); // the empty mount point of a disk that is not there
    EXPECT_TRUE(refresh()->is(ErrorCode::serverNotAvailable));
    EXPECT_TRUE(isPromised("A/one.txt"));
    const auto record = state("A/one.txt");
    EXPECT_EQ(record->remote->generation, 1);
}

TEST_F(Listing, ADeletionOnTheRemoteIsOnlyNotedAndNeedsTwoListings) {
    givenRemote("A/gone.txt", "1");
    givenRemote("A/stays.txt", "1");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    unlink((home / "remote/A/gone.txt").c_str());
    const ItemId folder = state("A")->item.id;
    for (std::int64_t missing = 1; missing <= 2; ++missing) {
        ASSERT_EQ(refresh(), std::nullopt);
        const ScanRow scan = store->database->scan(folder, Side::remote);
        EXPECT_EQ(scan.generation - state("A/gone.txt")->remote->generation, missing);
        EXPECT_EQ(scan.generation, state("A/stays.txt")->remote->generation);
        EXPECT_TRUE(isPromised("A/gone.txt"));
    }
}

TEST_F(Listing, ARefreshBringsNewItemsAndNewVersionsOfPromises) {
    givenRemote("A/one.txt", "1");
    givenRemote("A/local.txt", "old");
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    ASSERT_EQ(fetch("A/local.txt"), std::nullopt);
    givenRemote("A/one.txt", "a longer one");
    givenRemote("A/local.txt", "new on the remote");
    givenRemote("A/deep/er/two.txt", "2");
    ASSERT_EQ(refresh(), std::nullopt);
    EXPECT_EQ(state("A/one.txt")->remote->size, 12U);
    EXPECT_EQ(state("A/one.txt")->base->etag, state("A/one.txt")->remote->etag);
    EXPECT_TRUE(isPromised("A/deep/er/two.txt"));
    EXPECT_EQ(local("A/local.txt"), "old") << "content is for the two-way engine";
    EXPECT_NE(state("A/local.txt")->base->etag, state("A/local.txt")->remote->etag);
}

TEST_F(Listing, ADiskWithoutAttributesHoldsTheMarksAsContent) {
    const std::string memory = "/dev/shm/tavrin-test-" + std::to_string(getpid());
    ASSERT_EQ(FileManager::createDirectory(Url::file(memory), true), std::nullopt);
    const bool refusesAttributes =
        setExtendedAttribute(Url::file(memory), "user.test", "x").has_value();
    givenRemote("A/one.txt", "1");
    layout.folder = memory + "/store";
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_TRUE(isPromised("A/one.txt"));
    const auto attributes = FileManager::attributes(sidecar("A/one.txt")->path, FollowLinks::no);
    EXPECT_EQ(attributes->size > 0, refusesAttributes);
    EXPECT_EQ(move("A/one.txt", "A/" + std::string(250, 'x')), std::nullopt);
    EXPECT_EQ(fetch("A/" + std::string(250, 'x')), std::nullopt);
    close();
    EXPECT_EQ(FileManager::removeItem(Url::file(memory)), std::nullopt);
}

TEST_F(Listing, AFullDiskStopsItAndLeavesNothingHalfWritten) {
    givenRemote("A/one.txt", "1");
    disk = test::fullFileSystem();
    ASSERT_EQ(open(), std::nullopt);
    EXPECT_TRUE(list()->is(ErrorCode::outOfSpace));
    close();
    disk = makeRealStoreFileSystem();
    ASSERT_EQ(open(), std::nullopt);
    EXPECT_EQ(list(), std::nullopt);
    EXPECT_TRUE(isPromised("A/one.txt"));
}

} // namespace
