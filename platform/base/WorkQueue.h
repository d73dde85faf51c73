#pragma once

#include "platform/base/Executor.h"

#include <memory>
#include <string>
#include <string_view>

namespace platform {

/// Priority of the thread that serves a queue; background and utility yield to the screens.
enum class WorkPriority { background, utility, standard, userInitiated };

/// A serial queue: jobs run one at a time, in the order of submission, on a thread of the queue's
/// own that starts with the first job. Destroying the queue finishes what was submitted; when a job
/// of the queue itself drops the last reference, the thread finishes on its own.
class WorkQueue final : public Executor {
public:
    /// `label` names the queue in logs ("" for none). `relative`, from -15 to 0, lowers the
    /// priority within its class.
    explicit WorkQueue(std::string label, WorkPriority priority = WorkPriority::standard,
                       int relative = 0);
    ~WorkQueue() override;
    WorkQueue(const WorkQueue&) = delete;
    WorkQueue& operator=(const WorkQueue&) = delete;

    void async(Job job) override;
    /// Runs the job on the queue and waits for it. On the queue's own thread it runs at once.
    void sync(const Job& job);

    const std::string& label() const;
    bool isCurrent() const;
    /// The label of the queue whose job the calling thread runs; "" outside labelled queues. The
    /// main thread's label is "main".
    static std::string_view currentLabel();

private:
    struct State;
    std::shared_ptr<State> state_;
};

/// Lowers the calling thread's priority to that of the class (raising it back is not possible).
void setThreadPriority(WorkPriority priority, int relative = 0);
/// Marks the calling thread as serving the queue of that label, for WorkQueue::currentLabel.
/// The text must outlive the thread.
void setCurrentQueueLabel(std::string_view label);

} // namespace platform
