#include "platform/base/Describe.h"
#include "platform/base/ManualClock.h"
#include "platform/base/Runtime.h"
#include "platform/files/FileManager.h"

#include "tests/files/FakeProvider.h"
#include "tests/files/Presenter.h"
#include "tests/files/Worker.h"
#include "tests/support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace fs = std::filesystem;
using platform::ErrorCode;
using platform::Failure;
using platform::FileCoordinator;
using platform::FileManager;
using platform::Url;
using platform::WritingOptions;
using test::Presenter;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

struct Presenting : ::testing::Test {
    test::TemporaryFolder folder;
    std::vector<std::shared_ptr<Presenter>> presenters;

    Url at(std::string_view name) const { return Url::file(folder / name); }
    std::shared_ptr<Presenter> present(std::string_view name) {
        return presenters.emplace_back(Presenter::present(at(name)));
    }
    void write(std::string_view name, std::string_view content,
               const std::shared_ptr<Presenter>& own = {}) const {
        FileCoordinator coordinator(own);
        (void)coordinator.coordinateWriting(at(name), WritingOptions::none, [&](const Url& url) {
            (void)FileManager::writeAtomically(url, content);
        });
    }
    void move(std::string_view from, std::string_view to,
              const std::shared_ptr<Presenter>& own = {}) const {
        FileCoordinator mover(own);
        (void)mover.coordinateWriting(at(from), WritingOptions::forMoving, at(to),
                                      WritingOptions::forReplacing,
                                      [&](const Url& source, const Url& target) {
                                          mover.itemAtURLWillMoveToURL(source, target);
                                          if (!FileManager::moveItem(source, target))
                                              mover.itemAtURLDidMoveToURL(source, target);
                                      });
    }
    Failure remove(std::string_view name, const std::shared_ptr<Presenter>& own = {}) const {
        FileCoordinator coordinator(own);
        Failure failure;
        Failure refused = coordinator.coordinateWriting(
            at(name), WritingOptions::forDeleting,
            [&](const Url& url) { failure = FileManager::removeItem(url); });
        return refused ? refused : failure;
    }
    /// Returns when the notices of all that happened so far have been heard: another program's
    /// change of a file beside them comes after them.
    void settle() {
        folder.write("settle/marker", "1");
        const auto marker = Presenter::present(at("settle/marker"));
        for (const char* name : {"settle/marker", "sub/marker", "marker"})
            if (fs::exists((folder / name) + "/.."))
                folder.write(name, "2");
        folder.write("settle/marker", "3");
        ASSERT_TRUE(marker->waitForNotices(1));
        for (const auto& presenter : presenters)
            presenter->drain();
    }
};

TEST_F(Presenting, ACoordinatedChangeIsToldOnceToEverybodyButItsMaker) {
    folder.write("sub/a", "1");
    const auto own = present("sub/a");
    const auto other = present("sub/a");
    const auto parent = present("sub");
    const auto top = present("");
    const auto sibling = present("sub/b");
    write("sub/a", "2", own);
    write("sub/a", "3", own);
    settle();
    EXPECT_THAT(own->notices(), IsEmpty());
    EXPECT_THAT(other->notices(), ElementsAre("changed", "changed"));
    EXPECT_THAT(sibling->notices(), IsEmpty());
    EXPECT_GE(parent->notices().size(), 2U);
    EXPECT_GE(top->notices().size(), 2U);
}

TEST_F(Presenting, AnotherProgramsChangesAreHeard) {
    folder.write("a", "1");
    const auto presenter = present("a");
    folder.write("a", "longer");
    ASSERT_TRUE(presenter->waitForNotices(1));
    ASSERT_EQ(platform::setExtendedAttribute(at("a"), "user.xdg.tags", "Red"), std::nullopt);
    ASSERT_TRUE(presenter->waitForNotices(2)) << "tags are attributes";
    EXPECT_EQ(presenter->notices().front(), "changed");
}

TEST_F(Presenting, SavingByANewFileInTheOldOnesPlaceIsAChange) {
    folder.write("a", "1");
    const auto presenter = present("a");
    fs::rename(folder / "a", folder / "a~");
    folder.write("a", "2");
    ASSERT_TRUE(presenter->waitForNotices(1));
    fs::remove(folder / "a");
    folder.write("a.new", "3");
    fs::rename(folder / "a.new", folder / "a");
    ASSERT_TRUE(presenter->waitForNotices(2));
    const auto notices = presenter->notices();
    EXPECT_EQ(std::count(notices.begin(), notices.end(), "changed"),
              static_cast<std::ptrdiff_t>(notices.size()));
}

TEST_F(Presenting, AnotherProgramsMoveIsFollowedAnywhere) {
    folder.write("a", "1");
    folder.makeFolder("far/away");
    const auto presenter = present("a");
    fs::rename(folder / "a", folder / "b");
    ASSERT_TRUE(presenter->waitForNotices(1));
    fs::rename(folder / "b", folder / "far/away/c"); // a folder that nobody watches
    ASSERT_TRUE(presenter->waitForNotices(2));
    fs::rename(folder / "far", folder / "further"); // a folder above it
    ASSERT_TRUE(presenter->waitForNotices(3));
    folder.write("further/away/c", "changed");
    ASSERT_TRUE(presenter->waitForNotices(4));
    auto notices = presenter->notices();
    notices.resize(4); // the last change may be told in two parts
    EXPECT_THAT(notices, ElementsAre("moved to b", "moved to c", "moved to c", "changed"));
}

TEST_F(Presenting, AnotherProgramsDeletionIsHeardAndSoIsTheTrash) {
    folder.write("sub/a", "1");
    folder.write("b", "1");
    folder.makeFolder(".Trash-1000/files");
    const auto deleted = present("sub/a");
    const auto thrownAway = present("b");
    fs::remove_all(folder / "sub");
    fs::rename(folder / "b", folder / ".Trash-1000/files/b");
    ASSERT_TRUE(deleted->waitForNotices(1));
    ASSERT_TRUE(thrownAway->waitForNotices(1));
    EXPECT_THAT(deleted->notices(), ElementsAre("deletion"));
    EXPECT_THAT(thrownAway->notices(), ElementsAre("deletion"));
    folder.write("sub/a", "back");
    ASSERT_TRUE(deleted->waitForNotices(2)) << "its folders are watched for";
}

TEST_F(Presenting, APresentedFolderHearsOfItsEntries) {
    folder.write("doc.rtfd/text", "1");
    folder.write("doc.rtfd/picture", "1");
    const auto presenter = present("doc.rtfd");
    folder.write("doc.rtfd/text", "2");
    ASSERT_TRUE(presenter->waitForNotices(1));
    EXPECT_EQ(presenter->notices().front(), "changed");
    settle();
    const std::size_t heard = presenter->notices().size();
    fs::remove(folder / "doc.rtfd/picture");
    ASSERT_TRUE(presenter->waitForNotices(heard + 1));
    EXPECT_EQ(presenter->notices().back(), "deletion of part picture");
}

TEST_F(Presenting, WhatAWriteDoesInsideAPresentedFolderIsToldOnce) {
    folder.write("doc.rtfd/text", "1");
    folder.write("doc.rtfd/old", "1");
    const auto presenter = present("doc.rtfd");
    FileCoordinator coordinator;
    (void)coordinator.coordinateWriting(at("doc.rtfd"), WritingOptions::none, [&](const Url&) {
        folder.write("doc.rtfd/text", "2");
        folder.write("doc.rtfd/new", "2");
        fs::remove(folder / "doc.rtfd/old");
    });
    write("doc.rtfd/text", "3");
    EXPECT_EQ(remove("doc.rtfd/new"), std::nullopt);
    settle();
    EXPECT_THAT(presenter->notices(), ElementsAre("changed", "changed", "deletion of part new"));
}

TEST_F(Presenting, AMoveIsToldOnceWithTheNewPlaceAlsoBelowAMovedFolder) {
    folder.write("sub/a", "1");
    const auto inside = present("sub/a");
    const auto whole = present("sub");
    const auto own = present("sub/a");
    move("sub", "renamed", own);
    settle();
    EXPECT_THAT(inside->notices(), ElementsAre("moved to a"));
    EXPECT_THAT(whole->notices(), ElementsAre("moved to renamed"));
    EXPECT_THAT(own->notices(), IsEmpty());
    folder.write("renamed/a", "2"); // at once, though nobody has taken in the new place yet
    ASSERT_TRUE(inside->waitForNotices(2));
    ASSERT_TRUE(own->waitForNotices(1));
    EXPECT_EQ(inside->notices().back(), "changed");
}

TEST_F(Presenting, AMoveThatFailsIsNotTold) {
    folder.write("a", "1");
    folder.write("taken", "1");
    const auto presenter = present("a");
    move("a", "taken");
    settle();
    EXPECT_THAT(presenter->notices(), IsEmpty());
}

TEST_F(Presenting, ADeletionAsksPresentersOfTheItemItsPartsAndItsFolders) {
    folder.write("sub/doc/part", "1");
    const auto item = present("sub/doc");
    const auto part = present("sub/doc/part");
    const auto parent = present("sub");
    item->duringNotice = part->duringNotice =
        parent->duringNotice = [&] { EXPECT_TRUE(folder.has("sub/doc/part")) << "not yet"; };
    EXPECT_EQ(remove("sub/doc"), std::nullopt);
    EXPECT_FALSE(folder.has("sub/doc"));
    item->duringNotice = part->duringNotice = parent->duringNotice = nullptr;
    settle();
    EXPECT_THAT(item->notices(), ElementsAre("deletion"));
    EXPECT_THAT(part->notices(), ElementsAre("deletion"));
    EXPECT_THAT(parent->notices(), ElementsAre("deletion of part doc"));
}

TEST_F(Presenting, APresenterMayRefuseADeletion) {
    folder.write("a", "1");
    const auto presenter = present("a");
    presenter->answer = makeError(ErrorCode::itemBusy, "a");
    const Failure failure = remove("a");
    ASSERT_TRUE(failure);
    EXPECT_TRUE(failure->is(ErrorCode::itemBusy));
    EXPECT_TRUE(folder.has("a"));
}

TEST_F(Presenting, EvictionIsAChangeNotADeletion) {
    test::FakeProvider provider;
    folder.write("a", "1");
    const auto presenter = present("a");
    provider.promise(at("a"));
    fs::remove(folder / "a");
    ASSERT_TRUE(presenter->waitForNotices(1));
    provider.forget(at("a"));
    folder.write("a", "downloaded");
    ASSERT_TRUE(presenter->waitForNotices(2));
    EXPECT_EQ(presenter->notices()[0] + presenter->notices()[1], "changedchanged");
}

TEST_F(Presenting, ANewAnswerForTheUrlMovesTheRegistration) {
    folder.write("a", "1");
    folder.write("b", "1");
    const auto presenter = present("a");
    presenter->setUrl(at("b"));
    write("a", "2");
    write("b", "2");
    ASSERT_TRUE(presenter->waitForNotices(1));
    folder.write("b", "another program");
    ASSERT_TRUE(presenter->waitForNotices(2));
    settle();
    const std::size_t heard = presenter->notices().size();
    presenter->setUrl(std::nullopt);
    write("b", "3");
    settle();
    EXPECT_EQ(presenter->notices().size(), heard);
}

TEST_F(Presenting, ARemovedPresenterHearsNothingAlsoWhenRemovedWithinItsNotice) {
    folder.write("a", "1");
    const auto presenter = present("a");
    presenter->duringNotice = [&] { FileCoordinator::removeFilePresenter(presenter); };
    write("a", "2");
    ASSERT_TRUE(presenter->waitForNotices(1));
    write("a", "3");
    EXPECT_EQ(remove("a"), std::nullopt);
    settle();
    EXPECT_THAT(presenter->notices(), ElementsAre("changed"));
    presenter->duringNotice = nullptr;
}

TEST_F(Presenting, ANoticeMayCoordinateWhileTheNextWriteWaitsForIt) {
    folder.write("a", "1");
    const auto presenter = present("a");
    presenter->duringNotice = [&] {
        FileCoordinator plain;
        EXPECT_EQ(plain.coordinateReading(at("a"), {}, [](const Url&) {}), std::nullopt);
        FileCoordinator own(presenter);
        EXPECT_EQ(own.coordinateWriting(at("a"), WritingOptions::forReplacing, [](const Url&) {}),
                  std::nullopt);
    };
    write("a", "2");
    EXPECT_EQ(remove("a"), std::nullopt);
    EXPECT_THAT(presenter->notices(), ElementsAre("changed", "deletion"));
    presenter->duringNotice = nullptr;
}

/// With time that stands still until it is moved, and a main queue.
struct PresentingInTime : Presenting {
    platform::ManualClock clock;
    platform::MainQueue main{clock};
    platform::NotificationCenter notifications;
    platform::Runtime runtime{clock, main, notifications, {}};

    PresentingInTime() { platform::Runtime::install(&runtime); }
    ~PresentingInTime() override {
        presenters.clear();
        FileCoordinator::waitUntilIdle();
        platform::Runtime::install(nullptr);
    }
};

TEST_F(PresentingInTime, ADeletionWaitsForTheAnswerButNotForEver) {
    folder.write("a", "1");
    folder.write("b", "1");
    const auto slow = present("a");
    const auto silent = present("b");
    slow->answer = silent->answer = std::nullopt;
    test::Worker first([&] { EXPECT_EQ(remove("a"), std::nullopt); });
    test::Worker second([&] { EXPECT_EQ(remove("b"), std::nullopt); });
    ASSERT_TRUE(slow->waitForNotices(1));
    ASSERT_TRUE(silent->waitForNotices(1));
    slow->drain();
    EXPECT_TRUE(folder.has("a"));
    slow->unanswered.front()(std::nullopt);
    first.join();
    EXPECT_FALSE(folder.has("a"));
    EXPECT_TRUE(folder.has("b"));
    clock.advance(std::chrono::seconds(5));
    second.join();
    EXPECT_FALSE(folder.has("b"));
}

TEST_F(PresentingInTime, ADroppedHandlerAndAPresenterThatGoesAwayAgree) {
    folder.write("a", "1");
    const auto dropping = present("a");
    dropping->answer = std::nullopt;
    dropping->duringNotice = [&] { FileCoordinator::removeFilePresenter(dropping); };
    test::Worker worker([&] { EXPECT_EQ(remove("a"), std::nullopt); });
    ASSERT_TRUE(dropping->waitForNotices(1));
    dropping->drain();
    dropping->unanswered.clear();
    worker.join();
    EXPECT_FALSE(folder.has("a"));
    dropping->duringNotice = nullptr;
}

TEST_F(PresentingInTime, ACancellationEndsTheWaitForAnAnswer) {
    folder.write("a", "1");
    const auto silent = present("a");
    silent->answer = std::nullopt;
    FileCoordinator coordinator;
    Failure failure;
    test::Worker worker([&] {
        failure = coordinator.coordinateWriting(at("a"), WritingOptions::forDeleting,
                                                [](const Url&) { FAIL(); });
    });
    ASSERT_TRUE(silent->waitForNotices(1));
    coordinator.cancel();
    worker.join();
    ASSERT_TRUE(failure);
    EXPECT_TRUE(failure->is(ErrorCode::userCancelled));
}

TEST_F(PresentingInTime, TheMainThreadDoesNotWaitForItsOwnQueue) {
    folder.write("a", "1");
    const auto presenter = present("a");
    // Not owned: the queue is the fixture's.
    presenter->useQueue({std::shared_ptr<void>(), static_cast<platform::Executor*>(&main)});
    EXPECT_EQ(remove("a"), std::nullopt);
    EXPECT_THAT(presenter->notices(), ElementsAre("deletion"));
}

} // namespace
