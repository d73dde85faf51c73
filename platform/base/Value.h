#pragma once

#include "platform/base/Date.h"
#include "platform/base/Url.h"

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace platform {

using Bytes = std::vector<std::byte>;

/// A value of preferences, attributes, restoration state and the synced key-value store: none, a
/// boolean, a number, text, bytes, a date, a URL, a list or a map of values. Immutable once made
/// (lists and maps are shared between copies). The typed reads answer none for another kind; only
/// integer() and number() read each other's kinds.
class Value {
public:
    using List = std::vector<Value>;
    using Map = std::map<std::string, Value, std::less<>>;

    Value() = default;
    Value(bool v) : data_(v) {}                           // NOLINT(google-explicit-constructor)
    Value(int v) : data_(static_cast<std::int64_t>(v)) {} // NOLINT(google-explicit-constructor)
    Value(std::int64_t v) : data_(v) {}                   // NOLINT(google-explicit-constructor)
    Value(double v) : data_(v) {}                         // NOLINT(google-explicit-constructor)
    Value(const char* v) : data_(std::string(v)) {}       // NOLINT(google-explicit-constructor)
    Value(std::string v) : data_(std::move(v)) {}         // NOLINT(google-explicit-constructor)
    Value(std::string_view v) : data_(std::string(v)) {}  // NOLINT(google-explicit-constructor)
    Value(Bytes v) : data_(std::move(v)) {}               // NOLINT(google-explicit-constructor)
    Value(Date v) : data_(v) {}                           // NOLINT(google-explicit-constructor)
    Value(Url v) : data_(std::move(v)) {}                 // NOLINT(google-explicit-constructor)
    Value(List v) : data_(std::make_shared<const List>(std::move(v))) {} // NOLINT
    Value(Map v) : data_(std::make_shared<const Map>(std::move(v))) {}   // NOLINT

    bool isNone() const { return std::holds_alternative<std::monostate>(data_); }
    bool isNumber() const {
        return std::holds_alternative<std::int64_t>(data_) || std::holds_alternative<double>(data_);
    }
    std::optional<bool> boolean() const;
    /// A double is truncated toward zero; one outside the range of 64 bits answers none.
    std::optional<std::int64_t> integer() const;
    std::optional<double> number() const;
    const std::string* text() const { return std::get_if<std::string>(&data_); }
    const Bytes* bytes() const { return std::get_if<Bytes>(&data_); }
    std::optional<Date> date() const;
    const Url* url() const { return std::get_if<Url>(&data_); }
    const List* list() const;
    const Map* map() const;

    bool operator==(const Value& other) const;
    /// "None", "Boolean", "Integer", …: for messages about a value of the wrong kind.
    std::string_view kindName() const;
    void describeTo(std::string& out) const;

private:
    std::variant<std::monostate, bool, std::int64_t, double, std::string, Bytes, Date, Url,
                 std::shared_ptr<const List>, std::shared_ptr<const Map>>
        data_;
};

/// For values themselves only: what merely converts to one is described as what it is.
template<std::same_as<Value> V>
void appendDescription(std::string& out, const V& value) {
    value.describeTo(out);
}

} // namespace platform
