#include "tests/cloud/StoreFixture.h"

#include <cerrno>
#include <set>
#include <sys/stat.h>
#include <unistd.h>

using namespace platform;

namespace {

struct Sync : test::StoreFixture {
    std::string remotePath(const std::string& path) const { return home / ("remote/" + path); }
    std::string remoteContent(const std::string& path) const { return home.read("remote/" + path); }
    bool remoteHas(const std::string& path) const { return home.has("remote/" + path); }
    void removeRemote(const std::string& path) {
        EXPECT_EQ(FileManager::removeItem(Url::file(remotePath(path))), std::nullopt);
    }
    void moveRemote(const std::string& from, const std::string& to) {
        EXPECT_EQ(FileManager::moveItem(Url::file(remotePath(from)), Url::file(remotePath(to))),
                  std::nullopt);
    }
    void removeLocal(const std::string& path) {
        EXPECT_EQ(FileManager::removeItem(url(path)), std::nullopt);
    }
    void moveLocal(const std::string& from, const std::string& to) {
        EXPECT_EQ(FileManager::moveItem(url(from), url(to)), std::nullopt);
    }
    /// Both sides have them, contents and all, and something besides that stays.
    void givenSynced(const std::vector<std::string>& paths) {
        for (const std::string& path : paths)
            givenRemote(path, path);
        for (int i = 0; i < 12; ++i)
            givenRemote("Rest/" + std::to_string(i), "rest");
        synced();
        for (const std::string& path : paths)
            ASSERT_EQ(fetch(path), std::nullopt);
    }
    std::vector<std::string> names(const std::string& folder) const {
        std::vector<std::string> found;
        const auto entries = FileManager::entries(folder);
        if (!entries)
            return found;
        for (const DirectoryEntry& entry : *entries)
            found.push_back(entry.name);
        std::sort(found.begin(), found.end());
        return found;
    }
    /// From now on somebody acts right before the engine's first change of that kind.
    void givenSomebodyBefore(const std::string& kind, std::function<void()> act) {
        close();
        disk = test::meddlingFileSystem(kind, std::move(act));
        ASSERT_EQ(open(), std::nullopt);
    }
    /// Notices of these folders, and the runs that follow from them.
    void noticed(const std::vector<std::string>& folders) {
        for (const std::string& folder : folders)
            synchronizer->changedOnDisk(folder);
        for (int run = 0; run < 6; ++run) {
            const Synchronizer::Report report = synchronizer->run({false, false, {}, false});
            EXPECT_EQ(report.failure, std::nullopt);
            if (!report.settlesIn)
                return;
            clock.advance(*report.settlesIn);
        }
        ADD_FAILURE() << "it never settles";
    }
    std::size_t keptContents() const { return names(layout.kept()).size(); }
};

TEST_F(Sync, WhatIsMadeHereArrivesThereAndTheOtherWayRound) {
    givenSynced({"A/one"});
    givenLocal("A/new", "new");
    givenLocal("Made/inner/deep", "deep");
    givenRemote("B/theirs", "theirs");
    synced();
    EXPECT_EQ(remoteContent("A/new"), "new");
    EXPECT_EQ(remoteContent("Made/inner/deep"), "deep");
    EXPECT_TRUE(isPromised("B/theirs"));
    EXPECT_EQ(sync().changes, 0U) << "nothing is done twice";
}

TEST_F(Sync, ANoticeIsAReasonToLookAtItsFolderAndAtWhatIsNewInIt) {
    givenSynced({"A/one", "B/two"});
    givenLocal("A/one", "edited");
    givenLocal("A/made/inner/deep", "deep");
    givenLocal("B/new", "new");
    noticed({"A"});
    EXPECT_EQ(remoteContent("A/one"), "edited");
    EXPECT_EQ(remoteContent("A/made/inner/deep"), "deep");
    EXPECT_FALSE(remoteHas("B/new")) << "nobody looked there";
    ASSERT_EQ(::symlink(layout.folder.c_str(), url("B/link").path().c_str()), 0);
    noticed({"B/link/kept", "B/went"}); // at the next folder above that is known
    EXPECT_EQ(remoteContent("B/new"), "new");
    EXPECT_FALSE(remoteHas("B/link"));
}

TEST_F(Sync, OnlyALookAtAllTellsWhatIsDeletedFromWhatIsElsewhere) {
    givenSynced({"A/file", "A/in/deep", "A/deleted", "A/replaced"});
    givenRemote("A/promise", "p");
    synced();
    const ItemId file = state("A/file")->item.id;
    moveLocal("A/file", "Rest/file");
    moveLocal("A/in", "Rest/in");
    moveLocal("A/.promise.promise", "Rest/.promise.promise");
    moveLocal("A/replaced", "Rest/replaced");
    ASSERT_EQ(FileManager::createDirectory(url("A/replaced"), false), std::nullopt);
    removeLocal("A/deleted");
    noticed({"A"}); // the other half of each move is late
    EXPECT_EQ(state("Rest/file")->item.id, file);
    EXPECT_EQ(remoteContent("Rest/file"), "A/file");
    EXPECT_EQ(remoteContent("Rest/in/deep"), "A/in/deep");
    EXPECT_EQ(remoteContent("Rest/promise"), "p");
    EXPECT_TRUE(isPromised("Rest/promise"));
    EXPECT_EQ(remoteContent("Rest/replaced"), "A/replaced");
    EXPECT_TRUE(remoteHas("A/replaced"));
    EXPECT_FALSE(remoteHas("A/deleted"));
    const auto days = names(home / "remote/.pelmora/trash");
    ASSERT_EQ(days.size(), 1U);
    EXPECT_EQ(names(home / ("remote/.pelmora/trash/" + days[0] + "/A")),
              std::vector<std::string>{"deleted"}) << "nothing was copied and deleted";
}

TEST_F(Sync, EditsTravelBothWaysAndTheReplacedContentIsKept) {
    givenSynced({"A/mine", "A/theirs"});
    givenLocal("A/mine", "edited here");
    givenRemote("A/theirs", "edited there");
    synced();
    EXPECT_EQ(remoteContent("A/mine"), "edited here");
    EXPECT_EQ(local("A/theirs"), "edited there");
    EXPECT_EQ(keptContents(), 1U);
    EXPECT_EQ(stagedFiles(), 0U);
}

TEST_F(Sync, OtherRightsOfTheAccountsFileAreNoEditOfIt) {
    givenSynced({"A/x.txt"});
    givenLocal("A/x.txt", "ours");
    ASSERT_EQ(::chmod(remotePath("A/x.txt").c_str(), 0600), 0);
    synced();
    EXPECT_EQ(remoteContent("A/x.txt"), "ours");
    EXPECT_EQ(names(layout.root() + "/A"), std::vector<std::string>{"x.txt"});
}

TEST_F(Sync, AFolderThatMovedThereAndTheOneThatTookItsNameAreTwo) {
    givenSynced({"C/one"});
    moveRemote("C", "Rest/C");
    givenRemote("C/one", "another");
    synced();
    EXPECT_EQ(local("Rest/C/one"), "C/one");
    EXPECT_TRUE(isPromised("C/one"));
}

TEST_F(Sync, OfTwoEditsTheRemoteKeepsTheNameAndBothAreOnBothSides) {
    givenSynced({"A/x.txt"});
    givenLocal("A/x.txt", "ours");
    givenRemote("A/x.txt", "theirs");
    synced();
    EXPECT_EQ(local("A/x.txt"), "theirs");
    const auto found = names(layout.root() + "/A");
    ASSERT_EQ(found.size(), 2U);
    EXPECT_TRUE(found[0].starts_with("x (conflict 2023-"));
    EXPECT_TRUE(found[0].ends_with(").txt"));
    EXPECT_EQ(remoteContent("A/" + found[0]), "ours");
}

TEST_F(Sync, MovesTravelAsMoves) {
    givenSynced({"A/one", "A/two", "C/inner/three"});
    givenRemote("A/promise", "p");
    synced();
    const ItemId item = state("A/one")->item.id;
    moveLocal("A/one", "uno");
    moveRemote("A/two", "C/zwei");
    moveLocal("C/inner", "A/moved");
    ASSERT_EQ(move("A/promise", "promise"), std::nullopt);
    synced();
    EXPECT_EQ(remoteContent("uno"), "A/one");
    EXPECT_EQ(state("uno")->item.id, item);
    EXPECT_EQ(local("C/zwei"), "A/two");
    EXPECT_EQ(remoteContent("A/moved/three"), "C/inner/three");
    EXPECT_FALSE(remoteHas("C/inner"));
    EXPECT_EQ(remoteContent("promise"), "p");
    EXPECT_TRUE(isPromised("promise"));
    EXPECT_EQ(keptContents(), 0U) << "nothing was copied and deleted";
}

TEST_F(Sync, SwappedNamesAreSwappedOnTheOtherSide) {
    givenSynced({"A/one", "A/two", "F/x", "G/y"});
    moveLocal("A/one", "A/t");
    moveLocal("A/two", "A/one");
    moveLocal("A/t", "A/two");
    moveRemote("F", "T");
    moveRemote("G", "F");
    moveRemote("T", "G");
    synced();
    EXPECT_EQ(remoteContent("A/one"), "A/two");
    EXPECT_EQ(remoteContent("A/two"), "A/one");
    EXPECT_EQ(local("G/x"), "F/x");
    EXPECT_EQ(local("F/y"), "G/y");
}

TEST_F(Sync, DeletionsTravelAndAnEditBeatsThem) {
    givenSynced({"A/one", "A/two", "A/three", "B/four"});
    removeLocal("A/one");
    removeRemote("A/two");
    removeRemote("A/three");
    givenLocal("A/three", "edited");
    removeLocal("B/four");
    givenRemote("B/four", "edited");
    synced();
    EXPECT_FALSE(remoteHas("A/one"));
    EXPECT_FALSE(local("A/two"));
    EXPECT_EQ(keptContents(), 1U);
    EXPECT_EQ(remoteContent("A/three"), "edited");
    EXPECT_TRUE(isPromised("B/four"));
}

TEST_F(Sync, AFolderDeletedThereGoesUnlessSomethingOfItWasEdited) {
    givenSynced({"A/in/one", "B/in/two", "B/in/three"});
    removeRemote("A");
    removeRemote("B");
    givenLocal("B/in/two", "edited");
    synced();
    EXPECT_FALSE(FileManager::exists(url("A").path()));
    EXPECT_EQ(remoteContent("B/in/two"), "edited");
    EXPECT_FALSE(local("B/in/three"));
}

TEST_F(Sync, WhatIsMadeInAFolderWhileItIsDeletedStays) {
    givenSynced({"A/in/one"});
    removeRemote("A/in");
    givenSomebodyBefore("remove", [this] { givenLocal("A/in/new", "new"); });
    synced();
    EXPECT_EQ(local("A/in/new"), "new");
    EXPECT_EQ(remoteContent("A/in/new"), "new");
}

TEST_F(Sync, WhatIsSavedWhileItIsDeletedStays) {
    givenSynced({"A/one"});
    removeRemote("A/one");
    givenSomebodyBefore("rename", [this] { givenLocal("A/one", "saved just now"); });
    synced();
    EXPECT_EQ(local("A/one"), "saved just now");
    EXPECT_EQ(remoteContent("A/one"), "saved just now");
}

struct MovingAway final : test::ForwardingRemote {
    MovingAway(std::unique_ptr<Remote> real, std::function<void()> first)
        : ForwardingRemote(std::move(real)), act(std::move(first)) {}
    Result<RemoteEntry> move(const std::string& from, const std::string& to,
                             const std::string& etag, CancelFlag& cancel) override {
        if (const auto first = std::exchange(act, nullptr))
            first();
        return real_->move(from, to, etag, cancel);
    }
    std::function<void()> act;
};

TEST_F(Sync, WhatLeavesAFolderThatGoesIsNotTakenForDeleted) {
    remote =
        std::make_unique<MovingAway>(std::move(remote), [this] { moveRemote("A/x", "Rest/x"); });
    givenSynced({"A/x"});
    moveLocal("A/x", "x");
    removeLocal("A");
    EXPECT_EQ(sync().failure, std::nullopt);
    synced();
    EXPECT_EQ(local("Rest/x"), "A/x");
    EXPECT_FALSE(local("x"));
    EXPECT_EQ(keptContents(), 0U);
}

TEST_F(Sync, APromiseThatCannotBeReadIsNotGone) {
    if (::geteuid() == 0)
        GTEST_SKIP() << "the superuser reads everything";
    givenSynced({});
    ASSERT_EQ(chmod(sidecar("Rest/3")->path.c_str(), 0), 0);
    synced();
    EXPECT_TRUE(remoteHas("Rest/3"));
}

TEST_F(Sync, RecordsOfYesterdayDeleteNothing) {
    givenSynced({"A/one"});
    close();
    const Result<Bytes> records = FileManager::contents(Url::file(layout.database()), SIZE_MAX);
    ASSERT_TRUE(records);
    ASSERT_EQ(open(), std::nullopt);
    givenRemote("A/two", "two");
    removeLocal("A/one");
    synced();
    givenRemote("A/one", "again");
    close();
    for (const char* part : {"-wal", "-shm"})
        EXPECT_EQ(unlink((layout.database() + part).c_str()) == 0 || errno == ENOENT, true);
    ASSERT_EQ(FileManager::writeAtomically(
                  Url::file(layout.database()),
                  {reinterpret_cast<const char*>(records->data()), records->size()}),
              std::nullopt);
    ASSERT_EQ(open(), std::nullopt);
    synced();
    EXPECT_EQ(remoteContent("A/one"), "again");
    EXPECT_TRUE(isPromised("A/one"));
    EXPECT_TRUE(isPromised("A/two"));
}

TEST_F(Sync, AStrangePromiseInThePlaceOfAnotherIsNoDeletionOfIt) {
    givenSynced({});
    const std::optional<FoundSidecar> own = sidecar("Rest/3");
    const SidecarMark strange{own->mark.store, own->mark.item + 1'000'000, {}};
    ASSERT_EQ(disk->setMark(own->path, encodedMark(strange)), std::nullopt);
    synced();
    EXPECT_EQ(remoteContent("Rest/3"), "rest");
    EXPECT_TRUE(isPromised("Rest/3"));
}

TEST_F(Sync, TwoPopulatedSidesAreMerged) {
    givenRemote("A/same", "same");
    givenRemote("A/other", "theirs");
    givenRemote("A/there", "there");
    ASSERT_EQ(open(), std::nullopt);
    givenLocal("A/same", "same");
    givenLocal("A/other", "ours");
    givenLocal("A/here", "here");
    synced();
    EXPECT_EQ(local("A/same"), "same");
    EXPECT_EQ(local("A/other"), "theirs");
    EXPECT_TRUE(isPromised("A/there"));
    EXPECT_EQ(remoteContent("A/here"), "here");
    EXPECT_EQ(names(home / "remote/A").size(), 5U);
    EXPECT_EQ(keptContents(), 0U);
}

TEST_F(Sync, WhatVanishesInMassesIsAskedAbout) {
    givenSynced({"A/one"});
    removeLocal("Rest");
    std::optional<DeletionQuestion> question = sync().question;
    ASSERT_TRUE(question);
    EXPECT_EQ(question->side, Side::local);
    EXPECT_TRUE(remoteHas("Rest/7"));
    queue->sync([&] { EXPECT_EQ(synchronizer->answer(DeletionAnswer::putBack), std::nullopt); });
    synced();
    EXPECT_TRUE(isPromised("Rest/7"));
    ASSERT_EQ(fetch("Rest/1"), std::nullopt);
    removeRemote("Rest");
    EXPECT_EQ(sync().question, (DeletionQuestion{Side::remote, 13, 11}))
        << "the folder, one with its content, and those that nobody has any more";
    EXPECT_TRUE(isPromised("Rest/7"));
    queue->sync([&] { EXPECT_EQ(synchronizer->answer(DeletionAnswer::deleteThem), std::nullopt); });
    synced();
    EXPECT_FALSE(FileManager::exists(url("Rest").path()));
}

TEST_F(Sync, AFileOfTheUsersOverAPromiseDoesNotReplaceWhatTheyHaveNotSeen) {
    givenSynced({});
    givenLocal("Rest/3", "mine");
    synced();
    EXPECT_EQ(local("Rest/3"), "rest");
    EXPECT_EQ(names(home / "remote/Rest").size(), 13U);
}

TEST_F(Sync, OneBadItemDoesNotStopTheOthers) {
    givenSynced({"A/one"});
    givenLocal("A/.x.promise", "a name that the remote refuses");
    ASSERT_EQ(symlink("/etc/hostname", url("A/link").path().c_str()), 0);
    givenLocal("A/good", "good");
    synced();
    EXPECT_EQ(remoteContent("A/good"), "good");
    EXPECT_FALSE(remoteHas("A/link"));
}

TEST_F(Sync, WhereTheNetworkCostsContentsWaitForACommand) {
    givenSynced({"A/here", "A/promise"});
    synchronizer->setMetered(true);
    givenLocal("A/new", "new");
    givenRemote("A/here", "edited there");
    givenRemote("A/listed", "is only promised");
    clock.advance(std::chrono::minutes(1));
    EXPECT_EQ(synchronizer->run({false, true, {}, true}).failure, std::nullopt);
    EXPECT_FALSE(remoteHas("A/new"));
    EXPECT_EQ(local("A/here"), "A/here");
    EXPECT_TRUE(isPromised("A/listed")) << "what costs next to nothing goes on";
    EXPECT_EQ(synchronizer->waitingForNetwork().size(), 2U);
    EXPECT_EQ(fetch("A/listed"), std::nullopt) << "the user waits for that";
    synced(); // by command
    EXPECT_EQ(remoteContent("A/new"), "new");
    EXPECT_EQ(local("A/here"), "edited there");
    EXPECT_TRUE(synchronizer->waitingForNetwork().empty());
}

TEST_F(Sync, StoppedAtAnyStepNothingIsLostAndTheNextRunEndsIt) {
    for (int step = 1;; ++step) {
        givenSynced({"A/edited", "A/theirs", "A/both", "A/gone", "A/moved"});
        close();
        const int code = test::inAnotherProcess([&] {
            disk = test::dyingFileSystem((step + 1) / 2, step % 2 == 0);
            if (open())
                return 1;
            givenLocal("A/edited", "edited here");
            givenRemote("A/theirs", "edited there");
            givenLocal("A/both", "ours");
            givenRemote("A/both", "theirs");
            removeRemote("A/gone");
            moveRemote("A/moved", "A/away");
            givenLocal("new/file", "new");
            givenRemote("arrived/file", "arrived");
            return sync().failure ? 1 : 0;
        });
        ASSERT_TRUE(code == 0 || code == test::diedOnTheWay);
        ASSERT_EQ(open(), std::nullopt);
        if (code == test::diedOnTheWay && !remoteHas("arrived/file")) { // died while it opened
            close();
            continue;
        }
        synced();
        EXPECT_EQ(remoteContent("A/edited"), "edited here") << step;
        EXPECT_EQ(local("A/theirs"), "edited there") << step;
        EXPECT_TRUE(local("A/both") == "theirs" || isPromised("A/both")) << step;
        EXPECT_EQ(local("A/away"), "A/moved") << step;
        EXPECT_FALSE(local("A/gone")) << step;
        EXPECT_EQ(remoteContent("new/file"), "new") << step;
        EXPECT_TRUE(isPromised("arrived/file")) << step;
        bool ours = false;
        for (const std::string& name : names(home / "remote/A"))
            ours = ours || remoteContent("A/" + name) == "ours";
        EXPECT_TRUE(ours) << step;
        EXPECT_EQ(stagedFiles(), 0U) << step;
        close();
        if (code == 0 || HasFailure())
            break;
        ASSERT_EQ(FileManager::removeItem(Url::file(layout.folder)), std::nullopt);
        ASSERT_EQ(FileManager::removeItem(Url::file(home / "remote")), std::nullopt);
        home.makeFolder("remote");
    }
}

} // namespace
