#pragma once

#include "platform/base/Error.h"

#include <utility>
#include <variant>

namespace platform {

/// A value, or the error that stood in its way. Test before reading: value() on an error, or
/// error() on a value, is a programming fault and terminates.
template<class T>
class [[nodiscard]] Result {
public:
    Result(T value) : state_(std::in_place_index<0>, std::move(value)) {}     // NOLINT
    Result(Error error) : state_(std::in_place_index<1>, std::move(error)) {} // NOLINT

    bool ok() const { return state_.index() == 0; }
    explicit operator bool() const { return ok(); }

    const T& value() const& { return std::get<0>(state_); }
    T& value() & { return std::get<0>(state_); }
    T&& value() && { return std::get<0>(std::move(state_)); }
    const T& operator*() const& { return value(); }
    T& operator*() & { return value(); }
    T&& operator*() && { return std::move(*this).value(); }
    const T* operator->() const { return &value(); }
    T* operator->() { return &value(); }

    const Error& error() const { return std::get<1>(state_); }
    /// The value, or none with the error dropped.
    std::optional<T> toOptional() const { return ok() ? std::optional<T>(value()) : std::nullopt; }

private:
    std::variant<T, Error> state_;
};

/// The result of an operation that yields nothing but success: none means success.
using Failure = std::optional<Error>;

} // namespace platform
