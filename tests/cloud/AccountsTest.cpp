// Several accounts, their passwords, and taking one off the device.

#include "platform/cloud/AccountBook.h"
#include "platform/cloud/SignIn.h"
#include "platform/cloud/StoreTakingAway.h"
#include "platform/system/SecretStore.h"
#include "tests/cloud/StoreFixture.h"

#include <gmock/gmock.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace platform;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

namespace {

struct Accounts : ::testing::Test {
    test::TemporaryFolder home;
    Folders folders{home.path(),    home / "config", home / "data",
                    home / "state", home / "cache",  home / "run"};

    static AccountRecord account(const std::string& place, char identity) {
        AccountRecord record;
        record.kind = folderAccountKind;
        record.address = "/" + place;
        record.name = place;
        record.identity = Bytes(16, static_cast<std::byte>(identity));
        return record;
    }
    std::vector<std::string> names() const {
        std::vector<std::string> found;
        for (const AccountRecord& each : storedAccounts(folders))
            found.push_back(each.name);
        return found;
    }
    mode_t modeOf(const std::string& file) const {
        struct stat status {};
        EXPECT_EQ(::stat(file.c_str(), &status), 0);
        return status.st_mode & 07777;
    }
};

TEST_F(Accounts, AreAllKeptAndOneIsActive) {
    // One that was signed in before there was a list.
    ASSERT_EQ(writeAccount(folders, account("old", 1)), std::nullopt);
    ASSERT_EQ(rememberAccount(folders, account("new", 2)), std::nullopt);
    AccountRecord twin = account("twin", 3);
    twin.name = "new";
    ASSERT_EQ(rememberAccount(folders, twin), std::nullopt);
    EXPECT_THAT(names(), ElementsAre("old", "new", "new 2"));
    EXPECT_EQ(readAccount(folders).account->name, "new 2");

    ASSERT_EQ(useAccount(folders, account("old", 1).identity), std::nullopt);
    EXPECT_EQ(readAccount(folders).account->address, "/old");
    ASSERT_EQ(rememberAccount(folders, account("new", 9)), std::nullopt); // signed in to it anew
    EXPECT_THAT(names(), ElementsAre("old", "new", "new 2"));
    EXPECT_TRUE(useAccount(folders, account("new", 2).identity)->is(ErrorCode::noAccount));

    ASSERT_EQ(forgetAccount(folders, account("new", 9).identity), std::nullopt);
    EXPECT_TRUE(readAccount(folders).missing) << "nobody slips into its place";
    EXPECT_THAT(names(), ElementsAre("old", "new 2"));
}

TEST_F(Accounts, WhatALaterVersionWroteStaysInTheList) {
    home.write("config/pelmora/accounts.json",
               R"({"accounts": [{"kind": "tape", "address": "x", "reel": 7}, 5]})");
    ASSERT_EQ(rememberAccount(folders, account("new", 2)), std::nullopt);
    EXPECT_NE(home.read("config/pelmora/accounts.json").find("\"reel\": 7"), std::string::npos);
    home.write("config/pelmora/accounts.json", "{\"acc");
    EXPECT_THAT(names(), ElementsAre("new"));
    ASSERT_EQ(rememberAccount(folders, account("other", 3)), std::nullopt);
    EXPECT_THAT(names(), ElementsAre("new", "other"));
}

TEST_F(Accounts, APasswordInTheClearIsKnownBeforeItIsSent) {
    const auto clear = [](const char* address) {
        return sendsInTheClear({std::string(webDavAccountKind), address});
    };
    EXPECT_TRUE(clear("http://example.org/dav/"));
    EXPECT_TRUE(clear(" http://localhost.example.org/"));
    for (const char* const good : {"https://example.org", "example.org/dav",
                                   "http://127.0.0.1:8080/", "http://localhost/x", "http://[::1]"})
        EXPECT_FALSE(clear(good)) << good;
}

TEST_F(Accounts, ThePasswordFileIsForItsOwnerAlone) {
    ::setenv("DBUS_SESSION_BUS_ADDRESS", "", 1); // whoever runs this may have a keyring
    const auto secrets = makeSecretStore(folders);
    const std::string file = secretFile(folders);
    const std::string odd = "p\"\xFF\n\xC3\xA4";
    ASSERT_EQ(secrets->store("a", "label", odd, SecretPlace::file), std::nullopt);
    ASSERT_EQ(secrets->store("b", "label", "two", SecretPlace::file), std::nullopt);
    EXPECT_EQ(modeOf(file), 0600U);
    ASSERT_EQ(::chmod(file.c_str(), 0644), 0);
    EXPECT_EQ(*secrets->lookUp("a"), odd);
    EXPECT_EQ(modeOf(file), 0600U) << "closed again before it was read";
    EXPECT_EQ(*secrets->lookUp("c"), std::nullopt);
    ASSERT_EQ(secrets->remove("a"), std::nullopt);
    EXPECT_EQ(*secrets->lookUp("a"), std::nullopt);
    EXPECT_EQ(*secrets->lookUp("b"), "two");
    home.write("config/pelmora/secrets.json", "{\"b\": ");
    const auto damaged = secrets->lookUp("b");
    ASSERT_FALSE(damaged);
    EXPECT_NE(damaged.error().localizedDescription->find(file), std::string::npos);
    EXPECT_NE(secrets->store("c", "label", "x", SecretPlace::file), std::nullopt)
        << "what may be mended is not replaced";
}

struct TakenAway : test::StoreFixture {
    std::vector<std::string> unsent() {
        const auto found = unsentDocuments(layout, *disk, cancel);
        EXPECT_TRUE(found);
        return found ? *found : std::vector<std::string>();
    }
    std::vector<std::string> takeAway() {
        close();
        const auto left = takeStoreAway(layout, *disk, clock, cancel);
        EXPECT_TRUE(left) << left.error().localizedDescription.value_or("");
        return left ? *left : std::vector<std::string>();
    }
};

TEST_F(TakenAway, TheStoreGoesWhenTheAccountHasAll) {
    givenRemote("Notes/a.txt", "a");
    givenRemote("Notes/promised.txt", "p");
    synced();
    ASSERT_EQ(fetch("Notes/a.txt"), std::nullopt);
    givenLocal("Notes/mine.txt", "mine");
    EXPECT_THAT(unsent(), ElementsAre("Notes/mine.txt"));
    synced();
    EXPECT_THAT(unsent(), IsEmpty());
    EXPECT_THAT(takeAway(), IsEmpty());
    EXPECT_FALSE(home.has("store"));
    EXPECT_EQ(home.read("remote/Notes/a.txt"), "a");
    EXPECT_EQ(home.read("remote/Notes/mine.txt"), "mine");
}

TEST_F(TakenAway, WhatTheAccountDoesNotHaveStaysAndComesBackWithIt) {
    for (const char* const name : {"sent.txt", "edited.txt", "gone there.txt"})
        givenRemote(std::string("Notes/") + name, "as it was");
    synced();
    for (const char* const name : {"sent.txt", "edited.txt", "gone there.txt"})
        ASSERT_EQ(fetch(std::string("Notes/") + name), std::nullopt);
    givenLocal("Notes/edited.txt", "as it is");
    givenLocal("Notes/new.txt", "new");
    ASSERT_EQ(::symlink("/etc/hosts", (layout.root() + "/Notes/link").c_str()), 0);
    ASSERT_EQ(FileManager::removeItem(Url::file(home / "remote/Notes/gone there.txt")),
              std::nullopt);
    ASSERT_EQ(refresh(), std::nullopt);
    const auto stays = UnorderedElementsAre("Notes/edited.txt", "Notes/new.txt", "Notes/link",
                                            "Notes/gone there.txt");
    EXPECT_THAT(unsent(), stays);
    EXPECT_THAT(takeAway(), stays);
    EXPECT_EQ(local("Notes/edited.txt"), "as it is");
    EXPECT_EQ(local("Notes/sent.txt"), std::nullopt);

    synced(); // signed in again: nothing counts as deleted here, and all that stayed goes up
    EXPECT_EQ(home.read("remote/Notes/sent.txt"), "as it was");
    EXPECT_EQ(home.read("remote/Notes/edited.txt"), "as it was");
    EXPECT_EQ(home.read("remote/Notes/new.txt"), "new");
    EXPECT_EQ(home.read("remote/Notes/gone there.txt"), "as it was");
}

TEST_F(TakenAway, AnEditThatKeepsSizeAndDateIsSeen) {
    givenRemote("Notes/a.txt", "one");
    synced();
    ASSERT_EQ(fetch("Notes/a.txt"), std::nullopt);
    const std::string path = layout.root() + "/Notes/a.txt";
    struct stat before {};
    ASSERT_EQ(::stat(path.c_str(), &before), 0);
    givenLocal("Notes/a.txt", "two");
    const timespec times[] = {before.st_atim, before.st_mtim};
    ASSERT_EQ(::utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
    EXPECT_THAT(unsent(), ElementsAre("Notes/a.txt"));
    EXPECT_THAT(takeAway(), ElementsAre("Notes/a.txt"));
}

} // namespace
