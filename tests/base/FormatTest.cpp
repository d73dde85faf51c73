#include "platform/base/Format.h"
#include "platform/base/Error.h"
#include "platform/base/Log.h"
#include "platform/base/Value.h"

#include <gtest/gtest.h>

#include <limits>
#include <map>

using platform::format;
using platform::FormatString;

namespace {

TEST(Format, WritesObjectsAndNumbers) {
    EXPECT_EQ(format("%@ has %d items (%u, %lu): %@", "List", -3, 4U, 5UL, std::vector<int>{1, 2}),
              "List has -3 items (4, 5): (1, 2)");
    EXPECT_EQ(format("0x%x %@ %@", 0x40002U, true, std::optional<std::string>()),
              "0x40002 1 (null)");
    EXPECT_EQ(format("%lf %g %d%%", 0.5, 1.5, 7), "0.500000 1.5 7%");
    EXPECT_EQ(format("%2$@ before %1$@", "a", "b"), "b before a");
    EXPECT_EQ(format("%@", static_cast<const char*>(nullptr)), "(null)");
    EXPECT_EQ(format("%@", std::map<std::string, int>{{"k", 1}}), "(k = 1)");
    EXPECT_EQ(format("%d", std::numeric_limits<std::int64_t>::min()), "-9223372036854775808");
    EXPECT_EQ(format("%@", platform::Url::file("/a b")), "file:///a%20b");
}

TEST(Format, SurvivesTranslationsThatDoNotFit) {
    const std::string name = "x";
    const std::array<platform::FormatArgument, 1> one{platform::makeFormatArgument(name)};
    EXPECT_EQ(platform::formatRuntime("%d of %@ 100% %1$@", one), "x of %@ 100% x");
    EXPECT_EQ(platform::formatRuntime("%", one), "%");
    EXPECT_EQ(platform::formatRuntime("%9$@", one), "%9$@");
}

TEST(Format, DescribesErrorsForLogs) {
    const platform::Error error = platform::makeError(platform::ErrorCode::fileExists, "a.txt");
    EXPECT_EQ(format("%@", error), "PelmoraGeneralErrorDomain (516): An item named “a.txt” already "
                                   "exists. Choose a different name.");
    EXPECT_EQ(platform::posixError(ENOSPC, platform::Url::file("/a"), true).code, 640);
    EXPECT_TRUE(platform::posixError(EACCES, platform::Url::file("/a"), false)
                    .is(platform::ErrorCode::readNoPermission));
}

TEST(Log, AsksTheSinkBeforeFormatting) {
    std::vector<std::string> kept;
    platform::setLogSink({[](int level) { return level <= 6; },
                          [&](int, std::string message, const std::source_location& where) {
                              kept.push_back(message + "@" + where.file_name());
                          }});
    platform::platformLog(platform::LogLevel::debug, "dropped %d", 1);
    platform::platformLog(platform::LogLevel::info, "kept %@", "two");
    platform::setLogSink({});
    ASSERT_EQ(kept.size(), 1U);
    EXPECT_EQ(kept[0], "kept two@tests/base/FormatTest.cpp");
}

} // namespace
