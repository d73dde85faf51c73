#include "tests/cloud/StoreFixture.h"

#include <csignal>
#include <fstream>
#include <sqlite3.h>
#include <sys/resource.h>

using namespace platform;

namespace {

struct State : test::StoreFixture {
    void givenListed() {
        givenRemote("A/one.txt", "1");
        ASSERT_EQ(open(), std::nullopt);
        ASSERT_EQ(list(), std::nullopt);
        close();
    }
    void sql(const char* text) const {
        sqlite3* handle = nullptr;
        ASSERT_EQ(sqlite3_open(layout.database().c_str(), &handle), SQLITE_OK);
        EXPECT_EQ(sqlite3_exec(handle, text, nullptr, nullptr, nullptr), SQLITE_OK);
        sqlite3_close(handle);
    }
    std::size_t setAside() const {
        std::size_t count = 0;
        const auto entries = FileManager::entries(layout.folder);
        for (const DirectoryEntry& entry : *entries)
            count += entry.name.find("state.db.damaged-") == 0;
        return count;
    }
};

TEST_F(State, ADamagedDatabaseIsSetAsideAndMadeAnew) {
    givenListed();
    home.write("store/state.db", "this was a database once, or was it?");
    ASSERT_EQ(open(), std::nullopt);
    EXPECT_TRUE(store->notice);
    EXPECT_GE(setAside(), 1U);
    ASSERT_EQ(list(), std::nullopt);
    EXPECT_EQ(fetch("A/one.txt"), std::nullopt);
    EXPECT_EQ(local("A/one.txt"), "1");
}

TEST_F(State, DamageInsideIsFoundAfterACrash) {
    givenListed();
    sql("PRAGMA wal_checkpoint(TRUNCATE)");
    std::fstream file(layout.database(), std::ios::in | std::ios::out | std::ios::binary);
    file.seekp(4096 + 16);
    file << std::string(8000, '\x5A');
    file.close();
    home.write("store/lock", "12345"); // its holder ended without giving it back
    ASSERT_EQ(open(), std::nullopt);
    EXPECT_TRUE(store->notice);
    EXPECT_EQ(list(), std::nullopt);
    EXPECT_TRUE(isPromised("A/one.txt"));
}

TEST_F(State, ADatabaseOfALaterVersionIsRefusedAndStaysAsItIs) {
    givenListed();
    sql("UPDATE meta SET value = '99' WHERE name = 'schema'; PRAGMA wal_checkpoint(TRUNCATE)");
    const std::string before = home.read("store/state.db");
    EXPECT_TRUE(open()->is(ErrorCode::databaseFromLaterVersion));
    EXPECT_EQ(home.read("store/state.db"), before);
    EXPECT_EQ(setAside(), 0U);
}

TEST_F(State, ATreeThatIsNotTheDatabasesOwnIsRefused) {
    givenListed();
    ASSERT_EQ(rename((home / "store/Shelfroot").c_str(), (home / "aside").c_str()), 0);
    EXPECT_TRUE(open()->is(ErrorCode::databaseUnusable));
    EXPECT_FALSE(home.has("store/Shelfroot")) << "an unmounted tree is not begun anew";
    home.write("store/Shelfroot/.pelmora-root", "pelmora store 0123456789abcdef\n");
    EXPECT_TRUE(open()->is(ErrorCode::databaseUnusable));
}

TEST_F(State, ATransactionThatTheDiskRefusesLeavesNothing) {
    givenListed();
    const int code = test::inAnotherProcess([&] {
        if (open())
            return 1;
        std::signal(SIGXFSZ, SIG_IGN);
        const rlimit limit{64 * 1024, 64 * 1024};
        setrlimit(RLIMIT_FSIZE, &limit);
        const Failure failure = store->database->transaction([&]() -> Failure {
            for (int i = 0; i < 20'000; ++i)
                store->database->insertItem({store->database->newItemId(), ItemKind::file,
                                             Place{rootItem, "name " + std::to_string(i)}});
            return std::nullopt;
        });
        return failure ? 42 : 0;
    });
    EXPECT_EQ(code, 42);
    ASSERT_EQ(open(), std::nullopt);
    EXPECT_FALSE(store->notice);
    EXPECT_EQ(store->database->counts().files, 1);
}

TEST_F(State, NamesAreBytesAndAreFoundWithoutRegardToCase) {
    ASSERT_EQ(open(), std::nullopt);
    const std::vector<std::string> names{"R\xC3\x89SUM\xC3\x89.txt", "re\xCC\x81sume\xCC\x81.txt",
                                         "bad \xFF.txt", "other"};
    const Failure failure = store->database->transaction([&]() -> Failure {
        for (const std::string& name : names)
            store->database->insertItem(
                {store->database->newItemId(), ItemKind::file, Place{rootItem, name}});
        return std::nullopt;
    });
    ASSERT_EQ(failure, std::nullopt);
    for (const std::string& name : names)
        EXPECT_TRUE(store->database->itemAtPath(name)) << name;
    EXPECT_EQ(store->database->itemsNamed("R\xC3\xA9sum\xC3\xA9", 10).size(), 2U);
    EXPECT_EQ(store->database->itemsNamed("O", 10).size(), 1U);
}

TEST_F(State, ADeviceWithAnotherNumberIsTheSameTreeAfterARestart) {
    givenListed();
    sql("UPDATE local SET dev = 1; UPDATE base SET dev = 1;"
        "UPDATE meta SET value = '1' WHERE name = 'device'");
    ASSERT_EQ(open(), std::nullopt);
    const auto record = state("A/one.txt");
    const auto attributes = FileManager::attributes(sidecar("A/one.txt")->path, FollowLinks::no);
    EXPECT_EQ(record->local->identity, attributes->identity);
    EXPECT_EQ(record->base->identity, attributes->identity);
}

} // namespace
