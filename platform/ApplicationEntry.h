#pragma once

#include "platform/base/Error.h"
#include "platform/system/SingleInstance.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

class Application;
class ApplicationDelegate;

/// The way into the program: keeps it to one running instance, and turns what other starts, the
/// opener and the desk ask of that into open requests of the application. Made in main before
/// anything of the user's is opened, and gone after all of that is closed. Main thread.
class ApplicationEntry {
public:
    /// Becomes the running instance, or hands the addresses among the arguments to the one that
    /// runs. Other arguments are the toolkit's.
    ApplicationEntry(int argc, const char* const* argv);
    ApplicationEntry(SingleInstance::Options options, std::vector<std::string> arguments);
    ~ApplicationEntry();
    ApplicationEntry(const ApplicationEntry&) = delete;
    ApplicationEntry& operator=(const ApplicationEntry&) = delete;

    /// With what main ends at once, when this start is not to run: 0 once the request was handed
    /// over, 1 when the instance that runs does not take it, 2 when the request itself cannot be
    /// passed on. Failures have been said by then.
    std::optional<int> exitStatus() const { return exitStatus_; }

    /// Launches and runs the application as its own `run` does, with the requests: each brings it
    /// forward and, once it is active (or the desk keeps the focus where it is), opens its
    /// addresses in their order. None is heard before the launch is over, nor after the loop's end.
    int run(Application& application, const std::shared_ptr<ApplicationDelegate>& delegate);
    /// The parts of run, for hosts with a loop of their own.
    void serve(Application& application);
    void stopServing();

private:
    class Requests;
    int statusOf(const Error& error) const;

    std::string busAddress_;
    std::unique_ptr<SingleInstance> instance_;
    std::shared_ptr<Requests> requests_;
    std::optional<int> exitStatus_;
};

} // namespace platform
