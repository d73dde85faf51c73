#pragma once

#include "platform/files/FileDescriptor.h"

#include <atomic>
#include <functional>
#include <optional>
#include <string>
#include <thread>
#include <vector>

namespace test {

struct WireRequest {
    std::string method;
    std::string target;
    /// "Name: value"
    std::vector<std::string> headers;
    std::string body;
    /// "" where there is none.
    std::string header(std::string_view name) const;
};

struct WireReply {
    int status = 200;
    std::vector<std::string> headers = {};
    std::string body = {};
    /// So many bytes of it are sent, and then the connection ends; all without.
    std::optional<std::size_t> cut = {};
    /// Nothing at all comes, and the connection stays.
    bool silent = false;
    /// The headers say how long the body is; else the host does.
    bool ownLength = false;
};

/// A server on loopback that answers what it is told to. The answers are asked for on threads of
/// its own, one a connection.
class HttpHost {
public:
    using Answer = std::function<WireReply(const WireRequest& request)>;
    explicit HttpHost(Answer answer);
    ~HttpHost();
    HttpHost(const HttpHost&) = delete;
    HttpHost& operator=(const HttpHost&) = delete;

    const std::string& authority() const { return authority_; }
    std::string url() const { return "http://" + authority_ + '/'; }

private:
    void accept();
    void serve(int connection);

    Answer answer_;
    platform::FileDescriptor socket_;
    std::string authority_;
    std::atomic<bool> ending_{false};
    std::atomic<int> serving_{0};
    std::thread acceptor_;
};

/// A port of loopback that is free now.
int freePort();
/// A connection; none when nobody listens.
platform::FileDescriptor connectTo(const std::string& authority);
/// Reads until the text or the end; answers what came, all of it.
std::string readUntil(int connection, std::string_view end);
bool sendAll(int connection, std::string_view text);

} // namespace test
