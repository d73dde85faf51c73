#pragma once

#include "platform/base/Executor.h"

#include <memory>
#include <string>

struct sd_event;

namespace platform {

/// A thread with an event loop of the system library, on which descriptors, bus connections and
/// jobs take turns. Sources are added, and taken away, on the thread itself. Destroying it finishes
/// what was submitted. For the sources of this folder and its neighbours below the line.
class EventThread final : public Executor {
public:
    /// None when the machine has no descriptor left for it (logged).
    static std::unique_ptr<EventThread> create(std::string label);
    ~EventThread() override;
    EventThread(const EventThread&) = delete;
    EventThread& operator=(const EventThread&) = delete;

    void async(Job job) override;
    /// Runs the job on the thread and waits for it; on the thread itself at once.
    void sync(const Job& job);
    bool isCurrent() const;
    sd_event* loop() const;

private:
    struct State;
    explicit EventThread(std::unique_ptr<State> state);
    std::unique_ptr<State> state_;
};

} // namespace platform
