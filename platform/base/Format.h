#pragma once

#include "platform/base/Describe.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace platform {

/// What an argument is, as far as a placeholder cares.
enum class ArgumentKind { signedInteger, unsignedInteger, real, object };

template<class T>
constexpr ArgumentKind argumentKindOf() {
    if constexpr (std::is_same_v<T, bool> || (std::is_integral_v<T> && std::is_unsigned_v<T>))
        return ArgumentKind::unsignedInteger;
    else if constexpr (std::is_integral_v<T>)
        return ArgumentKind::signedInteger;
    else if constexpr (std::is_floating_point_v<T>)
        return ArgumentKind::real;
    else
        return ArgumentKind::object;
}

/// A reference to one argument: valid while the argument lives, that is within the call.
struct FormatArgument {
    ArgumentKind kind;
    const void* object;
    void (*describe)(std::string& out, const void* object);
    std::int64_t integer;
    double real;
};

template<class T>
FormatArgument makeFormatArgument(const T& value) {
    FormatArgument argument{argumentKindOf<T>(), &value, nullptr, 0, 0};
    argument.describe = [](std::string& out, const void* object) {
        describe(out, *static_cast<const T*>(object));
    };
    if constexpr (std::is_integral_v<T>)
        argument.integer = static_cast<std::int64_t>(value);
    else if constexpr (std::is_floating_point_v<T>)
        argument.real = static_cast<double>(value);
    return argument;
}

/// One placeholder of a format string.
struct Placeholder {
    /// '@', 's', 'd', 'u', 'x', 'f' or 'g'; '%' for "%%"; 0 for text that is no placeholder.
    char conversion = 0;
    /// 1-based position of "%2$@"; 0 when the placeholder takes the next argument.
    std::size_t position = 0;
    /// Characters, the "%" included.
    std::size_t length = 0;
};

/// Reads the placeholder at the head of `text` (which starts with "%"). Understood: "%@", "%s",
/// "%d", "%i", "%u", "%x", "%f", "%g", "%%", with "l" length marks and "1$" positions.
constexpr Placeholder parsePlaceholder(std::string_view text) {
    std::size_t i = 1;
    std::size_t number = 0;
    while (i < text.size() && text[i] >= '0' && text[i] <= '9')
        number = number * 10 + static_cast<std::size_t>(text[i++] - '0');
    std::size_t position = 0;
    if (i > 1) {
        if (i >= text.size() || text[i] != '$' || number == 0)
            return {};
        position = number;
        ++i;
    }
    while (i < text.size() && text[i] == 'l')
        ++i;
    if (i >= text.size())
        return {};
    const char conversion = text[i] == 'i' ? 'd' : text[i];
    if (std::string_view("@sduxfg%").find(conversion) == std::string_view::npos)
        return {};
    return {conversion, position, i + 1};
}

constexpr bool placeholderAccepts(char conversion, ArgumentKind kind) {
    switch (conversion) {
    case '@':
        return true;
    case 's':
        return kind == ArgumentKind::object;
    case 'd':
    case 'u':
    case 'x':
        return kind == ArgumentKind::signedInteger || kind == ArgumentKind::unsignedInteger;
    default:
        return kind == ArgumentKind::real;
    }
}

/// Fills a format that is only known at run time (a translation). An argument that its placeholder
/// does not accept is described as "%@" would; a placeholder without an argument stays as it is.
std::string formatRuntime(std::string_view format, std::span<const FormatArgument> arguments);
void appendFormatted(std::string& out, std::string_view format,
                     std::span<const FormatArgument> arguments);

/// A literal format string whose placeholders fit `Args`; anything else does not compile.
template<class... Args>
class FormatString {
public:
    consteval FormatString(const char* text) : text_(text) { // NOLINT(google-explicit-constructor)
        constexpr std::size_t count = sizeof...(Args);
        constexpr std::array<ArgumentKind, count + 1> kinds = {argumentKindOf<Args>()...,
                                                               ArgumentKind::object};
        std::size_t next = 0;
        std::array<bool, count + 1> used{};
        for (std::size_t i = 0; i < text_.size();) {
            if (text_[i] != '%') {
                ++i;
                continue;
            }
            const Placeholder found = parsePlaceholder(text_.substr(i));
            if (found.conversion == 0)
                throw "format: not a placeholder";
            i += found.length;
            if (found.conversion == '%')
                continue;
            const std::size_t index = found.position ? found.position - 1 : next++;
            if (index >= count)
                throw "format: more placeholders than arguments";
            if (!placeholderAccepts(found.conversion, kinds[index]))
                throw "format: the argument is not of the placeholder's kind";
            used[index] = true;
        }
        for (std::size_t i = 0; i < count; ++i)
            if (!used[i])
                throw "format: an argument is never used";
    }
    constexpr std::string_view text() const { return text_; }

private:
    std::string_view text_;
};

/// The format filled with the arguments. Locale-independent: decimal point, no grouping.
template<class... Args>
std::string format(std::type_identity_t<FormatString<Args...>> text, const Args&... args) {
    const std::array<FormatArgument, sizeof...(Args)> arguments{makeFormatArgument(args)...};
    return formatRuntime(text.text(), arguments);
}

} // namespace platform
