#include "platform/files/FileManager.h"
#include "platform/base/Describe.h"

#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <fcntl.h>
#include <filesystem>
#include <sys/resource.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

namespace fs = std::filesystem;
using platform::ErrorCode;
using platform::FileManager;
using platform::FollowLinks;
using platform::Url;

namespace {

struct Files : ::testing::Test {
    test::TemporaryFolder folder;

    Url at(std::string_view name) const { return Url::file(folder / name); }
    std::string givenFile(std::string_view name, std::string_view content = "x") const {
        return folder.write(name, content);
    }
    std::vector<std::string> names(std::string_view name = "") const {
        std::vector<std::string> out;
        const auto entries = FileManager::entries(folder / name);
        for (const auto& entry : entries.value())
            out.push_back(entry.name);
        std::sort(out.begin(), out.end());
        return out;
    }
    platform::FileAttributes attributes(std::string_view name) const {
        return FileManager::attributes(folder / name, FollowLinks::no).value();
    }
};

void expectCode(const platform::Failure& failure, ErrorCode code) {
    ASSERT_TRUE(failure) << "should have failed";
    EXPECT_TRUE(failure->is(code)) << platform::description(*failure);
}

TEST_F(Files, ADanglingLinkDoesNotExistButCanBeDescribedAndRemoved) {
    fs::create_symlink("nowhere", folder / "link");
    EXPECT_FALSE(FileManager::exists(folder / "link"));
    EXPECT_EQ(attributes("link").kind, platform::FileKind::symbolicLink);
    EXPECT_FALSE(FileManager::attributes(folder / "link", FollowLinks::yes));
    EXPECT_FALSE(FileManager::removeItem(at("link")));
    EXPECT_FALSE(folder.has("link"));
}

TEST_F(Files, APathWithANulNamesNoOtherItem) {
    givenFile("a");
    const std::string path = (folder / "a") + std::string("\0b", 2);
    EXPECT_FALSE(FileManager::exists(path));
    expectCode(FileManager::removeItem(Url::file(path)), ErrorCode::invalidArgument);
    EXPECT_TRUE(FileManager::writeAtomically(Url::file(path), "new"));
    EXPECT_EQ(folder.read("a"), "x");
}

TEST_F(Files, EnumerationStopsWhenToldAndSkipsTheDots) {
    folder.makeFolder("many");
    for (int i = 0; i < 1200; ++i) // more than one system call hands over at once
        ::close(::creat(
            (folder / ("many/" + std::to_string(1000 + i) + std::string(240, 'n'))).c_str(), 0600));
    EXPECT_EQ(names("many").size(), 1200U);
    int seen = 0;
    EXPECT_FALSE(FileManager::enumerate(folder / "many", [&seen](const auto& entry) {
        EXPECT_NE(entry.name, ".");
        return ++seen < 10;
    }));
    EXPECT_EQ(seen, 10);
    EXPECT_TRUE(FileManager::entries(folder / "link/below").error().is(ErrorCode::noSuchItem));
}

TEST_F(Files, FoldersAreMadeWithTheirParentsButNeverOverAFile) {
    EXPECT_FALSE(FileManager::createDirectory(at("a/b/c"), true));
    EXPECT_FALSE(FileManager::createDirectory(at("a/b/c"), true));
    expectCode(FileManager::createDirectory(at("a/b/c"), false), ErrorCode::fileExists);
    expectCode(FileManager::createDirectory(at("x/y"), false), ErrorCode::noSuchItem);
    givenFile("file");
    expectCode(FileManager::createDirectory(at("file"), true), ErrorCode::fileExists);
    EXPECT_TRUE(FileManager::createDirectory(at("file/below"), true));
}

TEST_F(Files, AMoveNeverReplaces) {
    givenFile("a", "A");
    givenFile("b", "B");
    folder.makeFolder("empty");
    fs::create_symlink("nowhere", folder / "dangling");
    for (const char* taken : {"b", "empty", "dangling", "a"})
        expectCode(FileManager::moveItem(at("a"), at(taken)), ErrorCode::fileExists);
    EXPECT_EQ(folder.read("a") + folder.read("b"), "AB");
    expectCode(FileManager::moveItem(at("empty"), at("empty/in")), ErrorCode::invalidArgument);
    EXPECT_FALSE(FileManager::moveItem(at("a"), at("empty/a")));
    EXPECT_EQ(folder.read("empty/a"), "A");
    expectCode(FileManager::moveItem(at("a"), at("c")), ErrorCode::noSuchItem);
}

TEST_F(Files, AMoveToAnotherDiskSaysSo) {
    if (!fs::exists("/dev/shm") ||
        FileManager::attributes("/dev/shm", FollowLinks::yes).value().identity.device ==
            attributes("").identity.device)
        GTEST_SKIP() << "no second file system";
    givenFile("a");
    const Url other = Url::file("/dev/shm/tavrin-move-" + std::to_string(::getpid()));
    const platform::Failure failure = FileManager::moveItem(at("a"), other);
    expectCode(failure, ErrorCode::unsupportedOperation);
    EXPECT_EQ(failure->localizedFailureReason, "Invalid cross-device link");
    EXPECT_TRUE(folder.has("a"));
}

TEST_F(Files, ExchangeSwapsAFileAndAFolder) {
    givenFile("a", "A");
    givenFile("d/inner");
    EXPECT_FALSE(FileManager::exchangeItems(at("a"), at("d")));
    EXPECT_EQ(folder.read("d"), "A");
    EXPECT_TRUE(folder.has("a/inner"));
}

TEST_F(Files, ACopyKeepsContentHolesAndTimes) {
    const std::string path = givenFile("sparse", "head");
    ASSERT_EQ(::truncate(path.c_str(), 4 << 20), 0);
    const timespec times[2] = {{1'000'000, 5}, {1'234'567, 89}};
    ASSERT_EQ(::utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
    ASSERT_FALSE(FileManager::copyFile(at("sparse"), at("copy")));
    EXPECT_EQ(attributes("copy").size, 4U << 20);
    EXPECT_EQ(attributes("copy").modified, platform::Date::fromParts(1'234'567, 89));
    EXPECT_EQ(folder.read("copy").substr(0, 5), std::string("head\0", 5));
    struct stat info {};
    ASSERT_EQ(::stat((folder / "copy").c_str(), &info), 0);
    EXPECT_LT(info.st_blocks * 512, 1 << 20) << "the hole was filled";
    expectCode(FileManager::copyFile(at("sparse"), at("copy")), ErrorCode::fileExists);
}

TEST_F(Files, AFailedCopyLeavesNothing) {
    givenFile("big", std::string(100'000, 'x'));
    rlimit before{};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &before), 0);
    const rlimit small{1000, before.rlim_max};
    ::signal(SIGXFSZ, SIG_IGN);
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &small), 0);
    const bool copied = !FileManager::copyFile(at("big"), at("copy"));
    const bool written = !FileManager::writeAtomically(at("small"), std::string(5000, 'y'));
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &before), 0);
    EXPECT_FALSE(copied);
    EXPECT_FALSE(written);
    EXPECT_EQ(names(), std::vector<std::string>{"big"});
}

TEST_F(Files, AtomicWritesReplaceWholeContentAndLeaveNoOtherFile) {
    givenFile("a", "a longer old text");
    EXPECT_FALSE(FileManager::writeAtomically(at("a"), "new", 0600));
    EXPECT_EQ(folder.read("a"), "new");
    EXPECT_EQ(attributes("a").mode, 0600U);
    const std::string longName(255, 'n');
    EXPECT_FALSE(FileManager::writeAtomically(at(longName), "x"));
    EXPECT_EQ(names(), (std::vector<std::string>{"a", longName}));
    EXPECT_EQ(FileManager::contents(at("a"), 2).value().size(), 2U) << "no more than the limit";
    ASSERT_EQ(::mkfifo((folder / "pipe").c_str(), 0600), 0);
    EXPECT_FALSE(FileManager::contents(at("pipe"), 10)) << "does not wait for a writer";
}

TEST_F(Files, AttributesOfAnyLengthAreKept) {
    givenFile("a");
    const std::string value = std::string(2000, 'v') + std::string("\0tail", 5);
    if (setExtendedAttribute(at("a"), "user.test", value))
        GTEST_SKIP() << "no user attributes here";
    EXPECT_EQ(platform::extendedAttribute(folder / "a", "user.test"), value);
    EXPECT_FALSE(platform::removeExtendedAttribute(at("a"), "user.test"));
    EXPECT_FALSE(platform::removeExtendedAttribute(at("a"), "user.test"));
    EXPECT_EQ(platform::extendedAttribute(folder / "a", "user.test"), std::nullopt);
    expectCode(platform::setExtendedAttribute(at("b"), "user.test", ""), ErrorCode::noSuchItem);
}

TEST_F(Files, RemovalTakesTheTreeButNotWhatItsLinksPointAt) {
    givenFile("keep/precious");
    givenFile("tree/a/b/c/file");
    givenFile("tree/file");
    fs::create_directory_symlink(folder / "keep", folder / "tree/a/link");
    EXPECT_FALSE(FileManager::removeItem(at("tree")));
    EXPECT_EQ(names(), std::vector<std::string>{"keep"});
    EXPECT_TRUE(folder.has("keep/precious"));
    expectCode(FileManager::removeItem(at("tree")), ErrorCode::noSuchItem);
}

TEST_F(Files, RemovalGoesDeeperThanThereAreDescriptors) {
    const int before = ::open(folder.path().c_str(), O_PATH | O_DIRECTORY);
    int level = ::dup(before);
    for (int depth = 0; depth < 1500; ++depth) {
        ASSERT_EQ(::mkdirat(level, "down", 0700), 0);
        const int next = ::openat(level, "down", O_PATH | O_DIRECTORY);
        ::close(std::exchange(level, next));
    }
    ::close(level);
    ::close(before);
    const platform::Failure failure = FileManager::removeItem(at("down"));
    EXPECT_FALSE(failure) << platform::description(*failure);
    EXPECT_TRUE(names().empty());
}

// Somebody swaps a folder of the tree for a link to a precious one, over and over, while trees are
// removed: nothing of the precious folder may go.
TEST_F(Files, RemovalNeverEscapesThroughASwappedFolder) {
    for (int i = 0; i < 50; ++i)
        givenFile("keep/precious " + std::to_string(i));
    fs::create_directory_symlink(folder / "keep", folder / "bait");
    std::atomic<bool> done{false};
    std::atomic<int> swaps{0};
    std::thread attacker([&] {
        while (!done)
            swaps += !FileManager::exchangeItems(at("tree/inner"), at("bait"));
    });
    for (int round = 0; round < 100 || swaps < 20; ++round) {
        for (int i = 0; i < 20; ++i)
            givenFile("tree/inner/" + std::to_string(i));
        while (FileManager::exists(folder / "tree"))
            (void)FileManager::removeItem(at("tree"));
        if (!folder.has("bait") || !fs::is_symlink(folder / "bait")) {
            (void)FileManager::removeItem(at("bait"));
            std::error_code ignored;
            fs::create_directory_symlink(folder / "keep", folder / "bait", ignored);
        }
    }
    done = true;
    attacker.join();
    // What the test itself wrote through the swapped link is there as well.
    for (int i = 0; i < 50; ++i)
        EXPECT_TRUE(folder.has("keep/precious " + std::to_string(i)));
}

TEST_F(Files, IdentityTellsAReusedInodeApart) {
    givenFile("a");
    const platform::FileIdentity first = attributes("a").identity;
    ASSERT_FALSE(FileManager::moveItem(at("a"), at("b")));
    EXPECT_EQ(attributes("b").identity, first);
    if (first.birthNanoseconds == 0)
        GTEST_SKIP() << "no birth times here";
    ASSERT_FALSE(FileManager::removeItem(at("b")));
    givenFile("a");
    EXPECT_NE(attributes("a").identity, first);
}

} // namespace
