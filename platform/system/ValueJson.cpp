#include "platform/system/ValueJson.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <nlohmann/json.hpp>
#include <span>

namespace platform {
namespace {

using nlohmann::json;

constexpr int depthLimit = 64;
constexpr std::string_view digits = "0123456789abcdef";

std::string hexFromBytes(std::span<const std::byte> bytes) {
    std::string out;
    out.reserve(bytes.size() * 2);
    for (const std::byte byte : bytes) {
        out += digits[std::to_integer<std::size_t>(byte >> 4)];
        out += digits[std::to_integer<std::size_t>(byte & std::byte{15})];
    }
    return out;
}

std::optional<Bytes> bytesFromHex(const std::string& text) {
    Bytes bytes;
    bytes.reserve(text.size() / 2);
    for (std::size_t i = 0; i < text.size(); i += 2) {
        unsigned value = 0;
        const char* const end = text.data() + std::min(i + 2, text.size());
        if (std::from_chars(text.data() + i, end, value, 16).ptr != end || text.size() % 2 != 0)
            return std::nullopt;
        bytes.push_back(static_cast<std::byte>(value));
    }
    return bytes;
}

/// Well-formed UTF-8 as JSON demands it: shortest forms, no surrogates, nothing above U+10FFFF.
bool isUtf8(std::string_view text) {
    for (std::size_t i = 0; i < text.size();) {
        const auto lead = static_cast<unsigned char>(text[i]);
        const std::size_t length = lead < 0x80 ? 1 : lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
        if ((lead >= 0x80 && lead < 0xC2) || lead > 0xF4 || i + length > text.size())
            return false;
        std::uint32_t point = length == 1 ? lead : lead & (0x7FU >> length);
        for (std::size_t k = 1; k < length; ++k) {
            const auto next = static_cast<unsigned char>(text[i + k]);
            if ((next & 0xC0U) != 0x80)
                return false;
            point = point << 6U | (next & 0x3FU);
        }
        if ((length == 3 && point < 0x800) || (length == 4 && point < 0x10000) ||
            (point >= 0xD800 && point <= 0xDFFF) || point > 0x10FFFF)
            return false;
        i += length;
    }
    return true;
}

json tagged(const char* tag, json content) {
    json out = json::object();
    out[tag] = std::move(content);
    return out;
}

json jsonFromText(const std::string& text) {
    if (isUtf8(text))
        return text;
    return tagged("$text", hexFromBytes(std::as_bytes(std::span(text))));
}

json jsonFromMap(const Value::Map& map) {
    json object = json::object();
    json pairs = json::array();
    bool plain = true;
    for (const auto& [key, value] : map) {
        plain = plain && !key.starts_with('$') && isUtf8(key);
        pairs.push_back(json::array({jsonFromText(key), jsonFromValue(value)}));
        if (plain)
            object[key] = pairs.back()[1];
    }
    return plain ? object : tagged("$map", std::move(pairs));
}

json jsonFromNumber(double number) {
    if (std::isfinite(number))
        return number;
    return tagged("$real", std::isnan(number) ? "nan" : number > 0 ? "inf" : "-inf");
}

Value readValue(const json& source, int depth);

Value mapFromPairs(const json& pairs, int depth) {
    Value::Map map;
    for (const json& pair : pairs) {
        if (!pair.is_array() || pair.size() != 2)
            return {};
        const Value key = readValue(pair[0], depth);
        if (!key.text())
            return {};
        map.insert_or_assign(*key.text(), readValue(pair[1], depth));
    }
    return map;
}

Value realFromText(const std::string& text) {
    if (text == "nan")
        return std::nan("");
    return text == "inf" ? HUGE_VAL : -HUGE_VAL;
}

Value urlFromText(const std::string& text) {
    if (text.empty())
        return Url();
    const std::optional<Url> url = Url::parse(text);
    return url ? Value(*url) : Value();
}

/// An object with one key that begins with "$"; none when the content does not fit the key.
Value valueFromTagged(const std::string& tag, const json& content, int depth) {
    if (tag == "$date" && content.is_number_integer())
        return Date{content.get<std::int64_t>()};
    if (tag == "$map" && content.is_array())
        return mapFromPairs(content, depth);
    if (!content.is_string())
        return {};
    const auto& text = content.get_ref<const std::string&>();
    if (tag == "$url")
        return urlFromText(text);
    if (tag == "$real")
        return realFromText(text);
    const std::optional<Bytes> bytes = bytesFromHex(text);
    if (!bytes)
        return {};
    if (tag == "$bytes")
        return *bytes;
    if (tag == "$text")
        return std::string(reinterpret_cast<const char*>(bytes->data()), bytes->size());
    return {};
}

Value valueFromObject(const json& source, int depth) {
    if (source.size() == 1 && source.begin().key().starts_with('$'))
        return valueFromTagged(source.begin().key(), source.begin().value(), depth);
    Value::Map map;
    for (const auto& [key, value] : source.items())
        map.emplace(key, readValue(value, depth));
    return map;
}

Value readValue(const json& source, int depth) {
    if (depth == 0)
        return {};
    switch (source.type()) {
    case json::value_t::boolean:
        return source.get<bool>();
    case json::value_t::number_integer:
        return source.get<std::int64_t>();
    case json::value_t::number_unsigned:
        if (source.get<std::uint64_t>() > static_cast<std::uint64_t>(INT64_MAX))
            return source.get<double>();
        return source.get<std::int64_t>();
    case json::value_t::number_float:
        return source.get<double>();
    case json::value_t::string:
        return source.get<std::string>();
    case json::value_t::array: {
        Value::List list;
        for (const json& element : source)
            list.push_back(readValue(element, depth - 1));
        return list;
    }
    case json::value_t::object:
        return valueFromObject(source, depth - 1);
    default:
        return {};
    }
}

} // namespace

json jsonFromValue(const Value& value) {
    if (const auto flag = value.boolean())
        return *flag;
    if (value.isNumber()) {
        // A whole real number stays a real number: it is written with its ".0".
        const std::optional<std::int64_t> whole = value.integer();
        return whole && value == Value(*whole) ? json(*whole) : jsonFromNumber(*value.number());
    }
    if (value.text())
        return jsonFromText(*value.text());
    if (value.bytes())
        return tagged("$bytes", hexFromBytes(*value.bytes()));
    if (value.date())
        return tagged("$date", value.date()->nanoseconds);
    if (value.url())
        return tagged("$url", value.url()->absoluteString());
    if (value.map())
        return jsonFromMap(*value.map());
    if (!value.list())
        return nullptr;
    json list = json::array();
    for (const Value& element : *value.list())
        list.push_back(jsonFromValue(element));
    return list;
}

Value valueFromJson(const json& source) {
    return readValue(source, depthLimit);
}

std::optional<Value::Map> mapFromJsonText(std::string_view text) {
    const json parsed = json::parse(text, nullptr, false);
    if (!parsed.is_object())
        return std::nullopt;
    const Value value = valueFromJson(parsed);
    return value.map() ? std::optional(*value.map()) : std::nullopt;
}

std::string jsonTextFromMap(const Value::Map& map) {
    return jsonFromMap(map).dump(2) + '\n';
}

} // namespace platform
