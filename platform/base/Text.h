#pragma once

#include "platform/base/Format.h"

#include <span>
#include <string>
#include <string_view>
#include <type_traits>

namespace platform {

/// The localisation table: English text (or a ".DICT." key) to the text of the user's language.
/// Reads only after start-up, from any thread.

/// Loads the table of `language` (an ISO code such as "de", or a locale such as "de_AT"); English
/// when that language has none. Answers the code of the table in use. Main thread, at start-up.
std::string loadLocalizedTexts(std::string_view language);
/// The language that the user's environment asks for.
std::string systemLanguage();

/// The text of a key; the key itself when the table lacks it.
std::string localized(std::string_view key);
/// The plural form that fits `count`, with the count filled in. For ".DICT.….%d" keys.
std::string localizedPlural(std::string_view key, long long count);
/// The same for a real number that only chooses the form; `text` is what is written for it.
/// For ".DICT.….%g" keys.
std::string localizedPluralText(std::string_view key, double number, std::string_view text);

/// A whole number in the figures and groups of the user's language.
std::string localizedNumber(long long number);

/// What a localised format writes for an argument: a count in the language's own figures.
template<class T>
decltype(auto) localizedArgument(const T& value) {
    if constexpr (std::is_integral_v<T> && !std::is_same_v<T, bool>)
        return localizedNumber(static_cast<long long>(value));
    else
        return (value);
}

/// A localised format ("“%1$@” is %2$@") filled with the arguments.
template<class... Args>
std::string localizedFormat(std::string_view key, const Args&... args) {
    const auto fill = [key](const auto&... shown) {
        const std::array<FormatArgument, sizeof...(Args)> arguments{makeFormatArgument(shown)...};
        return formatRuntime(localized(key), arguments);
    };
    return fill(localizedArgument(args)...);
}

} // namespace platform
