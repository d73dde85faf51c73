#pragma once

#include "platform/system/SingleInstance.h"

#include <string_view>

namespace platform {

/// What two instances say to each other on their socket: one frame with the request, one line with
/// the answer. A frame is "TVRN", the length of what follows (four bytes, the highest first), and
/// texts that each end in a NUL: the activation token, then the URLs.
Failure checkRequestLimits(const OpenRequest& request);
std::string frameOf(const OpenRequest& request);

/// Puts a frame together from pieces as they arrive.
class FrameReader {
public:
    enum class State { wantsMore, complete, broken };
    State take(std::string_view piece);
    /// Once it is complete.
    OpenRequest request() const;

private:
    std::string bytes_;
};

inline constexpr std::string_view acceptedAnswer = "ok\n";

} // namespace platform
