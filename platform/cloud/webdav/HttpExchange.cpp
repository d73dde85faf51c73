#include "platform/cloud/webdav/HttpExchange.h"

#include <algorithm>
#include <cstdlib>

namespace platform {
namespace {

std::string inSmallLetters(std::string_view text) {
    std::string small(text);
    std::transform(small.begin(), small.end(), small.begin(), [](char c) {
        return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    });
    return small;
}

} // namespace

void HttpExchange::stop(Failure why) {
    if (!failure)
        failure = why ? std::move(why) : Failure(makeError(ErrorCode::userCancelled));
}

std::size_t HttpExchange::onHeader(char* data, std::size_t, std::size_t size, void* user) {
    auto* const self = static_cast<HttpExchange*>(user);
    std::string_view line(data, size);
    while (!line.empty() && (line.back() == '\r' || line.back() == '\n'))
        line.remove_suffix(1);
    if (line.starts_with("HTTP/")) { // also after a 100, or a first answer of 401
        self->reply = {};
        const std::size_t blank = line.find(' ');
        if (blank != std::string_view::npos)
            self->reply.status = std::atoi(std::string(line.substr(blank + 1, 3)).c_str());
    } else if (const std::size_t colon = line.find(':'); colon != std::string_view::npos) {
        const std::size_t begin = line.find_first_not_of(" \t", colon + 1);
        self->reply.headers.emplace_back(
            inSmallLetters(line.substr(0, colon)),
            begin == std::string_view::npos ? std::string_view() : line.substr(begin));
    }
    return size;
}

std::size_t HttpExchange::onBody(char* data, std::size_t, std::size_t size, void* user) {
    auto* const self = static_cast<HttpExchange*>(user);
    if (self->cancel.isCancelled()) {
        self->stop({});
        return 0;
    }
    if (!self->reply.isGood() || !self->request.onBody)
        return size;
    if (Failure failure = self->request.onBody(
            self->reply, {reinterpret_cast<const std::byte*>(data), size})) {
        self->stop(std::move(failure));
        return 0;
    }
    return size;
}

std::size_t HttpExchange::onRead(char* buffer, std::size_t, std::size_t size, void* user) {
    auto* const self = static_cast<HttpExchange*>(user);
    std::size_t filled = 0;
    if (self->cancel.isCancelled())
        self->stop({});
    else if (Failure failure = self->fill({reinterpret_cast<std::byte*>(buffer), size}, filled))
        self->stop(std::move(failure));
    return self->failure ? CURL_READFUNC_ABORT : filled;
}

Failure HttpExchange::fill(std::span<std::byte> buffer, std::size_t& filled) {
    const HttpUpload& upload = *request.upload;
    const std::uint64_t left = upload.size - sent;
    if (left == 0)
        return std::nullopt;
    const Result<std::size_t> got =
        upload.read(sent, buffer.first(std::min<std::uint64_t>(buffer.size(), left)));
    if (!got)
        return got.error();
    if (*got == 0)
        return makeError(ErrorCode::changedWhileRead);
    filled = *got;
    sent += *got;
    // Before the last bytes leave: what the content is has to hold to its end.
    return sent == upload.size ? checkEnd() : std::nullopt;
}

Failure HttpExchange::checkEnd() const {
    std::byte more{};
    const Result<std::size_t> got = request.upload->read(request.upload->size, {&more, 1});
    if (!got)
        return got.error();
    return *got == 0 ? Failure() : Failure(makeError(ErrorCode::changedWhileRead));
}

int HttpExchange::onSeek(void* user, curl_off_t offset, int origin) {
    if (origin != SEEK_SET)
        return CURL_SEEKFUNC_CANTSEEK;
    static_cast<HttpExchange*>(user)->sent = static_cast<std::uint64_t>(offset);
    return CURL_SEEKFUNC_OK;
}

} // namespace platform
