#pragma once

#include "platform/base/Value.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// Random bytes from the kernel, for identity tokens and marks that must never meet twice.
Bytes randomBytes(std::size_t count);

std::string hexText(const Bytes& bytes);
/// None when the text is not pairs of hexadecimal digits.
std::optional<Bytes> bytesOfHex(std::string_view text);

std::string hexText(std::uint64_t number);
std::optional<std::uint64_t> numberOfHex(std::string_view text);

} // namespace platform
