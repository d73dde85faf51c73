#pragma once

#include "platform/base/Value.h"

#include <nlohmann/json_fwd.hpp>

namespace platform {

/// Values as JSON that a person can read and that reads back as the same value: what JSON has no
/// word for is an object with one key, "$bytes", "$date" (nanoseconds since 1970), "$url", "$text"
/// (text that is not UTF-8, in hexadecimal), "$real" (a number that is not finite) or "$map" (a
/// map whose keys could be taken for one of these). For sources of the platform only: it shows the
/// library.
nlohmann::json jsonFromValue(const Value& value);
/// None for what is none of our forms. Nested deeper than any sensible setting, it is cut off.
Value valueFromJson(const nlohmann::json& json);

/// The same for the whole content of a file; none when it is no JSON object.
std::optional<Value::Map> mapFromJsonText(std::string_view text);
std::string jsonTextFromMap(const Value::Map& map);

} // namespace platform
