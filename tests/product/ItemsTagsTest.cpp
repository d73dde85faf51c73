#include "items/ColorBlending.h"
#include "items/FileTags.h"
#include "platform/cloud/KeyValueCloudStore.h"
#include "platform/cloud/KeyValueSync.h"
#include "platform/ui/qt/Bridge.h"
#include "tests/product/ProductFixture.h"

#include <QImage>

using platform::Color;
using platform::Image;
using platform::Value;
using tavrin::FileTags;
using testing::ElementsAre;
using testing::IsEmpty;

namespace test {
namespace {

struct Tags : HouseTest {
    Tags() { signIn(); }
    static Value tag(const char* name, const Value& label) {
        return Value::Map{{"n", name}, {"l", label}};
    }
    void givenDictionary(const Value& dictionary) const {
        platform->keyValueStore().setValue("KolviTagDict", dictionary);
        FileTags::_tagColorsDidChange();
    }
    void givenTags(Value::List entries) const {
        givenDictionary(Value::Map{{"KolviTagDictVersion", 2}, {"KolviTags", std::move(entries)}});
    }
    static Color labelColor(std::size_t label) { return FileTags::_tagBlipColors().at(label); }
    /// A pixel of the picture; transparent counts as clear.
    static Color pixel(const Image& image, int x, int y) {
        const QImage pixels = platform::toQt(image, image.size(), image.scale());
        const QColor color = pixels.pixelColor(x, y);
        return color.alpha() == 0
                   ? Color::clear
                   : Color{color.redF(), color.greenF(), color.blueF(), color.alphaF()};
    }
    static void expectNear(const Color& is, const Color& wanted) {
        for (const auto channel : {&Color::red, &Color::green, &Color::blue, &Color::alpha})
            EXPECT_NEAR(is.*channel, wanted.*channel, 0.08);
    }
};

TEST_F(Tags, keepTheUsersOrderAndTheLastColour) {
    givenTags({tag("Work", 4), tag("Home", 6), tag("Work", 2), tag("Strange", 9), tag("Minus", -1),
               tag("Word", "x"), Value::Map{{"n", "Bare"}}, Value::Map{{"l", 3}}, 7});
    EXPECT_THAT(FileTags::allTags(),
                ElementsAre("Work", "Home", "Work", "Strange", "Minus", "Word", "Bare"));
    FileTags::ColorMap colors = FileTags::tagColorsByTag();
    EXPECT_EQ(colors["Work"], labelColor(2));
    EXPECT_EQ(colors["Home"], labelColor(6));
    for (const char* name : {"Strange", "Minus", "Word", "Bare"})
        EXPECT_EQ(colors[name], Color::gray(0.8)) << name;
    EXPECT_EQ(colors.size(), 6U);
    colors.clear();
    EXPECT_EQ(FileTags::tagColorsByTag().size(), 6U) << "that was a copy";
}

TEST_F(Tags, areFoundAmongVeryMany) {
    Value::List entries;
    for (int i = 0; i < 100'000; ++i)
        entries.push_back(tag(("Tag " + std::to_string(i)).c_str(), i % 8));
    entries.push_back(tag("a, b/c: \xF0\x9F\x9A\xA3\xF0\x9F\x8F\xBD", 6));
    givenTags(std::move(entries));
    EXPECT_EQ(FileTags::allTags().size(), 100'001U);
    std::vector<std::string> many(1'000, "Tag 99999");
    many.emplace_back("a, b/c: \xF0\x9F\x9A\xA3\xF0\x9F\x8F\xBD");
    const Image dots = FileTags::blipWithTags(many, 10, 1);
    expectNear(pixel(dots, 2, 5), labelColor(99'999 % 8));
    expectNear(pixel(dots, 5'005, 5), labelColor(6));
}

TEST_F(Tags, areNoneWithoutADictionaryOfTheKnownVersion) {
    listenClosely();
    const Value::List entries{tag("Work", 4)};
    const std::string empty = "4 Kolvi tag dictionary is empty";
    for (const int version : {1, 3}) {
        givenTags(entries);
        ASSERT_EQ(FileTags::allTags().size(), 1U);
        clearLog();
        givenDictionary(Value::Map{{"KolviTagDictVersion", version}, {"KolviTags", entries}});
        EXPECT_THAT(FileTags::allTags(), IsEmpty());
        EXPECT_THAT(FileTags::tagColorsByTag(), IsEmpty());
        EXPECT_THAT(logLines(), ElementsAre("7 Kolvi tag dictionary has incorrect version (" +
                                                std::to_string(version) + ", should be 2)",
                                            empty));
    }
    clearLog();
    givenDictionary({});
    givenDictionary("no map");
    EXPECT_THAT(logLines(), ElementsAre(empty, empty));
    givenDictionary(Value::Map{{"KolviTagDictVersion", 2}});
    EXPECT_THAT(FileTags::allTags(), IsEmpty());
}

TEST_F(Tags, standAsOverlappingDots) {
    givenTags({tag("Red", 6), tag("Blue", 4)});
    const Image three = FileTags::blipWithTags({"Red", "Blue", "Unknown"}, 10, 1);
    EXPECT_EQ(three.size(), (platform::Size{20, 10}));
    expectNear(pixel(three, 3, 5), labelColor(6));
    expectNear(pixel(three, 8, 5), labelColor(4));
    expectNear(pixel(three, 15, 5), labelColor(0));
    EXPECT_EQ(pixel(three, 0, 0), Color::clear);
    // The outline is a lighter tint, half a point inside.
    expectNear(pixel(three, 0, 5),
               tavrin::_colorBlendedWithColor(labelColor(6), Color::white.withAlpha(0.5)));
    EXPECT_TRUE(FileTags::blipWithTags({}, 10, 1).empty());
    const Image fine = FileTags::blipWithTags({"a", "b"}, 10.5, 2);
    EXPECT_EQ(fine.scale(), 2);
    EXPECT_NEAR(fine.size().width, 16.25, 0.5); // 11 and half of 10.5
    EXPECT_EQ(fine.size().height, 11);
}

TEST_F(Tags, standAloneWhereTheLineWantsThem) {
    givenTags({tag("Green", 2)});
    const Image one = FileTags::blipWithTag("Green", {20, 12}, 8, {10, 2});
    EXPECT_EQ(one.size(), (platform::Size{20, 12}));
    EXPECT_EQ(one.scale(), 1);
    expectNear(pixel(one, 14, 6), labelColor(2));
    expectNear(pixel(one, 11, 6), labelColor(2)); // no outline
    EXPECT_EQ(pixel(one, 5, 6), Color::clear);
    EXPECT_TRUE(FileTags::blipWithTag(std::nullopt, {20, 12}, 8, {10, 2}).empty());
}

TEST(TagTables, followTheUsersOtherDevices) {
    expectInFreshProcess([] {
        ProductHouse house;
        const std::string file = "remote/" + platform::KeyValueSync::remotePath();
        const auto tagged = [](const std::string& name) {
            return R"({"KolviTagDict": {"KolviTagDictVersion": 2, "KolviTags": [{"n": ")" + name +
                   R"(", "l": 5}]}})";
        };
        house.home.write(file, tagged("Before"));
        house.signIn();
        ASSERT_TRUE(house.until([] { return !FileTags::allTags().empty(); }));
        EXPECT_THAT(FileTags::allTags(), ElementsAre("Before"));
        house.home.write(file, tagged("Afterwards"));
        house.platform->cloud().refresh(std::nullopt, [](const platform::Failure&) {});
        EXPECT_TRUE(house.until([] { return FileTags::allTags().front() == "Afterwards"; }));
        EXPECT_EQ(FileTags::tagColorsByTag().at("Afterwards"), FileTags::_tagBlipColors()[5]);
    });
}

struct Blend {
    std::optional<tavrin::CompositingFilter> filter;
    Color under;
    std::optional<Color> top;
    Color result;
};

TEST(ColorBlending, followsItsFormulas) {
    using enum tavrin::CompositingFilter;
    const Color red{1, 0, 0, 1};
    const Color under{0.2, 0.6, 1, 0.7};
    const Color top{0.5, 0.5, 0.5, 0.5};
    const std::vector<Blend> cases = {
        {sourceOver, red, Color::white.withAlpha(0.5), {1, 0.5, 0.5, 1}},
        {std::nullopt, red, Color::white.withAlpha(0.5), {1, 0.5, 0.5, 1}},
        {normal, Color::clear, red.withAlpha(0.25), red.withAlpha(0.25)},
        {sourceOver, {0, 0, 1, 0.5}, Color{1, 0, 0, 0.5}, {2.0 / 3, 0, 1.0 / 3, 0.75}},
        {sourceOver, under, top.withAlpha(0), under},
        {sourceOver, under, top.withAlpha(1e-8), under},
        {sourceOver, under, std::nullopt, under},
        {multiply, under, top, {0.15, 0.45, 0.75, 0.7}},
        {screen, under, top, {0.4, 0.7, 1, 0.7}},
        {overlay, under, top, {0.2, 0.6, 1, 0.7}},
        {overlay, under, Color{0.5, 0.25, 0, 1}, {0.2, 0.4, 1, 0.7}},
        {darken, under, top, {0.2, 0.55, 0.75, 0.7}},
        {lighten, under, top, {0.35, 0.6, 1, 0.7}},
        {colorDodge, under, top, under},
        {plusDarker, under, top, under},
    };
    for (std::size_t i = 0; i < cases.size(); ++i) {
        const Blend& each = cases[i];
        const Color is = tavrin::_colorBlendedWithColor(each.under, each.top, each.filter);
        for (const auto channel : {&Color::red, &Color::green, &Color::blue, &Color::alpha})
            EXPECT_NEAR(is.*channel, each.result.*channel, 1e-6) << "case " << i;
    }
}

} // namespace
} // namespace test
