#include "platform/system/SingleInstance.h"

#include "platform/base/Log.h"
#include "platform/base/Process.h"
#include "platform/base/Text.h"
#include "platform/system/BusConnection.h"
#include "platform/system/EventThread.h"
#include "platform/system/InstanceBus.h"
#include "platform/system/InstanceClient.h"
#include "platform/system/InstanceMessage.h"
#include "platform/system/InstanceServer.h"

#include <mutex>
#include <poll.h>
#include <utility>

namespace platform {
namespace {

/// Another start that has the lock may not listen yet; one more look this often.
constexpr int retryMilliseconds = 10;
/// As many may ask before the program is ready to hear them.
constexpr std::size_t mostWaiting = 256;

} // namespace

/// Requests come in on the event thread and go out on the handler's queue.
struct SingleInstance::State : std::enable_shared_from_this<State> {
    State(Options theOptions, InstanceFolder theFolder, FileDescriptor theLock)
        : options(std::move(theOptions)), folder(std::move(theFolder)), lock(std::move(theLock)) {}

    /// The end, on whoever's thread holds the instance: what the event thread still holds of this
    /// for a moment must never be the last of it.
    void close() {
        if (!thread)
            return;
        thread->sync([this] {
            server.reset();
            bus.reset();
        });
        thread.reset();
        folder.removeSocket(); // while the lock is held, it is ours
    }

    Failure start() {
        thread = EventThread::create("platform.instance");
        Result<FileDescriptor> listener = folder.listen();
        if (!listener)
            return listener.error();
        if (!thread)
            return makeErrorWithText(ErrorCode::unknownIo,
                                     localized("The system has no open files left."));
        const RequestTaker taker = [weak = weak_from_this()](OpenRequest request) -> Failure {
            const auto self = weak.lock();
            return self ? self->take(std::move(request)) : Failure(instanceSilentError());
        };
        thread->sync([&] {
            bus = std::make_unique<InstanceBus>(*thread, options, taker);
            if (bus->standing() != InstanceBus::Standing::taken)
                server = std::make_unique<InstanceServer>(*thread, *std::move(listener),
                                                          options.callers, options.patience, taker);
        });
        return std::nullopt;
    }

    void takeOwn(OpenRequest own) {
        own.source = executablePath();
        if (!own.urls.empty())
            static_cast<void>(take(std::move(own))); // the first of all is never too many
    }

    bool isOnlyOne() const { return bus->standing() != InstanceBus::Standing::taken; }

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
        std::vector<OpenRequest> taken;
        std::shared_ptr<Handler> current;
        {
            const std::lock_guard guard(mutex);
            taken.swap(waiting);
            current = handler;
        }
        for (const OpenRequest& request : taken)
            (*current)(request);
    }

    Options options;
    InstanceFolder folder;
    FileDescriptor lock;
    std::unique_ptr<EventThread> thread;
    std::unique_ptr<InstanceServer> server; // of the thread, as is the next
    std::unique_ptr<InstanceBus> bus;
    std::mutex mutex;
    std::vector<OpenRequest> waiting; // guarded by mutex, as are the next two
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
    state_->close();
}

Result<std::unique_ptr<SingleInstance>> SingleInstance::claim(Options options,
                                                              const OpenRequest& own) {
    if (Failure failure = checkRequestLimits(own))
        return *std::move(failure);
    const auto deadline = std::chrono::steady_clock::now() + options.patience;
    for (;;) {
        Result<InstanceFolder> folder = InstanceFolder::open(options.folders);
        if (!folder)
            return folder.error();
        Result<FileDescriptor> lock = folder->tryLock();
        if (!lock)
            return lock.error();
        const bool locked = bool(*lock);
        if (locked) {
            auto state = std::make_shared<State>(options, *std::move(folder), *std::move(lock));
            std::unique_ptr<SingleInstance> instance(new SingleInstance(state));
            if (Failure failure = state->start())
                return *std::move(failure);
            if (state->isOnlyOne()) {
                state->takeOwn(own);
                return instance;
            }
        }
        const Result<bool> taken =
            locked ? handToBus(options, own) : handToSocket(*folder, own, options.patience);
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
    const Result<InstanceFolder> folder = InstanceFolder::open(options.folders);
    if (!folder)
        return folder.error();
    Result<bool> taken = handToSocket(*folder, request, options.patience);
    return taken && !*taken ? handToBus(options, request) : taken;
}

std::string activationTokenOfThisProcess() {
    for (const char* name : {"XDG_ACTIVATION_TOKEN", "DESKTOP_STARTUP_ID"})
        if (const auto token = environmentVariable(name); token && !token->empty())
            return *token;
    return {};
}

} // namespace platform
