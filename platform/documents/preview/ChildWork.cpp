#include "platform/documents/preview/ChildWork.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <poll.h>

namespace platform {
namespace {

/// The limit is looked at this often, in milliseconds: nothing else wakes a silent child's watcher.
constexpr int lookEvery = 100;
constexpr std::size_t readSize = 64UL * 1024;

enum class ReadEnd { more, over, refused };

/// Reads what is there.
ReadEnd readSome(int pipe, const ChildOutput& output) {
    std::array<char, readSize> bytes{};
    const ssize_t got = ::read(pipe, bytes.data(), bytes.size());
    if (got < 0)
        return errno == EAGAIN || errno == EINTR ? ReadEnd::more : ReadEnd::over;
    if (got == 0)
        return ReadEnd::over;
    return output({bytes.data(), static_cast<std::size_t>(got)}) ? ReadEnd::more : ReadEnd::refused;
}

/// What the child wrote before it ended. A grandchild may keep the pipe open.
bool readRest(int pipe, const ChildOutput& output) {
    for (;;) {
        pollfd look{pipe, POLLIN, 0};
        if (::poll(&look, 1, 0) <= 0)
            return true;
        const ReadEnd end = readSome(pipe, output);
        if (end != ReadEnd::more)
            return end == ReadEnd::over;
    }
}

/// Until the child ends, or has to; answers how, as far as that is known before it is waited for.
ChildEnd watch(const StartedProgram& child, FileDescriptor& pipe, const PreviewToken& token,
               const Clock& clock, Duration end, const ChildOutput& output) {
    for (;;) {
        std::array<pollfd, 2> looks{{{child.handle.get(), POLLIN, 0}, {pipe.get(), POLLIN, 0}}};
        ::poll(looks.data(), looks.size(), lookEvery);
        if (token.isCancelled())
            return ChildEnd::cancelled;
        if (clock.monotonic() >= end)
            return ChildEnd::outOfTime;
        if (looks[0].revents != 0)
            return readRest(pipe.get(), output) ? ChildEnd::done : ChildEnd::failed;
        if (looks[1].revents == 0)
            continue;
        const ReadEnd read = readSome(pipe.get(), output);
        if (read == ReadEnd::refused)
            return ChildEnd::failed;
        if (read == ReadEnd::over && !child.handle)
            return ChildEnd::done; // a kernel without such handles: its end is all that is left
        if (read == ReadEnd::over)
            pipe.reset();
    }
}

} // namespace

ChildEnd runChild(ProgramStart start, PreviewToken& token, Clock& clock, Duration limit,
                  const ChildOutput& output) {
    std::array<int, 2> ends{};
    if (::pipe2(ends.data(), O_CLOEXEC) != 0)
        return ChildEnd::absent;
    FileDescriptor reading(ends[0]);
    FileDescriptor writing(ends[1]);
    start.output = writing.get();
    const Result<StartedProgram> child = startProgram(start);
    writing.reset();
    if (!child)
        return ChildEnd::absent;
    const auto kill = [pid = child->pid] { ::kill(-pid, SIGKILL); };
    token.flag().setHandler(kill);
    const ChildEnd end = watch(*child, reading, token, clock, clock.monotonic() + limit, output);
    if (end != ChildEnd::done)
        kill();
    // Before the child is waited for: afterwards the number may be another's.
    token.flag().setHandler({});
    const int status = child->wait();
    return end == ChildEnd::done && status != 0 ? ChildEnd::failed : end;
}

} // namespace platform
