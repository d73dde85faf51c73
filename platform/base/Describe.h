#pragma once

#include <concepts>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace platform {

void describe(std::string& out, double number);

/// Types that say of themselves how "%@" writes them, by an `appendDescription(std::string&, T)`
/// found by argument-dependent look-up.
template<class T>
concept SelfDescribing = requires(std::string& out, const T& value) {
    appendDescription(out, value);
};

template<class T>
concept TextLike = std::convertible_to<const T&, std::string_view>;

template<class T>
concept PairLike = requires(const T& pair) {
    pair.first;
    pair.second;
};

template<class T>
concept RangeLike = !TextLike<T> && requires(const T& range) {
    range.begin();
    range.end();
};

template<class T>
struct IsOptional : std::false_type {};
template<class T>
struct IsOptional<std::optional<T>> : std::true_type {};

template<class T>
concept PointerLike = !TextLike<T> && (std::is_pointer_v<T> || requires(const T& p) {
    p.get();
    *p;
});

/// Anything "%@" can write.
template<class T>
concept Describable = SelfDescribing<T> || TextLike<T> || std::is_arithmetic_v<T> ||
    IsOptional<T>::value || RangeLike<T> || PairLike<T> || PointerLike<T>;

/// Appends what "%@" writes for the value: text as it is, numbers in decimal, booleans as 0 and 1,
/// "(null)" for none, the elements of a range in brackets.
template<Describable T>
void describe(std::string& out, const T& value) {
    if constexpr (SelfDescribing<T>) {
        appendDescription(out, value);
    } else if constexpr (std::is_convertible_v<const T&, const char*>) {
        const char* text = value;
        out += text ? std::string_view(text) : std::string_view("(null)");
    } else if constexpr (TextLike<T>) {
        out += std::string_view(value);
    } else if constexpr (std::is_same_v<T, bool>) {
        out += value ? '1' : '0';
    } else if constexpr (std::is_floating_point_v<T>) {
        describe(out, static_cast<double>(value));
    } else if constexpr (std::is_arithmetic_v<T>) {
        out += std::to_string(value);
    } else if constexpr (IsOptional<T>::value || PointerLike<T>) {
        if (value)
            describe(out, *value);
        else
            out += "(null)";
    } else if constexpr (PairLike<T>) {
        describe(out, value.first);
        out += " = ";
        describe(out, value.second);
    } else {
        out += '(';
        bool first = true;
        for (const auto& element : value) {
            if (!std::exchange(first, false))
                out += ", ";
            describe(out, element);
        }
        out += ')';
    }
}

template<Describable T>
std::string description(const T& value) {
    std::string out;
    describe(out, value);
    return out;
}

} // namespace platform
