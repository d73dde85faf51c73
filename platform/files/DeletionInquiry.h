#pragma once

#include "platform/files/ContentProvider.h"
#include "platform/files/PresenterRegistry.h"

#include <condition_variable>

namespace platform {

/// Asks presenters to accommodate a deletion and waits for their answers: a few seconds at most, by
/// the installed clock. A presenter that refuses keeps the item; one that goes away, or drops its
/// handler, agrees.
class DeletionInquiry : public std::enable_shared_from_this<DeletionInquiry> {
public:
    /// None of `presenters` is `own`'s.
    Failure ask(const Url& item, const std::vector<PresenterRecordPointer>& presenters,
                const CancelFlag& cancel);
    /// Lets ask() look at the cancel flag again.
    void wake();

private:
    struct Answer;
    void put(const Url& item, const PresenterRecordPointer& presenter);
    void answered(const Failure& failure);

    std::mutex mutex_;
    std::condition_variable changed_;
    int outstanding_ = 0;
    Failure refusal_;
    bool timedOut_ = false;
};

} // namespace platform
