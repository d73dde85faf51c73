#include "platform/ui/layout/VisualFormatParser.h"
#include "tests/layout/Scene.h"

#include <gmock/gmock.h>

using namespace test;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

/// What a format says about a, b and c, which stand in the root; or its error.
class VisualFormat : public ::testing::Test {
protected:
    VisualFormat() {
        for (const char* name : {"a", "b", "_value2"})
            scene.add(name);
    }
    std::vector<std::string> read(std::string_view format) {
        const auto made =
            platform::constraintsForFormat(format, [this](std::string_view name) -> Item* {
                const auto found = scene.items.find(std::string(name));
                return name == "root"               ? &scene.root
                       : found == scene.items.end() ? nullptr
                                                    : found->second.get();
            });
        if (!made)
            return {made.error().localizedDescription.value_or("")};
        std::vector<std::string> lines;
        for (const auto& constraint : *made) {
            EXPECT_FALSE(constraint->isActive());
            lines.push_back(platform::description(*constraint));
        }
        return lines;
    }
    std::string fault(std::string_view format) {
        const auto lines = read(format);
        const std::string start = "Visual format “" + std::string(format) + "”, character ";
        EXPECT_TRUE(lines.size() == 1 && lines[0].starts_with(start)) << format;
        return lines.empty() ? "" : lines[0].substr(std::min(start.size(), lines[0].size()));
    }

    Scene scene;
};

TEST_F(VisualFormat, LinesViewsUp) {
    EXPECT_THAT(read("H:|[a]-10-[b]|"),
                ElementsAre("a.leading == root.leading", "b.leading == a.trailing + 10",
                            "root.trailing == b.trailing"));
    EXPECT_THAT(read("V:|-[a][_value2]-2.5-|"),
                ElementsAre("a.top == root.top + 8", "_value2.top == a.bottom",
                            "root.bottom == _value2.bottom + 2.5"));
    EXPECT_THAT(read("[a]"), IsEmpty());
}

TEST_F(VisualFormat, TellsSizesSpacesAndPriorities) {
    EXPECT_THAT(read("[a(==b)]"), ElementsAre("a.width == b.width"));
    EXPECT_THAT(read("V:[a(40,<=b@249.5)]"),
                ElementsAre("a.height == 40", "a.height <= b.height @249.5"));
    EXPECT_THAT(read("|-(>=8,==20@250)-[a(>=3)]-(-4)-[b]"),
                ElementsAre("a.leading >= root.leading + 8", "a.leading == root.leading + 20 @250",
                            "a.width >= 3", "b.leading == a.trailing - 4"));
}

TEST_F(VisualFormat, NamesThePlaceOfAFault) {
    EXPECT_EQ(fault(""), "1: expected a view, “[name]”");
    EXPECT_EQ(fault("X:[a]"), "1: expected a view, “[name]”");
    EXPECT_EQ(fault("H:||"), "4: expected a view, “[name]”");
    EXPECT_EQ(fault("H:|[a]-10"), "10: expected “-” after the space");
    EXPECT_EQ(fault("[a]-"), "5: expected a space, “10” or “(>=10)”, a view or “|”");
    EXPECT_EQ(fault("[a]-b-[b]"), "5: expected a space, “10” or “(>=10)”, a view or “|”");
    EXPECT_EQ(fault("[a]-(==b)-[b]"), "8: expected a number");
    EXPECT_EQ(fault("[2a]"), "2: expected the name of a view");
    EXPECT_EQ(fault("[a"), "3: expected “]”");
    EXPECT_EQ(fault("[a(>=)]"), "6: expected a number or a view");
    EXPECT_EQ(fault("[a(1e999999)]"), "5: expected “,” or “)”");
    EXPECT_EQ(fault("[a(10@2000)]"), "7: expected a priority from 1 to 1000");
    EXPECT_EQ(fault("[a]|[b]"), "5: expected the end after “|”");
    EXPECT_EQ(fault("|[a]-[c]|"), "7: there is no view “c”");
    EXPECT_EQ(fault("[a(==c)]"), "6: there is no view “c”");
    EXPECT_EQ(fault("|[root]"), "3: the view “root” has no superview");
}

} // namespace
