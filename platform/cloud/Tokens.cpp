#include "platform/cloud/Tokens.h"

#include <array>
#include <charconv>
#include <random>
#include <sys/random.h>

namespace platform {
namespace {

std::optional<std::byte> byteOfHex(std::string_view pair) {
    unsigned value = 0;
    const auto [end, fault] = std::from_chars(pair.data(), pair.data() + pair.size(), value, 16);
    if (fault != std::errc{} || end != pair.data() + pair.size())
        return std::nullopt;
    return static_cast<std::byte>(value);
}

} // namespace

Bytes randomBytes(std::size_t count) {
    Bytes bytes(count);
    std::size_t filled = 0;
    while (filled < count) {
        const ssize_t got = getrandom(bytes.data() + filled, count - filled, 0);
        if (got > 0) {
            filled += static_cast<std::size_t>(got);
            continue;
        }
        // A kernel without the call: the library reads the random device.
        std::random_device device;
        for (; filled < count; ++filled)
            bytes[filled] = static_cast<std::byte>(device());
    }
    return bytes;
}

std::string hexText(const Bytes& bytes) {
    static constexpr std::string_view digits = "0123456789abcdef";
    std::string text;
    text.reserve(bytes.size() * 2);
    for (const std::byte byte : bytes) {
        text.push_back(digits[std::to_integer<unsigned>(byte) >> 4]);
        text.push_back(digits[std::to_integer<unsigned>(byte) & 15]);
    }
    return text;
}

std::optional<Bytes> bytesOfHex(std::string_view text) {
    if (text.size() % 2 != 0)
        return std::nullopt;
    Bytes bytes;
    bytes.reserve(text.size() / 2);
    for (std::size_t i = 0; i < text.size(); i += 2) {
        const std::optional<std::byte> byte = byteOfHex(text.substr(i, 2));
        if (!byte)
            return std::nullopt;
        bytes.push_back(*byte);
    }
    return bytes;
}

std::string hexText(std::uint64_t number) {
    std::array<char, 16> text{};
    const auto [end, fault] = std::to_chars(text.data(), text.data() + text.size(), number, 16);
    return {text.data(), end};
}

std::optional<std::uint64_t> numberOfHex(std::string_view text) {
    std::uint64_t number = 0;
    const auto [end, fault] = std::from_chars(text.data(), text.data() + text.size(), number, 16);
    if (text.empty() || fault != std::errc{} || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

} // namespace platform
