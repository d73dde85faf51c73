#pragma once

#include "platform/base/Value.h"

#include <cstddef>
#include <memory>
#include <span>
#include <string_view>

namespace platform {

/// The SHA-256 of a content that arrives in pieces: what proves that two contents are the same.
class ContentHash {
public:
    ContentHash();
    ~ContentHash();
    ContentHash(const ContentHash&) = delete;
    ContentHash& operator=(const ContentHash&) = delete;

    void add(std::span<const std::byte> piece);
    /// Ends the computation; 32 bytes.
    Bytes finish();

    static Bytes of(std::string_view content);

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
