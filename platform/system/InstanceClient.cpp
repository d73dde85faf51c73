#include "platform/system/InstanceClient.h"

#include "platform/base/Text.h"
#include "platform/system/InstanceMessage.h"

#include <array>
#include <cerrno>
#include <poll.h>
#include <sys/socket.h>

namespace platform {
namespace {

using Moment = std::chrono::steady_clock::time_point;

/// While so many others wait for the instance that it cannot be reached, one more look this often.
constexpr int retryMilliseconds = 10;
constexpr std::size_t longestAnswer = 4096;

int millisecondsUntil(Moment deadline) {
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(
        deadline - std::chrono::steady_clock::now());
    return static_cast<int>(std::max<std::int64_t>(left.count(), 0));
}

/// False when the time is over.
bool waitFor(int socket, short events, Moment deadline) {
    pollfd source{socket, events, 0};
    for (;;) {
        const int result = ::poll(&source, 1, millisecondsUntil(deadline));
        if (result > 0 || (result < 0 && errno != EINTR))
            return true;
        if (result == 0)
            return false;
    }
}

/// None when nobody listens.
Result<FileDescriptor> connected(const InstanceFolder& folder, Moment deadline) {
    for (;;) {
        FileDescriptor socket = folder.connect();
        if (socket || errno != EAGAIN)
            return socket;
        if (millisecondsUntil(deadline) == 0)
            return instanceSilentError();
        ::poll(nullptr, 0, retryMilliseconds);
    }
}

/// False when the other side has gone or has heard enough.
Result<bool> sendAll(int socket, std::string_view text, Moment deadline) {
    while (!text.empty()) {
        const ssize_t put = ::send(socket, text.data(), text.size(), MSG_NOSIGNAL);
        if (put < 0 && errno == EAGAIN) {
            if (!waitFor(socket, POLLOUT, deadline))
                return instanceSilentError();
        } else if (put < 0 && errno != EINTR) {
            return false;
        }
        text.remove_prefix(put > 0 ? static_cast<std::size_t>(put) : 0);
    }
    return true;
}

/// The line that comes back; "" when the other side goes without a word.
Result<std::string> answerOf(int socket, Moment deadline) {
    std::string out;
    while (!out.ends_with('\n') && out.size() < longestAnswer) {
        std::array<char, 512> buffer{};
        const ssize_t got = ::recv(socket, buffer.data(), buffer.size(), 0);
        if (got > 0)
            out.append(buffer.data(), static_cast<std::size_t>(got));
        else if (got < 0 && errno == EAGAIN && !waitFor(socket, POLLIN, deadline))
            return instanceSilentError();
        else if (got == 0 || (errno != EAGAIN && errno != EINTR))
            break;
    }
    return out;
}

} // namespace

Error instanceSilentError() {
    return makeErrorWithText(ErrorCode::timedOut,
                             localized("Tavrin runs already, but does not answer. Close its window "
                                       "or end it, and try again."));
}

Result<bool> handToSocket(const InstanceFolder& folder, const OpenRequest& request,
                          Duration patience) {
    if (Failure failure = checkRequestLimits(request))
        return *std::move(failure);
    const Moment deadline = std::chrono::steady_clock::now() + patience;
    Result<FileDescriptor> socket = connected(folder, deadline);
    if (!socket)
        return socket.error();
    if (!*socket)
        return false;
    if (Result<bool> sent = sendAll(socket->get(), frameOf(request), deadline); !sent)
        return sent;
    Result<std::string> answer = answerOf(socket->get(), deadline);
    if (!answer)
        return answer.error();
    if (*answer == acceptedAnswer)
        return true;
    if (!answer->ends_with('\n'))
        return false;
    answer->pop_back();
    return makeErrorWithText(ErrorCode::invalidArgument, *answer);
}

} // namespace platform
