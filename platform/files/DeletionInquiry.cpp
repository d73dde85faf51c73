#include "platform/files/DeletionInquiry.h"

#include "platform/base/Log.h"
#include "platform/base/MainQueue.h"
#include "platform/files/FilesClock.h"
#include "platform/files/ItemPaths.h"

namespace platform {
namespace {

constexpr Duration answerTime = std::chrono::seconds(5);

/// Whether a job of that queue could only run after the calling thread's present one.
bool servedByThisThread(const Executor* queue) {
    if (const auto* main = dynamic_cast<const MainQueue*>(queue))
        return main->isMainThread();
    const auto* work = dynamic_cast<const WorkQueue*>(queue);
    return work && work->isCurrent();
}

} // namespace

/// One presenter's answer: given once, at the latest when the last copy of the handler goes.
struct DeletionInquiry::Answer {
    explicit Answer(std::shared_ptr<DeletionInquiry> asked) : inquiry(std::move(asked)) {}
    ~Answer() { give(std::nullopt); }
    Answer(const Answer&) = delete;
    Answer& operator=(const Answer&) = delete;

    void give(const Failure& failure) {
        if (!given.exchange(true))
            inquiry->answered(failure);
    }

    std::shared_ptr<DeletionInquiry> inquiry;
    std::atomic<bool> given{false};
};

Failure DeletionInquiry::ask(const Url& item, const std::vector<PresenterRecordPointer>& presenters,
                             const CancelFlag& cancel) {
    outstanding_ = static_cast<int>(presenters.size());
    Clock& clock = filesClock();
    const Clock::AlarmId alarm = clock.setAlarm(answerTime, [weak = weak_from_this()] {
        if (const auto self = weak.lock()) {
            const std::lock_guard lock(self->mutex_);
            self->timedOut_ = true;
            self->changed_.notify_all();
        }
    });
    for (const PresenterRecordPointer& presenter : presenters)
        put(item, presenter);
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return outstanding_ == 0 || timedOut_ || cancel.isCancelled(); });
    const bool late = outstanding_ > 0 && timedOut_;
    Failure refusal = refusal_;
    lock.unlock();
    clock.cancelAlarm(alarm);
    if (late)
        platformLog(LogLevel::warning, "A presenter did not answer the deletion of %@", item);
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    return refusal;
}

void DeletionInquiry::put(const Url& item, const PresenterRecordPointer& record) {
    const auto answer = std::make_shared<Answer>(shared_from_this());
    const std::string path = PresenterRegistry::shared().pathOf(*record);
    const bool whole = isAtOrBelow(path, standardPath(item));
    const auto notice = [answer, whole, item](FilePresenter& presenter) {
        const auto handler = [answer](const Failure& failure) { answer->give(failure); };
        if (whole)
            presenter.accommodatePresentedItemDeletionWithCompletionHandler(handler);
        else
            presenter.accommodatePresentedSubitemDeletionAtURL(item, handler);
    };
    const std::shared_ptr<FilePresenter> presenter = record->presenter.lock();
    if (presenter && record->registered &&
        servedByThisThread(presenter->presentedItemOperationQueue().get()))
        notice(*presenter); // waiting for that queue would be waiting for ourselves
    else
        PresenterRegistry::post(record, notice);
}

void DeletionInquiry::answered(const Failure& failure) {
    const std::lock_guard lock(mutex_);
    if (failure && !refusal_)
        refusal_ = failure;
    if (--outstanding_ == 0)
        changed_.notify_all();
}

void DeletionInquiry::wake() {
    const std::lock_guard lock(mutex_);
    changed_.notify_all();
}

} // namespace platform
