#include "platform/cloud/SyncNames.h"

#include "platform/base/Process.h"
#include "platform/cloud/Tokens.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>

namespace platform {
namespace {

constexpr std::string_view temporaryPrefix = ".pelmora-moving-";
/// Of the machine's name and of an extension; more of either is no help to anybody.
constexpr std::size_t longestHost = 40;
constexpr std::size_t longestExtension = 40;

std::chrono::sys_seconds secondsOf(Date date) {
    return std::chrono::sys_seconds(std::chrono::seconds(date.wholeSeconds()));
}

/// The number of that many digits at the head of the text, which loses it and one character behind.
std::optional<unsigned> takeNumber(std::string_view& text, std::size_t digits) {
    if (text.size() < digits)
        return std::nullopt;
    unsigned number = 0;
    for (const char c : text.substr(0, digits)) {
        if (c < '0' || c > '9')
            return std::nullopt;
        number = number * 10 + static_cast<unsigned>(c - '0');
    }
    text.remove_prefix(std::min(digits + 1, text.size()));
    return number;
}

} // namespace

std::string_view cutAtCharacter(std::string_view text, std::size_t limit) {
    if (text.size() <= limit)
        return text;
    std::size_t end = limit;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0U) == 0x80)
        --end;
    return text.substr(0, end == 0 ? limit : end);
}

std::string conflictName(std::string_view name, ItemKind kind, Date date, std::string_view host,
                         int number) {
    std::string mark = " (conflict " + dayText(date);
    mark += ' ';
    mark += cutAtCharacter(host, longestHost);
    if (number > 1)
        mark += ' ' + std::to_string(number);
    mark += ')';
    std::string_view extension;
    const std::size_t dot = name.rfind('.');
    if (kind == ItemKind::file && dot != std::string_view::npos && dot > 0 &&
        name.size() - dot <= longestExtension)
        extension = name.substr(dot);
    name.remove_suffix(extension.size());
    std::string made(cutAtCharacter(name, longestItemName - mark.size() - extension.size()));
    made += mark;
    made += extension;
    return made;
}

std::string deviceName() {
    std::string name = hostName().value_or("");
    std::replace(name.begin(), name.end(), '/', '-');
    return name.empty() ? "device" : name;
}

std::string temporaryName(ItemId item) {
    return std::string(temporaryPrefix) + hexText(static_cast<std::uint64_t>(item));
}

bool isTemporaryName(std::string_view name) {
    return name.starts_with(temporaryPrefix) && numberOfHex(name.substr(temporaryPrefix.size()));
}

std::string dayText(Date date) {
    const std::chrono::year_month_day day(std::chrono::floor<std::chrono::days>(secondsOf(date)));
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%04d-%02u-%02u", static_cast<int>(day.year()),
                  static_cast<unsigned>(day.month()), static_cast<unsigned>(day.day()));
    return text.data();
}

std::string momentText(Date date) {
    const auto seconds = secondsOf(date);
    const std::chrono::hh_mm_ss time(seconds - std::chrono::floor<std::chrono::days>(seconds));
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), " %02d.%02d.%02d",
                  static_cast<int>(time.hours().count()), static_cast<int>(time.minutes().count()),
                  static_cast<int>(time.seconds().count()));
    return dayText(date) + text.data();
}

std::optional<Date> dateOfText(std::string_view text) {
    const auto year = takeNumber(text, 4);
    const auto month = takeNumber(text, 2);
    const auto day = takeNumber(text, 2);
    if (!year || !month || !day)
        return std::nullopt;
    const std::chrono::year_month_day date{std::chrono::year(static_cast<int>(*year)),
                                           std::chrono::month(*month), std::chrono::day(*day)};
    if (!date.ok())
        return std::nullopt;
    std::int64_t seconds =
        std::chrono::sys_seconds(std::chrono::sys_days(date)).time_since_epoch().count();
    for (const std::int64_t unit : {3600, 60, 1}) {
        const auto part = takeNumber(text, 2);
        if (!part)
            break;
        seconds += unit * *part;
    }
    return Date::fromParts(seconds, 0);
}

} // namespace platform
