#include "tests/cloud/ServiceFixture.h"

#include "platform/files/FileManager.h"

#include <set>
#include <sys/stat.h>

using namespace platform;

namespace {

struct Account : test::ServiceFixture {
    int changes = 0;
    Observation observation =
        notifications.observe(cloudIdentityDidChangeNotification, [this](const Notification&) {
            EXPECT_TRUE(main.isMainThread());
            ++changes;
        });
    std::string problemWith(const std::string& text) {
        givenAccountFile(text);
        start();
        EXPECT_FALSE(cloud->accounts().identityToken());
        EXPECT_FALSE(cloud->documents().shelfroot());
        return problem();
    }
};

TEST_F(Account, EachFaultOfTheFileHasWordsOfItsOwn) {
    start();
    std::set<std::string> problems{problem()};
    const std::string identity = R"("identity": "00112233445566778899aabbccddeeff")";
    problems.insert(problemWith(R"({"kind": "folder", "addr)"));
    problems.insert(problemWith(R"([1, 2])")); // damaged as well: the same words
    problems.insert(problemWith(R"({"kind": "tape", "address": "/", )" + identity + "}"));
    problems.insert(problemWith(R"({"kind": "folder", "address": "a/b", )" + identity + "}"));
    problems.insert(problemWith(R"({"kind": "folder", "address": "/tmp"})"));
    problems.insert(problemWith(R"({"kind": "webdav", "address": "ftp://x", )" + identity + "}"));
    problems.insert(
        problemWith(R"({"kind": "webdav", "address": "https://u:p@x", )" + identity + "}"));
    EXPECT_EQ(problems.size(), 7U);
    EXPECT_FALSE(problems.contains(""));
}

TEST_F(Account, ARemoteThatIsGoneIsAProblemAndTheStoreStaysReadable) {
    givenRemote("Letters/a.txt", "a");
    givenStore();
    const std::string shelfroot = cloud->documents().shelfroot()->path();
    stop();
    ASSERT_EQ(rename((home / "remote").c_str(), (home / "elsewhere").c_str()), 0);
    start();
    EXPECT_TRUE(readAll()->is(ErrorCode::serverNotAvailable));
    EXPECT_NE(problem().find(home / "remote"), std::string::npos);
    EXPECT_TRUE(cloud->accounts().identityToken());
    EXPECT_TRUE(cloud->documents().isPromised(url("Letters/a.txt")));
    // Another folder at the same address is not the account's.
    givenRemote("Strange/b.txt", "b");
    EXPECT_TRUE(readAll()->is(ErrorCode::serverNotAvailable));
    EXPECT_FALSE(FileManager::exists(shelfroot + "/Strange"));
}

TEST_F(Account, SaysWhenTheProblemChanges) {
    givenRemote("Letters/a.txt", "a");
    givenStore();
    std::vector<std::string> told;
    const Observation problems = notifications.observe(
        cloudProblemDidChangeNotification, [&](const Notification&) { told.push_back(problem()); });
    ASSERT_EQ(rename((home / "remote").c_str(), (home / "elsewhere").c_str()), 0);
    EXPECT_TRUE(readAll());
    runUntil([&] { return !told.empty() && !told.back().empty(); });
    ASSERT_EQ(rename((home / "elsewhere").c_str(), (home / "remote").c_str()), 0);
    EXPECT_EQ(readAll(), std::nullopt);
    runUntil([&] { return told.back().empty(); });
    EXPECT_EQ(changes, 0) << "it was the same account all the time";
}

TEST_F(Account, ChangesOfTheFileArriveOnceOnTheMainThread) {
    start(); // neither the file nor its folder is there
    EXPECT_FALSE(cloud->accounts().identityToken());
    const AccountRecord first = account();
    signIn(first);
    runUntil([&] { return changes == 1; });
    EXPECT_EQ(cloud->accounts().identityToken(), IdentityToken(first.identity));
    ASSERT_EQ(readAll(), std::nullopt);
    const AccountRecord second = account("other");
    home.makeFolder("other");
    signIn(first); // written again with the same content
    signIn(second);
    runUntil([&] { return changes == 2; });
    EXPECT_EQ(cloud->accounts().identityToken(), IdentityToken(second.identity));
    ASSERT_EQ(FileManager::removeItem(Url::file(accountFolder(folders))), std::nullopt);
    runUntil([&] { return changes == 3; });
    EXPECT_FALSE(cloud->accounts().identityToken());
    signIn(second); // the folder is another one now
    runUntil([&] { return changes == 4; });
}

TEST_F(Account, TheSamePlaceFindsItsStoreAgain) {
    givenRemote("Letters/a.txt", "a");
    givenStore();
    const std::string shelfroot = cloud->documents().shelfroot()->path();
    const auto token = cloud->accounts().identityToken();
    signIn(account());
    runUntil([&] { return changes == 1; });
    EXPECT_NE(cloud->accounts().identityToken(), token) << "signed in anew";
    EXPECT_EQ(cloud->documents().shelfroot()->path(), shelfroot);
    EXPECT_TRUE(cloud->documents().isPromised(url("Letters/a.txt")));
    AccountRecord tricky = account("../../x y\n/\xFF");
    EXPECT_EQ(storeFolderName(tricky).find_first_not_of(
                  "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789-"),
              std::string::npos);
}

TEST_F(Account, ASecondProgramReadsAndIsRefusedChangesUntilTheFirstIsDone) {
    givenRemote("Letters/a.txt", "content");
    givenStore();
    const std::unique_ptr<CloudService> first = std::move(cloud);
    start();
    EXPECT_TRUE(cloud->accounts().identityToken());
    EXPECT_TRUE(cloud->documents().isPromised(url("Letters/a.txt")));
    CancelFlag cancel;
    const Failure refused = cloud->contents().makeLocal(url("Letters/a.txt"), cancel);
    ASSERT_TRUE(refused && refused->is(ErrorCode::itemBusy));
    EXPECT_NE(refused->localizedDescription->find(std::to_string(getpid())), std::string::npos);
    EXPECT_EQ(first->contents().makeLocal(url("Letters/a.txt"), cancel), std::nullopt);
}

TEST_F(Account, TakesTheStoreOverWhenTheOtherProgramIsDone) {
    givenRemote("Letters/a.txt", "content");
    givenStore();
    std::unique_ptr<CloudService> first = std::move(cloud);
    start();
    first.reset();
    clock.advance(std::chrono::seconds(2)); // the first try after the refusal
    CancelFlag cancel;
    EXPECT_EQ(readAll(), std::nullopt);
    EXPECT_EQ(cloud->contents().makeLocal(url("Letters/a.txt"), cancel), std::nullopt);
}

TEST_F(Account, TellsTheRoomThatTheQuotaLeaves) {
    givenRemote("Letters/a.txt", std::string(400, 'x'));
    AccountRecord record = account();
    record.quota = 1000;
    signIn(record);
    start();
    ASSERT_EQ(readAll(), std::nullopt);
    std::optional<std::uint64_t> free;
    auto operation = std::make_shared<QuotaOperation>();
    operation->completion = [&](const Result<std::uint64_t>& bytes) {
        free = bytes.toOptional();
        main.async([] {});
    };
    cloud->database().addOperation(operation);
    runUntil([&] { return free.has_value(); });
    EXPECT_EQ(free, 600U);
}

} // namespace
