#include "platform/base/Value.h"
#include "platform/base/Folders.h"
#include "platform/base/Format.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/Result.h"

#include <gtest/gtest.h>

#include <map>

using platform::Value;

namespace {

TEST(Value, AnswersOnlyItsOwnKind) {
    EXPECT_TRUE(Value().isNone());
    EXPECT_EQ(Value(7).integer(), 7);
    EXPECT_EQ(Value(7.9).integer(), 7);
    EXPECT_EQ(Value(7).number(), 7.0);
    EXPECT_FALSE(Value(1e300).integer());
    EXPECT_FALSE(Value(std::numeric_limits<double>::quiet_NaN()).integer());
    EXPECT_FALSE(Value("7").integer());
    EXPECT_FALSE(Value(1).boolean());
    EXPECT_EQ(*Value("text").text(), "text");
    EXPECT_EQ(Value("text").map(), nullptr);
}

TEST(Value, ComparesListsAndMapsByContent) {
    const auto tree = [](int leaf) {
        return Value(Value::Map{{"a", Value(Value::List{Value(leaf), Value("x")})}});
    };
    EXPECT_EQ(tree(1), tree(1));
    EXPECT_FALSE(tree(1) == tree(2));
    EXPECT_FALSE(tree(1) == Value(1));
    EXPECT_EQ(platform::format("%@", tree(1)), "(a = (1, x))");
}

TEST(NotificationCenter, TellsObserversUntilTheyEnd) {
    platform::NotificationCenter center;
    std::string heard;
    platform::Observation second;
    const auto first = center.observe("n", [&](const platform::Notification& n) {
        heard += "1" + *n.info.text();
        second.end(); // ended by an earlier observer of the same notice: not called any more
    });
    second = center.observe("n", [&](const auto&) { heard += "2"; });
    center.post("n", Value("a"));
    center.post("other", Value("b"));
    EXPECT_EQ(heard, "1a");
}

TEST(Folders, IgnoreRelativeValuesAndHaveNoRuntimeDefault) {
    const std::map<std::string, std::string> set = {
        {"HOME", "/home/u"}, {"XDG_CONFIG_HOME", "relative"}, {"XDG_DATA_HOME", "/data/"}};
    const auto folders =
        platform::Folders::fromEnvironment([&](const char* name) -> std::optional<std::string> {
            const auto found = set.find(name);
            return found == set.end() ? std::nullopt : std::optional(found->second);
        });
    EXPECT_EQ(folders.config, "/home/u/.config");
    EXPECT_EQ(folders.data, "/data");
    EXPECT_EQ(folders.state, "/home/u/.local/state");
    EXPECT_FALSE(folders.runtime);
}

TEST(Result, HoldsOneOfTwo) {
    const platform::Result<int> good = 3;
    const platform::Result<int> bad = platform::makeError(platform::ErrorCode::timedOut, "x");
    EXPECT_EQ(*good, 3);
    EXPECT_FALSE(bad);
    EXPECT_TRUE(bad.error().is(platform::ErrorCode::timedOut));
    EXPECT_FALSE(bad.toOptional());
}

} // namespace
