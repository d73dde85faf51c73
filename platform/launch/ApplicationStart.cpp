#include "platform/launch/ApplicationStart.h"

#include "platform/base/Log.h"
#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/system/ProgramStart.h"

#include <QCoreApplication>
#include <QSocketNotifier>

#include <thread>
#include <utility>

namespace platform {
namespace {

using namespace std::chrono_literals;

/// Who fails within this has not come up; later it is a matter between the user and the program.
constexpr Duration comingUp = 10s;

/// Waits for the end of a started program, so that the system can forget it.
class EndWatch : public QSocketNotifier {
public:
    EndWatch(StartedProgram program, std::string name, ApplicationStart::EndedAtOnce endedAtOnce)
        : QSocketNotifier(program.handle.get(), Read, QCoreApplication::instance()),
          program_(std::move(program)),
          name_(std::move(name)),
          endedAtOnce_(std::move(endedAtOnce)),
          started_(Runtime::current().clock.monotonic()) {
        connect(this, &QSocketNotifier::activated, this, [this] { ended(); });
    }
    ~EndWatch() override { setEnabled(false); }

private:
    void ended() {
        setEnabled(false);
        deleteLater();
        const int status = program_.wait();
        const bool atOnce = Runtime::current().clock.monotonic() - started_ < comingUp;
        if (status == 0)
            return;
        platformLog(LogLevel::info, "“%@” ended with status %@", name_, status);
        if (atOnce && endedAtOnce_)
            endedAtOnce_(makeErrorWithText(
                ErrorCode::unknownIo,
                localizedFormat("“%1$@” ended as soon as it had been started (exit status %2$@).",
                                name_, std::to_string(status))));
    }

    StartedProgram program_;
    std::string name_;
    ApplicationStart::EndedAtOnce endedAtOnce_;
    Duration started_;
};

Error cannotStart(const std::string& name, const Error& cause) {
    Error error = cause;
    error.localizedDescription = localizedFormat(
        "“%1$@” could not be started. %2$@", name,
        cause.localizedDescription.value_or(cause.localizedFailureReason.value_or("")));
    return error;
}

} // namespace

Failure ApplicationStart::open(const DesktopEntry& entry, const std::optional<ExecTarget>& document,
                               EndedAtOnce endedAtOnce) {
    std::vector<std::string> arguments;
    if (entry.needsTerminal)
        if (auto terminal = terminalCommand())
            arguments = *std::move(terminal);
    if (!entry.exec || (entry.needsTerminal && arguments.empty()))
        return cannotStart(entry.localizedName, makeError(ErrorCode::noSuchItem, entry.id));
    const std::vector<std::string> command = entry.exec->arguments(entry, document);
    arguments.insert(arguments.end(), command.begin(), command.end());
    return run(std::move(arguments), entry.localizedName, entry.workingFolder,
               std::move(endedAtOnce));
}

Failure ApplicationStart::run(std::vector<std::string> arguments, const std::string& name,
                              const std::string& folder, EndedAtOnce endedAtOnce) {
    Result<StartedProgram> started = startProgram(
        {std::move(arguments), folder.empty() ? Runtime::current().folders.home : folder});
    if (!started)
        return cannotStart(name, started.error());
    if (started->handle)
        new EndWatch(*std::move(started), name, std::move(endedAtOnce)); // the application owns it
    else
        std::thread([program = *std::move(started)] { program.wait(); }).detach();
    return std::nullopt;
}

} // namespace platform
