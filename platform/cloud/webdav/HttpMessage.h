#pragma once

#include "platform/base/Date.h"
#include "platform/base/Result.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

// What is asked of a server, and what it answers.

namespace platform {

struct HttpReply {
    int status = 0;
    /// Names in small letters; values as they came.
    std::vector<std::pair<std::string, std::string>> headers = {};
    /// Where the answer came from; differs from the request where the server sent on.
    std::string url = {};

    bool isGood() const { return status >= 200 && status < 300; }
    /// "" where there is none.
    std::string_view header(std::string_view name) const;
    std::optional<std::uint64_t> number(std::string_view name) const;
    /// What the server's clock showed.
    std::optional<Date> date() const;
};

/// A body that goes up. `read` fills the buffer from `offset` and answers how much, 0 at the end.
struct HttpUpload {
    std::uint64_t size = 0;
    std::function<Result<std::size_t>(std::uint64_t offset, std::span<std::byte> buffer)> read;
};

struct HttpRequest {
    std::string method;
    std::string url;
    /// "Name: value"
    std::vector<std::string> headers = {};
    /// Of requests such as PROPFIND.
    std::string body = {};
    std::optional<HttpUpload> upload = {};
    /// Takes the body of a good answer; an error ends the request with it. Of other answers nothing
    /// is kept.
    std::function<Failure(const HttpReply& head, std::span<const std::byte> piece)> onBody = {};
};

/// Why there is no answer to branch on.
enum class HttpTrouble {
    none,
    /// By the caller: cancelled, or one of its functions had an error.
    caller,
    /// No connection came about: the server has not seen the request.
    unreachable,
    certificate,
    /// The connection broke: what was asked may have been done.
    broken,
    /// Nothing came any more, and it was given up: the same.
    stalled,
    password,
    /// The server asked to wait, and did nothing.
    wait,
    /// It sends on to somewhere else, where nothing is sent.
    elsewhere
};

struct HttpResult {
    HttpTrouble trouble = HttpTrouble::none;
    /// Set exactly when there is trouble.
    Failure failure = {};
    HttpReply reply = {};
    bool ok() const { return trouble == HttpTrouble::none; }
    bool isGood() const { return ok() && reply.isGood(); }
    /// What was asked may have been done, or not.
    bool isOpen() const {
        return trouble == HttpTrouble::broken || trouble == HttpTrouble::stalled;
    }
    /// A change was made, whole: a 207 tells of parts that were not, a 202 of what is not yet.
    bool isMade() const { return isGood() && reply.status != 207 && reply.status != 202; }
};

/// "Sun, 06 Nov 1994 08:49:37 GMT"; none when it is no date.
std::optional<Date> dateOfHttpText(std::string_view text);

} // namespace platform
