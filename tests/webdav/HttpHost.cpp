#include "tests/webdav/HttpHost.h"

#include <algorithm>
#include <arpa/inet.h>
#include <cctype>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace test {
namespace {

constexpr int pollMilliseconds = 20;

sockaddr_in loopback(int port) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    return address;
}

platform::FileDescriptor listener(int& port) {
    platform::FileDescriptor socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in address = loopback(0);
    bind(socket.get(), reinterpret_cast<sockaddr*>(&address), sizeof address);
    listen(socket.get(), 64);
    socklen_t size = sizeof address;
    getsockname(socket.get(), reinterpret_cast<sockaddr*>(&address), &size);
    port = ntohs(address.sin_port);
    return socket;
}

std::string headerIn(const std::vector<std::string>& headers, std::string_view name) {
    for (const std::string& header : headers)
        if (header.size() > name.size() && header[name.size()] == ':' &&
            std::equal(name.begin(), name.end(), header.begin(),
                       [](char a, char b) { return std::tolower(a) == std::tolower(b); }))
            return header.substr(std::min(header.size(), name.size() + 2));
    return {};
}

std::optional<WireRequest> requestFrom(int connection) {
    std::string text = readUntil(connection, "\r\n\r\n");
    const std::size_t end = text.find("\r\n\r\n");
    if (end == std::string::npos)
        return std::nullopt;
    WireRequest request;
    request.body = text.substr(end + 4);
    text.resize(end + 2);
    for (std::size_t begin = 0; begin < text.size();) {
        const std::size_t line = text.find("\r\n", begin);
        request.headers.push_back(text.substr(begin, line - begin));
        begin = line + 2;
    }
    const std::string first = request.headers.front();
    request.headers.erase(request.headers.begin());
    const std::size_t blank = first.find(' ');
    request.method = first.substr(0, blank);
    request.target = first.substr(blank + 1, first.rfind(' ') - blank - 1);
    if (!request.header("Expect").empty())
        sendAll(connection, "HTTP/1.1 100 Continue\r\n\r\n");
    const std::string length = request.header("Content-Length");
    const std::size_t size = length.empty() ? 0 : std::stoul(length);
    char buffer[65536];
    while (request.body.size() < size) {
        const ssize_t got = ::read(connection, buffer, sizeof buffer);
        if (got <= 0)
            return std::nullopt;
        request.body.append(buffer, static_cast<std::size_t>(got));
    }
    return request;
}

} // namespace

std::string WireRequest::header(std::string_view name) const {
    return headerIn(headers, name);
}

int freePort() {
    int port = 0;
    listener(port);
    return port;
}

platform::FileDescriptor connectTo(const std::string& authority) {
    platform::FileDescriptor socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    const sockaddr_in address = loopback(std::stoi(authority.substr(authority.find(':') + 1)));
    if (connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
        return platform::FileDescriptor();
    return socket;
}

std::string readUntil(int connection, std::string_view end) {
    std::string text;
    char buffer[65536];
    while (end.empty() || text.find(end) == std::string::npos) {
        const ssize_t got = ::read(connection, buffer, sizeof buffer);
        if (got <= 0)
            break;
        text.append(buffer, static_cast<std::size_t>(got));
    }
    return text;
}

bool sendAll(int connection, std::string_view text) {
    while (!text.empty()) {
        const ssize_t sent = send(connection, text.data(), text.size(), MSG_NOSIGNAL);
        if (sent <= 0)
            return false;
        text.remove_prefix(static_cast<std::size_t>(sent));
    }
    return true;
}

HttpHost::HttpHost(Answer answer) : answer_(std::move(answer)) {
    int port = 0;
    socket_ = listener(port);
    authority_ = "127.0.0.1:" + std::to_string(port);
    acceptor_ = std::thread([this] { accept(); });
}

HttpHost::~HttpHost() {
    ending_ = true;
    acceptor_.join();
    while (serving_ > 0)
        poll(nullptr, 0, 1);
}

void HttpHost::accept() {
    while (!ending_) {
        pollfd waiting{socket_.get(), POLLIN, 0};
        if (poll(&waiting, 1, pollMilliseconds) <= 0)
            continue;
        const int connection = ::accept4(socket_.get(), nullptr, nullptr, SOCK_CLOEXEC);
        if (connection < 0)
            continue;
        ++serving_;
        std::thread([this, connection] {
            serve(connection);
            ::close(connection);
            --serving_;
        }).detach();
    }
}

void HttpHost::serve(int connection) {
    while (!ending_) {
        pollfd waiting{connection, POLLIN, 0};
        if (poll(&waiting, 1, pollMilliseconds) <= 0)
            continue;
        const std::optional<WireRequest> request = requestFrom(connection);
        if (!request)
            return;
        const WireReply reply = answer_(*request);
        while (reply.silent && !ending_) {
            pollfd gone{connection, POLLIN | POLLRDHUP, 0};
            if (poll(&gone, 1, pollMilliseconds) > 0)
                return;
        }
        std::string text = "HTTP/1.1 " + std::to_string(reply.status) + " Answer\r\n";
        for (const std::string& header : reply.headers)
            text += header + "\r\n";
        if (!reply.ownLength)
            text += "Content-Length: " + std::to_string(reply.body.size()) + "\r\n";
        text += "\r\n";
        if (request->method != "HEAD")
            text += reply.body;
        if (reply.cut)
            text.resize(std::min(text.size(), *reply.cut));
        if (!sendAll(connection, text) || reply.cut)
            return;
    }
}

} // namespace test
