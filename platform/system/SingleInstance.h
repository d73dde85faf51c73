#pragma once

#include "platform/base/Executor.h"
#include "platform/base/Folders.h"
#include "platform/base/Result.h"
#include "platform/system/CallerIdentity.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// What another start of the program, or the desk, asks of the one that runs.
struct OpenRequest {
    /// As they were given, whatever they are; none only asks the program to come forward.
    std::vector<std::string> urls;
    /// Who asks: one of the source applications, else the path of the caller's executable. Taken
    /// from the system's word on the caller, never from the caller's own; none when there is none.
    std::optional<std::string> source = {};
    /// The right to come to the front that the desk gave to the caller; "" for none.
    std::string activationToken = {};
};

/// More than this is refused as a whole: a path of the longest kind, each byte encoded twice, fits.
inline constexpr std::size_t longestRequestUrl = 64UL * 1024;
inline constexpr std::size_t mostRequestUrls = 64;

/// Keeps the program to one running instance a user and a desk, and takes in what others ask of it:
/// on the session bus as org.freedesktop.Application where there is a bus, and in any case on a
/// socket in the user's runtime folder (where there is none, in his state folder) whose lock is
/// what makes the instance the only one. Requests are taken in, and answered, from the moment of
/// the claim on.
class SingleInstance {
public:
    struct Options {
        Folders folders;
        KnownCallers callers;
        /// Of the session bus; "" for none.
        std::string busAddress;
        /// How long somebody may take to say what he wants, and a running instance to answer.
        Duration patience = std::chrono::seconds(5);
        /// As the environment has it.
        static Options ofThisProcess();
    };
    using Handler = std::function<void(const OpenRequest& request)>;

    /// Becomes the only instance, which then finds `own` among its requests, unless `own` is empty;
    /// or, when there is one already, hands `own` to it and answers none. Of several claims at the
    /// same moment exactly one becomes the instance. An error when one runs and does not answer.
    /// Without a safe place for the lock (logged) the name on the bus decides alone, and without a
    /// bus every claim is granted.
    static Result<std::unique_ptr<SingleInstance>> claim(Options options, const OpenRequest& own);
    /// Only when it is gone can another start become the instance.
    ~SingleInstance();
    SingleInstance(const SingleInstance&) = delete;
    SingleInstance& operator=(const SingleInstance&) = delete;

    /// `handler` runs on `queue` for each request in the order of their arrival, also for those
    /// that came before it was set. The queue outlives the object.
    void setHandler(Executor& queue, Handler handler);
    /// Takes no more requests and waits for the handler to end (unless it is itself that stops).
    /// Other starts wait from now on until the object is gone.
    void stop();

private:
    struct State;
    explicit SingleInstance(std::shared_ptr<State> state);
    std::shared_ptr<State> state_;
};

/// Hands a request to the running instance. False when none runs. An error when it refuses the
/// request, or does not answer in time.
Result<bool> handToRunningInstance(const SingleInstance::Options& options,
                                   const OpenRequest& request);
/// What the desk gave this process to pass on, for a request of its own.
std::string activationTokenOfThisProcess();

} // namespace platform
