#include "platform/system/EventThread.h"

#include "platform/base/Log.h"
#include "platform/base/RunAndWait.h"
#include "platform/base/WorkQueue.h"
#include "platform/files/FileDescriptor.h"
#include "platform/system/SystemHandles.h"

#include <cstring>
#include <mutex>
#include <poll.h>
#include <pthread.h>
#include <sys/eventfd.h>
#include <thread>
#include <utility>
#include <vector>

namespace platform {

struct EventThread::State {
    std::string label;
    FileDescriptor wake;
    EventLoop loop;
    EventSource wakeSource;
    std::mutex mutex;
    std::vector<Job> waiting; // guarded by mutex, as is the next
    bool closing = false;
    std::thread thread;

    bool open() {
        sd_event* made = nullptr;
        sd_event_source* source = nullptr;
        wake = FileDescriptor(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK));
        if (!wake || sd_event_new(&made) < 0)
            return false;
        loop.reset(made);
        if (sd_event_add_io(made, &source, wake.get(), EPOLLIN, woken, this) < 0)
            return false;
        wakeSource.reset(source);
        return true;
    }

    static int woken(sd_event_source* /*source*/, int descriptor, std::uint32_t /*events*/,
                     void* self) {
        eventfd_t ignored = 0;
        ::eventfd_read(descriptor, &ignored);
        static_cast<State*>(self)->work();
        return 0;
    }

    void work() {
        std::vector<Job> batch;
        {
            const std::lock_guard lock(mutex);
            batch.swap(waiting);
        }
        for (Job& job : batch) {
            job();
            job = nullptr; // release what it holds before the next one runs
        }
    }

    void run() {
        setCurrentQueueLabel(label);
        const std::string shortName = label.substr(label.rfind('.') + 1).substr(0, 15);
        pthread_setname_np(pthread_self(), shortName.c_str());
        while (!isOver()) {
            const int result = sd_event_run(loop.get(), UINT64_MAX);
            if (result >= 0)
                continue;
            platformLog(LogLevel::error, "%@: the event loop failed: %@", label,
                        std::strerror(-result)); // NOLINT(concurrency-mt-unsafe)
            return workAlone();
        }
    }

    /// Without the loop the sources are silent; those who wait for jobs do not wait for ever.
    void workAlone() {
        while (!isOver()) {
            pollfd source{wake.get(), POLLIN, 0};
            ::poll(&source, 1, -1);
            woken(nullptr, wake.get(), 0, this);
        }
    }

    bool isOver() {
        const std::lock_guard lock(mutex);
        return closing && waiting.empty();
    }
};

EventThread::EventThread(std::unique_ptr<State> state) : state_(std::move(state)) {
    state_->thread = std::thread([&shared = *state_] { shared.run(); });
}

std::unique_ptr<EventThread> EventThread::create(std::string label) {
    auto state = std::make_unique<State>();
    state->label = std::move(label);
    if (!state->open()) {
        platformLog(LogLevel::error, "%@: no event loop can be made", state->label);
        return nullptr;
    }
    return std::unique_ptr<EventThread>(new EventThread(std::move(state)));
}

EventThread::~EventThread() {
    {
        const std::lock_guard lock(state_->mutex);
        state_->closing = true;
    }
    ::eventfd_write(state_->wake.get(), 1);
    state_->thread.join();
}

void EventThread::async(Job job) {
    {
        const std::lock_guard lock(state_->mutex);
        state_->waiting.push_back(std::move(job));
    }
    ::eventfd_write(state_->wake.get(), 1);
}

void EventThread::sync(const Job& job) {
    if (isCurrent()) {
        job();
        return;
    }
    runAndWait(job, [this](Job waited) { async(std::move(waited)); });
}

bool EventThread::isCurrent() const {
    return state_->thread.get_id() == std::this_thread::get_id();
}

sd_event* EventThread::loop() const {
    return state_->loop.get();
}

} // namespace platform
