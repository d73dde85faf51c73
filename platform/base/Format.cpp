#include "platform/base/Format.h"

#include <array>
#include <charconv>

namespace platform {
namespace {

void appendReal(std::string& out, double number, std::chars_format shape, int precision) {
    std::array<char, 400> buffer{};
    const auto [end, fault] =
        std::to_chars(buffer.data(), buffer.data() + buffer.size(), number, shape, precision);
    if (fault == std::errc())
        out.append(buffer.data(), end);
}

template<class Integer>
void appendInteger(std::string& out, Integer number, int base) {
    std::array<char, 72> buffer{};
    const auto [end, fault] =
        std::to_chars(buffer.data(), buffer.data() + buffer.size(), number, base);
    if (fault == std::errc())
        out.append(buffer.data(), end);
}

void appendArgument(std::string& out, char conversion, const FormatArgument& argument) {
    if (!placeholderAccepts(conversion, argument.kind) || conversion == '@' || conversion == 's') {
        argument.describe(out, argument.object);
        return;
    }
    switch (conversion) {
    case 'd':
        if (argument.kind == ArgumentKind::signedInteger)
            appendInteger(out, argument.integer, 10);
        else
            appendInteger(out, static_cast<std::uint64_t>(argument.integer), 10);
        break;
    case 'u':
        appendInteger(out, static_cast<std::uint64_t>(argument.integer), 10);
        break;
    case 'x':
        appendInteger(out, static_cast<std::uint64_t>(argument.integer), 16);
        break;
    case 'f':
        appendReal(out, argument.real, std::chars_format::fixed, 6);
        break;
    default:
        appendReal(out, argument.real, std::chars_format::general, 6);
        break;
    }
}

} // namespace

void describe(std::string& out, double number) {
    std::array<char, 64> buffer{};
    const auto [end, fault] = std::to_chars(buffer.data(), buffer.data() + buffer.size(), number);
    if (fault == std::errc())
        out.append(buffer.data(), end);
}

void appendFormatted(std::string& out, std::string_view format,
                     std::span<const FormatArgument> arguments) {
    std::size_t next = 0;
    while (!format.empty()) {
        const std::size_t percent = format.find('%');
        out += format.substr(0, percent);
        if (percent == std::string_view::npos)
            return;
        format.remove_prefix(percent);
        const Placeholder found = parsePlaceholder(format);
        if (found.conversion == 0) {
            out += '%';
            format.remove_prefix(1);
            continue;
        }
        const std::string_view raw = format.substr(0, found.length);
        format.remove_prefix(found.length);
        if (found.conversion == '%') {
            out += '%';
            continue;
        }
        const std::size_t index = found.position ? found.position - 1 : next++;
        if (index < arguments.size())
            appendArgument(out, found.conversion, arguments[index]);
        else
            out += raw;
    }
}

std::string formatRuntime(std::string_view format, std::span<const FormatArgument> arguments) {
    std::string out;
    out.reserve(format.size() + arguments.size() * 24);
    appendFormatted(out, format, arguments);
    return out;
}

} // namespace platform
