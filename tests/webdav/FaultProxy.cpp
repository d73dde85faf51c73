#include "tests/webdav/FaultProxy.h"

#include <algorithm>
#include <poll.h>
#include <sys/socket.h>

namespace test {
namespace {

constexpr int delayMilliseconds = 15;

/// Of a body in chunks, the body.
std::string withoutChunks(const std::string& text) {
    std::string body;
    for (std::size_t begin = 0; begin < text.size();) {
        const std::size_t line = text.find("\r\n", begin);
        if (line == std::string::npos)
            break;
        const std::size_t size = std::stoul(text.substr(begin, line - begin), nullptr, 16);
        if (size == 0)
            break;
        body += text.substr(line + 2, size);
        begin = line + 2 + size + 2;
    }
    return body;
}

WireReply replyFrom(const std::string& text, bool head) {
    std::size_t begin = 0;
    WireReply reply{502};
    std::size_t end = text.find("\r\n\r\n");
    while (end != std::string::npos && text.compare(begin, 12, "HTTP/1.1 100") == 0) {
        begin = end + 4;
        end = text.find("\r\n\r\n", begin);
    }
    if (end == std::string::npos)
        return {0, {}, {}, 0};
    reply.status = std::stoi(text.substr(begin + 9, 3));
    std::string body = text.substr(end + 4);
    for (std::size_t line = text.find("\r\n", begin) + 2; line < end + 2;) {
        const std::size_t next = text.find("\r\n", line);
        const std::string header = text.substr(line, next - line);
        line = next + 2;
        std::string name = header.substr(0, header.find(':'));
        std::transform(name.begin(), name.end(), name.begin(), ::tolower);
        if (name == "transfer-encoding")
            body = withoutChunks(body);
        else if (name != "connection" && name != "keep-alive" && (head || name != "content-length"))
            reply.headers.push_back(header);
    }
    reply.body = std::move(body);
    reply.ownLength = head;
    return reply;
}

} // namespace

FaultProxy::FaultProxy(std::string server, unsigned seed)
    : server_(std::move(server)),
      random_(seed),
      host_([this](const WireRequest& request) { return pass(request); }) {
}

FaultProxy::Fault FaultProxy::choose(std::size_t& where) {
    const std::lock_guard lock(mutex_);
    if (static_cast<int>(random_() % 1000) >= spoilt_)
        return Fault::none;
    ++faults_;
    where = random_();
    return static_cast<Fault>(1 + random_() % (static_cast<unsigned>(Fault::count) - 1));
}

WireReply FaultProxy::pass(const WireRequest& request) {
    std::size_t where = 0;
    const Fault fault = choose(where);
    if (fault == Fault::refuse) {
        constexpr int statuses[] = {400, 401, 403, 404, 405, 409, 412, 423, 500, 502, 507};
        return {statuses[where % std::size(statuses)]};
    }
    if (fault == Fault::busy)
        return {where % 2 == 0 ? 503 : 429, {"Retry-After: 1"}};
    if (fault == Fault::delay)
        poll(nullptr, 0, delayMilliseconds);
    std::optional<std::size_t> cut;
    if (fault == Fault::cutRequest)
        cut = where;
    WireReply reply = forward(request, cut);
    const std::size_t size = 200 + reply.body.size();
    if (fault == Fault::loseAnswer)
        reply.cut = 0;
    else if (fault == Fault::cutAnswer)
        reply.cut = where % size;
    else if (fault == Fault::shortBody && !reply.body.empty())
        reply.body.resize(where % reply.body.size());
    return reply;
}

WireReply FaultProxy::forward(const WireRequest& request, std::optional<std::size_t> cut) {
    std::string text = request.method + ' ' + request.target + " HTTP/1.1\r\n";
    for (std::string header : request.headers) {
        if (header.starts_with("Host:"))
            header = "Host: " + server_;
        else if (header.starts_with("Connection:") || header.starts_with("Expect:"))
            continue;
        else if (const std::size_t own = header.find(host_.authority()); own != std::string::npos)
            header.replace(own, host_.authority().size(), server_); // of a destination
        text += header + "\r\n";
    }
    text += "Connection: close\r\n\r\n" + request.body;
    const platform::FileDescriptor server = connectTo(server_);
    if (cut) {
        sendAll(server.get(), std::string_view(text).substr(0, *cut % text.size()));
        return {0, {}, {}, 0};
    }
    if (!server || !sendAll(server.get(), text))
        return {0, {}, {}, 0};
    return replyFrom(readUntil(server.get(), ""), request.method == "HEAD");
}

} // namespace test
