#pragma once

#include "platform/base/WorkQueue.h"

#include <memory>
#include <string>

namespace platform {

/// A queue whose jobs may run at the same time, in no promised order, on up to `width` threads that
/// come and go with the work. Destroying it lets what was submitted finish, without waiting.
class OperationQueue final : public Executor {
public:
    explicit OperationQueue(std::string name = {}, unsigned width = 4,
                            WorkPriority priority = WorkPriority::standard);
    ~OperationQueue() override;
    OperationQueue(const OperationQueue&) = delete;
    OperationQueue& operator=(const OperationQueue&) = delete;

    void async(Job job) override;
    /// Blocks until nothing is waiting or running.
    void waitUntilIdle();

    /// The process-wide queue of standard priority, without a label.
    static OperationQueue& global();

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
