#include "platform/base/Url.h"

#include <gtest/gtest.h>

using platform::percentDecoded;
using platform::Url;

namespace {

TEST(Url, SplitsACustomScheme) {
    const auto url = Url::parse("tavrinapp://details/a%20b/Report.pdf?mode=info&x=%41#part");
    ASSERT_TRUE(url);
    EXPECT_EQ(url->scheme(), "tavrinapp");
    EXPECT_EQ(url->host(), "details");
    EXPECT_EQ(url->path(), "/a b/Report.pdf");
    const std::vector<platform::QueryItem> expected = {{"mode", "info"}, {"x", "A"}};
    EXPECT_EQ(url->queryItems(), expected);
}

TEST(Url, RefusesWhatIsNoUrl) {
    for (const char* text : {"", "no scheme", "1bad:/x", ":/x", "a b:/x", "s:/broken%2", "s:/%zz"})
        EXPECT_FALSE(Url::parse(text)) << text;
    EXPECT_TRUE(Url::parse("tavrinapp:"));
    EXPECT_FALSE(percentDecoded("%"));
    EXPECT_EQ(percentDecoded("100%25"), "100%");
}

TEST(Url, ParsesAMillionCharacters) {
    const auto url = Url::parse("tavrinapp:/" + std::string(1'000'000, 'a'));
    ASSERT_TRUE(url);
    EXPECT_EQ(url->path().size(), 1'000'001U);
}

TEST(Url, KeepsNamesThatAreNotUtf8) {
    const Url url = Url::file("/store").appending("bad\xff name?.txt");
    EXPECT_EQ(url.absoluteString(), "file:///store/bad%FF%20name%3F.txt");
    EXPECT_EQ(Url::parse(url.absoluteString()), url);
}

TEST(Url, DirectoryMarkIsNoPartOfThePath) {
    const Url folder = Url::file("/a/b///");
    EXPECT_TRUE(folder.hasDirectoryMark());
    EXPECT_EQ(folder.path(), "/a/b");
    EXPECT_EQ(folder, Url::file("/a/b"));
    EXPECT_EQ(folder.absoluteString(), "file:///a/b/");
    EXPECT_EQ(folder.appending("c").path(), "/a/b/c");
    EXPECT_EQ(Url::file("/").absoluteString(), "file:///");
}

TEST(Url, TakesNamesApart) {
    const struct {
        const char* name;
        const char* extension;
        const char* stem;
    } cases[] = {{"Report.pdf", "pdf", "Report"},
                 {"archive.tar.gz", "gz", "archive.tar"},
                 {"Notes", "", "Notes"},
                 {".hidden", "", ".hidden"},
                 {"dot.", "", "dot."},
                 {".a.txt", "txt", ".a"}};
    for (const auto& one : cases) {
        EXPECT_EQ(platform::pathExtensionOf(one.name), one.extension) << one.name;
        EXPECT_EQ(platform::stemOf(one.name), one.stem) << one.name;
    }
}

TEST(Url, GoesUpAndStandardises) {
    EXPECT_EQ(Url::file("/a/b").deletingLastPathComponent()->path(), "/a");
    EXPECT_EQ(Url::file("/a").deletingLastPathComponent()->path(), "/");
    EXPECT_FALSE(Url::file("/").deletingLastPathComponent());
    EXPECT_EQ(Url::file("/a/./b//../../../c").standardized().path(), "/c");
    EXPECT_TRUE(Url::file("/a/b").isInside(Url::file("/a")));
    EXPECT_FALSE(Url::file("/ab").isInside(Url::file("/a")));
}

TEST(Url, PhysicalLocationTravelsAlongButDoesNotCount) {
    const Url logical = Url::file("/a/Report.pdf");
    const Url promised = logical.withPhysicalUrl(Url::file("/a/.Report.pdf.promise"));
    EXPECT_EQ(promised, logical);
    EXPECT_EQ(promised.physicalUrl()->path(), "/a/.Report.pdf.promise");
    EXPECT_FALSE(promised.appending("x").physicalUrl());
}

} // namespace
