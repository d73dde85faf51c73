#include "tests/webdav/WebDavFixture.h"

#include <fstream>

using namespace platform;
using test::endedWith;
using test::went;

namespace {

struct RemoteOn : test::OnServer {
    std::string largeContent() const { return std::string(700'000, 'x') + "end"; }
};
INSTANTIATE_TEST_SUITE_P(Servers, RemoteOn, test::everyServer, test::nameOfCase);

TEST_P(RemoteOn, TellsWhatTheServerDoes) {
    const auto remote = connected();
    const WebDavCapabilities can = remote->capabilities().value();
    const bool good = GetParam() == test::DavHost::Kind::apache ||
                      GetParam() == test::DavHost::Kind::lighttpd;
    EXPECT_TRUE(can.writable);
    EXPECT_TRUE(can.safeMoves);
    EXPECT_EQ(can.conditionalPut, good);
    EXPECT_EQ(can.deadProperties, good);
    EXPECT_EQ(can.showsHidden, GetParam() != test::DavHost::Kind::nginx);
    EXPECT_EQ(can.etags, GetParam() != test::DavHost::Kind::nginx);
    EXPECT_EQ(can.tornPutsVanish, GetParam() != test::DavHost::Kind::rclone);
    EXPECT_EQ(names(*remote, ""), std::set<std::string>{}) << "nothing of the trial is left";
    EXPECT_EQ(connected()->connect(cancel).value(), remote->connect(cancel).value());
}

TEST_P(RemoteOn, ReplacesAndRemovesTheVersionThatWasMeantAlone) {
    const auto remote = connected();
    for (const std::string& content : {std::string("small"), largeContent()}) {
        const std::string first = put(*remote, "file", content);
        ASSERT_NE(first, "") << test::wordsOf(failure);
        EXPECT_EQ(put(*remote, "file", "another"), "");
        EXPECT_TRUE(failedWith(ErrorCode::fileExists)) << test::wordsOf(failure);
        const std::string second =
            put(*remote, "file", content + "2", RemoteCondition::version(first));
        ASSERT_NE(second, "") << test::wordsOf(failure);
        EXPECT_EQ(put(*remote, "file", "lost", RemoteCondition::version(first)), "");
        EXPECT_TRUE(failedWith(ErrorCode::changedRemotely)) << test::wordsOf(failure);
        EXPECT_EQ(remote->sync(cancel), std::nullopt);
        EXPECT_EQ(get(*remote, "file"), content + "2");
        EXPECT_EQ(remote->entry("file", cancel)->etag, second);
        EXPECT_TRUE(endedWith(ErrorCode::changedRemotely,
                              remote->remove("file", ItemKind::file, first, cancel)));
        EXPECT_EQ(remote->remove("file", ItemKind::file, second, cancel), std::nullopt);
        EXPECT_TRUE(endedWith(ErrorCode::noSuchItem, remote->entry("file", cancel)));
    }
    std::size_t kept = 0;
    const auto days = remote->list(".pelmora/trash", cancel);
    ASSERT_TRUE(days);
    for (const RemoteEntry& day : days->entries)
        kept += names(*remote, ".pelmora/trash/" + day.name).size();
    EXPECT_GE(kept, 2U) << "deletions are recoverable";
    EXPECT_EQ(names(*remote, ".pelmora/incoming"), std::set<std::string>{});
}

TEST_P(RemoteOn, TakesNamesByteForByte) {
    const auto remote = connected();
    std::set<std::string> all = {"a b%20c",   "100%",          "#?&+;=,$!@:",
                                       "é",         "e\xCC\x81",     "日本語",
                                       "'\"<>&",    "back\\slash",
                                       "[x] (y) {z}~", "%2F%00",     " leading"};
    if (remote->capabilities()->showsHidden)
        all.insert(".hidden");
    ASSERT_TRUE(went(remote->makeFolder("folder + é", cancel)));
    for (const std::string& name : all)
        EXPECT_NE(put(*remote, "folder + é/" + name, name), "")
            << name << ": " << test::wordsOf(failure);
    EXPECT_EQ(names(*remote, "folder + é"), all) << test::wordsOf(failure);
    for (const std::string& name : all)
        EXPECT_EQ(get(*remote, "folder + é/" + name), name) << test::wordsOf(failure);
    for (const std::string& name : {std::string("not utf-8 \xFF"), std::string(".x.promise"),
                                    std::string(256, 'n'), std::string("..")}) {
        put(*remote, name, "x");
        EXPECT_TRUE(failedWith(ErrorCode::nameRefused)) << name;
    }
    const std::string longest(255, 'n');
    put(*remote, longest, "x");
    EXPECT_TRUE(!failure || failedWith(ErrorCode::nameRefused)) << test::wordsOf(failure);
}

TEST_P(RemoteOn, MovesWithoutReplacingAndRemovesOnlyEmptyFolders) {
    const auto remote = connected();
    ASSERT_TRUE(went(remote->makeFolder("A", cancel)));
    if (GetParam() != test::DavHost::Kind::rclone) { // which answers as if it had made it
        EXPECT_TRUE(endedWith(ErrorCode::fileExists, remote->makeFolder("A", cancel)));
    }
    EXPECT_TRUE(endedWith(ErrorCode::noSuchItem, remote->makeFolder("none/B", cancel)));
    const std::string one = put(*remote, "A/one", "one");
    const std::string two = put(*remote, "two", "the second");
    EXPECT_TRUE(endedWith(ErrorCode::fileExists, remote->move("two", "A/one", two, cancel)));
    EXPECT_TRUE(endedWith(ErrorCode::changedRemotely, remote->move("two", "A/2", one, cancel)));
    ASSERT_TRUE(went(remote->move("two", "A/2", two, cancel)));
    EXPECT_EQ(get(*remote, "A/2"), "the second");
    EXPECT_TRUE(endedWith(ErrorCode::folderNotEmpty,
                          remote->remove("A", ItemKind::folder, "", cancel)));
    ASSERT_TRUE(went(remote->move("A", "B é", "", cancel)));
    EXPECT_EQ(names(*remote, "B é"), (std::set<std::string>{"one", "2"}));
    EXPECT_TRUE(endedWith(ErrorCode::noSuchItem, remote->list("A", cancel)));
    ASSERT_TRUE(went(remote->makeFolder("empty", cancel)));
    EXPECT_EQ(remote->remove("empty", ItemKind::folder, "", cancel), std::nullopt);
    EXPECT_EQ(names(*remote, ""), std::set<std::string>{"B é"});
}

TEST_P(RemoteOn, AContentThatChangesOnItsWayIsNotSeen) {
    const auto remote = connected();
    RemoteUpload upload = test::uploadOf(largeContent());
    upload.read = [read = upload.read](std::uint64_t offset, std::span<std::byte> buffer) {
        return offset > 300'000 ? Result<std::size_t>(makeError(ErrorCode::changedWhileRead))
                                : read(offset, buffer.first(std::min<std::size_t>(
                                                   buffer.size(), 100'000)));
    };
    EXPECT_TRUE(endedWith(ErrorCode::changedWhileRead,
                          remote->write("file", upload, RemoteCondition::nameFree(), cancel)));
    EXPECT_EQ(names(*remote, ""), std::set<std::string>{});
}

TEST_P(RemoteOn, TellsARemoteThatIsGoneFromAnItemThatIs) {
    if (GetParam() == test::DavHost::Kind::rclone)
        GTEST_SKIP() << "this one remembers folders, and does not see what is done behind its back";
    const auto remote = connected();
    EXPECT_TRUE(endedWith(ErrorCode::noSuchItem, remote->entry("none", cancel)));
    // A disk that is not mounted looks like this.
    ASSERT_EQ(rename((host.folder() + "/.pelmora").c_str(), (host.folder() + "/.x").c_str()), 0);
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->entry("none", cancel)));
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->list("", cancel)));
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->connect(cancel)));
}

TEST_P(RemoteOn, TagsTravelWhereTheServerKeepsProperties) {
    const auto remote = connected();
    RemoteUpload upload = test::uploadOf("tagged");
    upload.tags = "red,<&>";
    ASSERT_TRUE(went(remote->write("file", upload, RemoteCondition::nameFree(), cancel)));
    const auto other = connected();
    const std::string expected = remote->capabilities()->deadProperties ? upload.tags : "";
    EXPECT_EQ(other->entry("file", cancel)->tags, expected);
    ASSERT_TRUE(other->list("", cancel));
    EXPECT_EQ(other->read("file", [](auto) { return Failure(); }, cancel)->tags, expected);
}

} // namespace
