#include "platform/documents/preview/MediaProcess.h"

#include <QSocketNotifier>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <sys/socket.h>

namespace platform {
namespace {

constexpr std::size_t mediaReadSize = 256UL * 1024;
/// Of one turn of the event loop; the rest is read in the next one.
constexpr std::size_t mostAtOnce = 16UL * 1024 * 1024;

bool isPicture(const MediaHead& head) {
    const auto event = static_cast<MediaEvent>(head.kind);
    return event == MediaEvent::picture || event == MediaEvent::cover;
}

/// What a player that was taken over by its film could say otherwise.
bool isSound(const MediaHead& head) {
    if (!isPicture(head))
        return head.length <= longestMediaText;
    const std::int64_t width = packedWidth(head.value);
    const std::int64_t height = packedHeight(head.value);
    return width > 0 && height > 0 && width <= mostPictureWidth && height <= mostPictureHeight &&
           head.length == width * height * 4;
}

} // namespace

MediaChild::~MediaChild() {
    if (program.pid <= 0)
        return;
    ::kill(-program.pid, SIGKILL);
    program.wait();
}

std::shared_ptr<MediaChild> startPlayer(const std::string& program, int file) {
    std::array<int, 2> ends{};
    if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends.data()) != 0)
        return nullptr;
    auto child = std::make_shared<MediaChild>();
    child->socket = FileDescriptor(ends[0]);
    const FileDescriptor theirs(ends[1]);
    ProgramStart start{{program}, "/"};
    start.input = file;
    start.output = theirs.get();
    Result<StartedProgram> started = startProgram(start);
    if (!started)
        return nullptr;
    child->program = std::move(*started);
    return child;
}

MediaProcess::MediaProcess(std::shared_ptr<MediaChild> child, Events events)
    : child_(std::move(child)),
      events_(std::move(events)),
      notifier_(std::make_unique<QSocketNotifier>(child_->socket.get(), QSocketNotifier::Read)) {
    QObject::connect(notifier_.get(), &QSocketNotifier::activated, notifier_.get(),
                     [this] { read(); });
}

MediaProcess::~MediaProcess() {
    // Silence at once; whoever holds the child as well waits for its end.
    ::kill(-child_->program.pid, SIGKILL);
}

void MediaProcess::wish(MediaWish wish, std::int64_t value) {
    const MediaHead head{static_cast<std::uint32_t>(wish), 0, value};
    // A player that does not listen any more is about to be told of as gone.
    (void)::send(child_->socket.get(), &head, sizeof head, MSG_NOSIGNAL | MSG_DONTWAIT);
}

void MediaProcess::read() {
    std::array<char, mediaReadSize> bytes;
    for (std::size_t all = 0; all < mostAtOnce;) {
        const ssize_t got = ::recv(child_->socket.get(), bytes.data(), bytes.size(), MSG_DONTWAIT);
        if (got < 0 && (errno == EAGAIN || errno == EINTR))
            break;
        if (got <= 0) {
            notifier_->setEnabled(false);
            handOn();
            const auto gone = events_.gone;
            gone();
            return;
        }
        pending_.append(bytes.data(), static_cast<std::size_t>(got));
        all += static_cast<std::size_t>(got);
    }
    if (handOn())
        return;
    notifier_->setEnabled(false);
    const auto gone = events_.gone;
    gone();
}

bool MediaProcess::handOn() {
    std::size_t at = 0;
    MediaHead head;
    while (pending_.size() - at >= sizeof head) {
        std::memcpy(&head, pending_.data() + at, sizeof head);
        if (!isSound(head))
            return false;
        if (pending_.size() - at - sizeof head < head.length)
            break;
        handOn(head, pending_.data() + at + sizeof head);
        at += sizeof head + head.length;
    }
    pending_.erase(0, at);
    return true;
}

void MediaProcess::handOn(const MediaHead& head, const char* bytes) {
    const auto event = static_cast<MediaEvent>(head.kind);
    if (!isPicture(head)) {
        events_.told(event, head.value, std::string(bytes, head.length));
        return;
    }
    QImage image(static_cast<int>(packedWidth(head.value)),
                 static_cast<int>(packedHeight(head.value)), QImage::Format_RGB32);
    if (image.isNull())
        return;
    std::memcpy(image.bits(), bytes, head.length);
    events_.drawn(event, std::move(image));
    if (event == MediaEvent::picture)
        wish(MediaWish::taken);
}

} // namespace platform
