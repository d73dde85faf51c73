#pragma once

#include "platform/cloud/webdav/HttpClient.h"

#include <curl/curl.h>

#include <memory>

// Private to the HTTP client: includes the library's header.

namespace platform {

template<auto close>
struct CurlCloser {
    template<class Handle>
    void operator()(Handle* handle) const {
        close(handle);
    }
};

/// One request on its way, as the library's functions see it.
struct HttpExchange {
    const HttpRequest& request;
    CancelFlag& cancel;
    HttpReply reply = {};
    /// Why the caller's side ended it.
    Failure failure = {};
    std::uint64_t sent = 0;
    std::unique_ptr<curl_slist, CurlCloser<&curl_slist_free_all>> headers = nullptr;
    std::optional<WebDavCredentials> credentials = {};
    char detail[CURL_ERROR_SIZE] = {};

    /// None means that somebody cancelled.
    void stop(Failure why);
    /// The content that goes up has come to its end where it should.
    Failure checkEnd() const;

    static std::size_t onHeader(char* data, std::size_t, std::size_t size, void* user);
    static std::size_t onBody(char* data, std::size_t, std::size_t size, void* user);
    static std::size_t onRead(char* buffer, std::size_t, std::size_t size, void* user);
    static int onSeek(void* user, curl_off_t offset, int origin);

private:
    Failure fill(std::span<std::byte> buffer, std::size_t& filled);
};

} // namespace platform
