#include "platform/system/SingleInstance.h"

#include "platform/base/Log.h"
#include "platform/base/Process.h"
#include "platform/base/Text.h"
#include "platform/system/BusConnection.h"
#include "platform/system/EventThread.h"
#include "platform/system/InstanceBus.h"
#include "platform/system/InstanceClient.h"
#include "platform/system/InstanceFolder.h"
#include "platform/system/InstanceMessage.h"
#include "platform/system/InstanceServer.h"

#include <deque>
#include <mutex>
#include <poll.h>
#include <utility>

namespace platform {
namespace {

/// Another start that has the lock may not listen yet; one more look this often.
constexpr int retryMilliseconds = 10;
/// As many may ask before the program is ready to hear them.
constexpr std::size_t mostWaiting = 256;

/// Where the instance is, as far as there is a place: none when neither folder can be used.
struct Place {
    std::optional<InstanceFolder> folder;
    FileDescriptor lock;
    bool isTaken = false;

    static Place find(const Folders& folders) {
        Result<InstanceFolder> found = InstanceFolder::open(folders);
        if (!found)
            return without(found.error());
        Result<FileDescriptor> lock = found->tryLock();
        if (!lock)
            return without(lock.error());
        const bool taken = !*lock;
        return {*std::move(found), *std::move(lock), taken};
    }

    static Place without(const Error& error) {
        platformLog(LogLevel::warning,
                    "There is no place for the lock, so a second start may not be noticed: %@",
                    error);
        return {};
    }
};

} // namespace

/// Requests come in on the event thread and go out on the handler's queue.
struct SingleInstance::State : std::enable_shared_from_this<State> {
    State(Options theOptions, Place thePlace)
        : options(std::move(theOptions)), place(std::move(thePlace)) {}

    void start() {
        thread = EventThread::create("platform.instance");
        if (!thread)
            return;
        const RequestTaker taker = [weak = weak_from_this()](OpenRequest request) -> Failure {
            const auto self = weak.lock();
            return self ? self->take(std::move(request)) : Failure(instanceSilentError());
        };
        thread->sync([&] {
            bus = std::make_unique<InstanceBus>(*thread, options, taker);
            if (isOnlyOne())
                listen(taker);
        });
    }

    void listen(const RequestTaker& taker) {
        if (!place.folder)
            return;
        if (Result<FileDescriptor> listener = place.folder->listen())
            server = std::make_unique<InstanceServer>(*thread, *std::move(listener),
                                                      options.callers, options.patience, taker);
        else
            platformLog(LogLevel::error, "Requests of other starts cannot be heard: %@",
                        listener.error());
    }

    /// On whoever's thread holds the instance: what the event thread still holds of this for a
    /// moment must never be the last of it.
    void stop() {
        if (!thread)
            return;
        thread->sync([this] {
            server.reset();
            bus.reset();
        });
        thread.reset();
        if (place.folder && place.lock)
            place.folder->removeSocket(); // while the lock is held, it is ours
        const std::lock_guard handled(handling);
        const std::lock_guard guard(mutex);
        handler = nullptr;
        queue = nullptr;
        if (!waiting.empty())
            platformLog(LogLevel::warning, "%@ requests came too late to be heard",
                        std::to_string(waiting.size()));
        waiting.clear();
    }

    void takeOwn(OpenRequest own) {
        own.source = executablePath();
        if (!own.urls.empty())
            static_cast<void>(take(std::move(own))); // the first of all is never too many
    }

    bool isOnlyOne() const { return !bus || bus->standing() != InstanceBus::Standing::taken; }

    Failure take(OpenRequest request) {
        const std::lock_guard guard(mutex);
        if (waiting.size() >= mostWaiting)
            return makeErrorWithText(ErrorCode::itemBusy,
                                     localized("Tavrin is busy with other requests. Try again."));
        waiting.push_back(std::move(request));
        if (queue)
            scheduleLocked();
        return std::nullopt;
    }

    void scheduleLocked() {
        queue->async([weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->handle();
        });
    }

    /// On the handler's queue.
    void handle() {
        const std::lock_guard handled(handling);
        while (const auto next = takeNext())
            (*next->first)(next->second);
    }

    std::optional<std::pair<std::shared_ptr<Handler>, OpenRequest>> takeNext() {
        const std::lock_guard guard(mutex);
        if (!handler || waiting.empty())
            return std::nullopt;
        OpenRequest request = std::move(waiting.front());
        waiting.pop_front();
        return std::pair(handler, std::move(request));
    }

    Options options;
    Place place;
    std::unique_ptr<EventThread> thread;
    std::unique_ptr<InstanceServer> server; // of the thread, as is the next
    std::unique_ptr<InstanceBus> bus;
    /// Held while the handler runs; the handler itself may stop the instance.
    std::recursive_mutex handling;
    std::mutex mutex;
    std::deque<OpenRequest> waiting; // guarded by mutex, as are the next two
    Executor* queue = nullptr;
    std::shared_ptr<Handler> handler;
};

SingleInstance::Options SingleInstance::Options::ofThisProcess() {
    Options options;
    options.folders = Folders::fromProcessEnvironment();
    options.callers = KnownCallers::besideThisProgram();
    options.busAddress = sessionBusAddress();
    return options;
}

SingleInstance::SingleInstance(std::shared_ptr<State> state) : state_(std::move(state)) {
}

SingleInstance::~SingleInstance() {
    state_->stop();
    state_->place.lock.reset();
}

void SingleInstance::stop() {
    state_->stop();
}

Result<std::unique_ptr<SingleInstance>> SingleInstance::claim(Options options,
                                                              const OpenRequest& own) {
    if (Failure failure = checkRequestLimits(own))
        return *std::move(failure);
    const auto deadline = std::chrono::steady_clock::now() + options.patience;
    for (;;) {
        Place place = Place::find(options.folders);
        const bool locked = !place.isTaken;
        Result<bool> taken = false;
        if (locked) {
            auto state = std::make_shared<State>(options, std::move(place));
            std::unique_ptr<SingleInstance> instance(new SingleInstance(state));
            state->start();
            if (state->isOnlyOne()) {
                state->takeOwn(own);
                return instance;
            }
            instance.reset();
            taken = handToBus(options, own);
        } else {
            taken = handToSocket(*place.folder, own, options.patience);
        }
        if (!taken)
            return taken.error();
        if (*taken)
            return std::unique_ptr<SingleInstance>();
        if (std::chrono::steady_clock::now() >= deadline)
            return instanceSilentError();
        ::poll(nullptr, 0, retryMilliseconds);
    }
}

void SingleInstance::setHandler(Executor& queue, Handler handler) {
    const std::lock_guard guard(state_->mutex);
    state_->queue = &queue;
    state_->handler = std::make_shared<Handler>(std::move(handler));
    if (!state_->waiting.empty())
        state_->scheduleLocked();
}

Result<bool> handToRunningInstance(const SingleInstance::Options& options,
                                   const OpenRequest& request) {
    if (Failure failure = checkRequestLimits(request))
        return *std::move(failure);
    if (const Result<InstanceFolder> folder = InstanceFolder::open(options.folders)) {
        Result<bool> taken = handToSocket(*folder, request, options.patience);
        if (!taken || *taken)
            return taken;
    }
    return handToBus(options, request);
}

std::string activationTokenOfThisProcess() {
    for (const char* name : {"XDG_ACTIVATION_TOKEN", "DESKTOP_STARTUP_ID"})
        if (const auto token = environmentVariable(name); token && !token->empty())
            return *token;
    return {};
}

} // namespace platform
