#include "tools/tavrin-open/Opener.h"

#include "platform/base/Text.h"
#include "platform/files/PathText.h"
#include "platform/system/InstanceMessage.h"
#include "platform/system/ProgramStart.h"
#include "platform/system/UrlScheme.h"

#include <algorithm>
#include <poll.h>

namespace opener {
namespace {

using namespace platform;

constexpr std::string_view programName = "/tavrin";
/// A cold machine with a slow disk starts a program within this.
constexpr auto startPatience = std::chrono::seconds(30);
/// A program that ended well has handed over to another one, which may still be on its way.
constexpr auto handOverPatience = std::chrono::seconds(5);
constexpr int lookMilliseconds = 20;
/// Longer texts are shown by their beginning.
constexpr std::size_t shownLength = 80;

std::string shortened(const std::string& text) {
    return text.size() <= shownLength ? text : text.substr(0, shownLength) + "…";
}

Result<StartedProgram> startTavrin(const SingleInstance::Options& options) {
    const std::string own = executablePath();
    const std::string program = std::string(folderOf(own)).append(programName);
    Result<StartedProgram> started = startProgram({{program}, options.folders.home});
    if (!started)
        return makeErrorWithText(
            ErrorCode::noSuchItem,
            localizedFormat("“%1$@” could not be started (%2$@). Install Tavrin again.", program,
                            started.error().localizedFailureReason.value_or(
                                started.error().localizedDescription.value_or(""))));
    return started;
}

/// Until the program that starts has taken the request.
Failure bringToStarting(const SingleInstance::Options& options, const OpenRequest& request,
                        const StartedProgram& program) {
    auto deadline = std::chrono::steady_clock::now() + startPatience;
    bool ended = false;
    for (;;) {
        const Result<bool> taken = handToRunningInstance(options, request);
        if (!taken)
            return taken.error();
        if (*taken)
            return std::nullopt;
        if (std::chrono::steady_clock::now() >= deadline)
            return makeErrorWithText(ErrorCode::timedOut,
                                     localized("Tavrin was started but does not answer."));
        pollfd end{ended ? -1 : program.handle.get(), POLLIN, 0};
        if (::poll(&end, 1, lookMilliseconds) <= 0)
            continue;
        ended = true;
        if (const int status = program.wait(); status != 0)
            return makeErrorWithText(ErrorCode::unknownIo,
                                     localizedFormat("Tavrin could not start (exit status %1$@).",
                                                     std::to_string(status)));
        deadline = std::min(deadline, std::chrono::steady_clock::now() + handOverPatience);
    }
}

} // namespace

Result<OpenRequest> requestOf(const std::vector<std::string>& arguments) {
    OpenRequest request{arguments, {}, activationTokenOfThisProcess()};
    const auto wrong =
        std::ranges::find_if(arguments, [](const auto& each) { return !hasUrlScheme(each); });
    if (wrong != arguments.end())
        return makeErrorWithText(
            ErrorCode::invalidArgument,
            localizedFormat("“%1$@” is no address of the kind tavrinapp:…", shortened(*wrong)));
    if (Failure failure = checkRequestLimits(request))
        return *std::move(failure);
    return request;
}

Failure bring(const OpenRequest& request) {
    const auto options = SingleInstance::Options::ofThisProcess();
    const Result<bool> taken = handToRunningInstance(options, request);
    if (!taken)
        return taken.error();
    if (*taken)
        return std::nullopt;
    const Result<StartedProgram> program = startTavrin(options);
    return program ? bringToStarting(options, request, *program) : Failure(program.error());
}

} // namespace opener
