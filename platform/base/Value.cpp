#include "platform/base/Value.h"

#include "platform/base/Describe.h"

#include <array>
#include <type_traits>

namespace platform {

std::optional<bool> Value::boolean() const {
    const bool* held = std::get_if<bool>(&data_);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<std::int64_t> Value::integer() const {
    if (const auto* held = std::get_if<std::int64_t>(&data_))
        return *held;
    const double* held = std::get_if<double>(&data_);
    if (!held || !(*held >= -9.2e18 && *held <= 9.2e18))
        return std::nullopt;
    return static_cast<std::int64_t>(*held);
}

std::optional<double> Value::number() const {
    if (const auto* held = std::get_if<std::int64_t>(&data_))
        return static_cast<double>(*held);
    const double* held = std::get_if<double>(&data_);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<Date> Value::date() const {
    const Date* held = std::get_if<Date>(&data_);
    return held ? std::optional(*held) : std::nullopt;
}

const Value::List* Value::list() const {
    const auto* held = std::get_if<std::shared_ptr<const List>>(&data_);
    return held ? held->get() : nullptr;
}

const Value::Map* Value::map() const {
    const auto* held = std::get_if<std::shared_ptr<const Map>>(&data_);
    return held ? held->get() : nullptr;
}

bool Value::operator==(const Value& other) const {
    if (const List* mine = list())
        return other.list() && *mine == *other.list();
    if (const Map* mine = map())
        return other.map() && *mine == *other.map();
    return data_ == other.data_;
}

std::string_view Value::kindName() const {
    static constexpr std::array<std::string_view, 10> names = {
        "None", "Boolean", "Integer", "Number", "Text", "Bytes", "Date", "URL", "List", "Map"};
    static_assert(names.size() == std::variant_size_v<decltype(data_)>);
    return names[data_.index()];
}

void Value::describeTo(std::string& out) const {
    std::visit(
        [&out](const auto& held) {
            using Held = std::decay_t<decltype(held)>;
            if constexpr (std::is_same_v<Held, std::monostate>)
                out += "(null)";
            else if constexpr (std::is_same_v<Held, Bytes>)
                out += "<" + std::to_string(held.size()) + " bytes>";
            else if constexpr (std::is_same_v<Held, std::shared_ptr<const Value::List>> ||
                               std::is_same_v<Held, std::shared_ptr<const Value::Map>>)
                describe(out, *held);
            else
                describe(out, held);
        },
        data_);
}

} // namespace platform
