#include "tests/cloud/StoreFixture.h"

#include <sqlite3.h>

using namespace platform;

namespace {

struct Moves : test::StoreFixture {
    void givenListed() {
        givenRemote("A/one.txt", "1");
        givenRemote("A/two.txt", "2");
        givenRemote("B/three.txt", "3");
        ASSERT_EQ(open(), std::nullopt);
        ASSERT_EQ(list(), std::nullopt);
    }
};

TEST_F(Moves, APromiseMovesAsWhatItIsAndIsFetchedFromWhereItWas) {
    givenListed();
    const ItemId item = state("A/one.txt")->item.id;
    ASSERT_EQ(move("A/one.txt", "B/uno.txt"), std::nullopt);
    EXPECT_FALSE(sidecar("A/one.txt"));
    EXPECT_TRUE(isPromised("B/uno.txt"));
    EXPECT_EQ(state("B/uno.txt")->item.id, item);
    EXPECT_EQ(state("B/uno.txt")->base->place.name, "one.txt") << "the remote has not heard of it";
    ASSERT_EQ(fetch("B/uno.txt"), std::nullopt);
    EXPECT_EQ(local("B/uno.txt"), "1");
    ASSERT_EQ(refresh(), std::nullopt);
    EXPECT_FALSE(sidecar("A/one.txt")) << "it did not come back under its old name";
}

TEST_F(Moves, NothingIsEverReplaced) {
    givenListed();
    givenLocal("A/mine.txt", "mine");
    EXPECT_TRUE(move("A/one.txt", "A/two.txt")->is(ErrorCode::fileExists)) << "a promise is there";
    EXPECT_TRUE(move("A/one.txt", "A/mine.txt")->is(ErrorCode::fileExists));
    EXPECT_TRUE(move("A/mine.txt", "A/two.txt")->is(ErrorCode::fileExists));
    EXPECT_TRUE(move("A/none.txt", "A/x.txt")->is(ErrorCode::noSuchItem));
    EXPECT_TRUE(isPromised("A/one.txt"));
    EXPECT_EQ(local("A/mine.txt"), "mine");
}

TEST_F(Moves, LongNamesComeAndGo) {
    givenListed();
    const std::string name = std::string(251, 'n') + ".txt";
    ASSERT_EQ(move("A/one.txt", "B/" + name), std::nullopt);
    EXPECT_TRUE(isPromised("B/" + name));
    const std::string other = std::string(251, 'm') + ".txt";
    ASSERT_EQ(move("B/" + name, "B/" + other), std::nullopt);
    EXPECT_TRUE(isPromised("B/" + other));
    ASSERT_EQ(move("B/" + other, "A/short"), std::nullopt);
    EXPECT_TRUE(isPromised("A/short"));
    EXPECT_EQ(fetch("A/short"), std::nullopt);
    EXPECT_EQ(local("A/short"), "1");
    EXPECT_TRUE(move("A/two.txt", "A/" + std::string(256, 'n'))->is(ErrorCode::nameTooLong))
        << "its content could never have that name";
    EXPECT_TRUE(isPromised("A/two.txt"));
}

TEST_F(Moves, AFolderTakesItsPromisesAlongButNotOutOfTheStore) {
    givenListed();
    givenLocal("Made by hand/x.txt", "x");
    ASSERT_EQ(move("A", "Made by hand/Inner"), std::nullopt);
    EXPECT_TRUE(isPromised("Made by hand/Inner/one.txt"));
    EXPECT_EQ(state("Made by hand/Inner/one.txt")->item.id,
              sidecar("Made by hand/Inner/one.txt")->mark.item);
    EXPECT_TRUE(move("Made by hand/Inner", home / "out")->is(ErrorCode::unsupportedOperation));
    EXPECT_TRUE(move("B/three.txt", home / "three.txt")->is(ErrorCode::unsupportedOperation));
    ASSERT_EQ(fetch("Made by hand/Inner/two.txt"), std::nullopt);
    EXPECT_EQ(move("Made by hand/Inner/two.txt", home / "two.txt"), std::nullopt);
    EXPECT_EQ(home.read("two.txt"), "2");
}

TEST_F(Moves, WhatCannotBeRecordedStaysUnderItsName) {
    givenListed();
    ASSERT_EQ(fetch("A/two.txt"), std::nullopt);
    sqlite3* other = nullptr;
    ASSERT_EQ(sqlite3_open(layout.database().c_str(), &other), SQLITE_OK);
    ASSERT_EQ(sqlite3_exec(other,
                           "CREATE TRIGGER refuse BEFORE UPDATE ON item BEGIN "
                           "SELECT RAISE(ABORT, 'refused'); END",
                           nullptr, nullptr, nullptr),
              SQLITE_OK);
    sqlite3_close(other);
    EXPECT_TRUE(move("A/one.txt", "B/uno.txt"));
    EXPECT_TRUE(move("A/two.txt", "B/due.txt"));
    EXPECT_TRUE(isPromised("A/one.txt"));
    EXPECT_FALSE(isPromised("B/uno.txt"));
    EXPECT_EQ(local("A/two.txt"), "2");
    EXPECT_FALSE(local("B/due.txt"));
}

TEST_F(Moves, StoppedAtAnyStepThePromiseIsAtOneOfItsTwoPlaces) {
    const std::string name = std::string(251, 'n') + ".txt";
    for (int step = 1;; ++step) {
        givenListed();
        const ItemId item = state("A/one.txt")->item.id;
        close();
        const int code = test::inAnotherProcess([&] {
            disk = test::dyingFileSystem((step + 1) / 2, step % 2 == 0);
            return open() || move("A/one.txt", "B/" + name) ? 1 : 0;
        });
        ASSERT_TRUE(code == 0 || code == test::diedOnTheWay);
        ASSERT_EQ(open(), std::nullopt);
        const bool moved = isPromised("B/" + name);
        EXPECT_NE(moved, isPromised("A/one.txt")) << "step " << step;
        const std::string place = moved ? "B/" + name : "A/one.txt";
        EXPECT_EQ(sidecar(place)->mark.item, item) << "step " << step;
        EXPECT_EQ(fetch(place), std::nullopt) << "step " << step;
        EXPECT_EQ(local(place), "1") << "step " << step;
        close();
        if (code == 0)
            break;
        ASSERT_EQ(FileManager::removeItem(Url::file(layout.folder)), std::nullopt);
    }
}

} // namespace
