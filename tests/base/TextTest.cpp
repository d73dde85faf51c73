#include "platform/base/Text.h"
#include "platform/base/ByteCount.h"
#include "platform/base/DateFormat.h"

#include <gtest/gtest.h>

using platform::ByteCountStyle;
using platform::byteCountText;

namespace {

TEST(ByteCount, WritesWhatPeopleExpect) {
    EXPECT_EQ(byteCountText(1'610'612'736, ByteCountStyle::binary), "1.5 GB");
    EXPECT_EQ(byteCountText(104'857'600, ByteCountStyle::binary), "100 MB");
    EXPECT_EQ(byteCountText(0, ByteCountStyle::file), "0 bytes");
    EXPECT_EQ(byteCountText(1, ByteCountStyle::file), "1 byte");
    EXPECT_EQ(byteCountText(6'291'456, ByteCountStyle::file), "6.3 MB");
    EXPECT_EQ(byteCountText(999'999, ByteCountStyle::file), "1 MB");
    EXPECT_EQ(byteCountText(1023, ByteCountStyle::binary), "1,023 bytes");
    EXPECT_EQ(byteCountText(UINT64_MAX, ByteCountStyle::file), "18.45 EB");
    EXPECT_EQ(byteCountText(1'610'612'736, ByteCountStyle::binary, false), "1.5");
}

TEST(ByteCount, ReadsItsOwnNumbersBack) {
    EXPECT_EQ(platform::localizedNumberValue("1.5"), 1.5);
    EXPECT_EQ(platform::localizedNumberValue("1,023"), 1023);
    EXPECT_EQ(platform::localizedNumberValue("none"), 0);
}

TEST(Text, ChoosesThePluralForm) {
    EXPECT_EQ(platform::localizedPlural(".DICT.ITEMS.%d", 0), "0 items");
    EXPECT_EQ(platform::localizedPlural(".DICT.ITEMS.%d", 1), "1 item");
    EXPECT_EQ(platform::localizedPlural(".DICT.ITEMS.%d", 12'345'678'901), "12,345,678,901 items");
    EXPECT_EQ(platform::localizedPluralText(".DICT.AVAILABLE.%g", 1.5, "1.5 GB"),
              "1.5 GB available");
    EXPECT_EQ(platform::localized("No such key"), "No such key");
    EXPECT_EQ(platform::localizedFormat("%1$@, %2$@", "a", "b"), "a, b");
}

TEST(Dates, GetShorterFromStyleToStyle) {
    setenv("TZ", "UTC", 1);
    tzset();
    const platform::Date date = platform::Date::fromSeconds(1'406'821'384); // 2014-07-31 15:43:04
    EXPECT_EQ(platform::localizedDayText(date, platform::DateStyle::full),
              "Thursday, July 31, 2014");
    EXPECT_EQ(platform::localizedDayText(date, platform::DateStyle::longStyle), "July 31, 2014");
    EXPECT_EQ(platform::localizedDayText(date, platform::DateStyle::medium), "Jul 31, 2014");
    EXPECT_EQ(platform::localizedDayText(date, platform::DateStyle::shortStyle), "7/31/14");
    EXPECT_EQ(platform::localizedDateText(date, platform::DateStyle::longStyle),
              "July 31, 2014, 3:43 PM");
}

} // namespace
