#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/Result.h"
#include "platform/base/Url.h"
#include "platform/files/ContentProvider.h"

#include <functional>
#include <memory>
#include <mutex>
#include <string>

namespace platform {

class WorkQueue;

/// Tells work that goes on elsewhere whether anybody still wants it.
class PreviewToken : public std::enable_shared_from_this<PreviewToken> {
public:
    explicit PreviewToken(Clock& clock) : clock_(clock) {}

    /// For limits of time; not asked any more once cancelled.
    Clock& clock() const { return clock_; }
    bool isCancelled() const { return cancel_.isCancelled(); }
    void cancel();
    CancelFlag& flag() { return cancel_; }
    /// Runs the job unless cancelled; a cancellation waits until it has run.
    void ifWanted(const Job& job);
    /// Has the job done on the main thread, unless cancelled before that; for what there is to show
    /// before the work is done.
    void deliver(MainQueue& main, Job job);

private:
    Clock& clock_;
    CancelFlag cancel_;
    std::mutex mutex_;
};

/// Where a renderer does what takes time. Waited for by the end of the application alone: a decoder
/// cannot be stopped in the middle of a picture, and nobody who goes back wants to wait for it.
/// Belongs to the main thread.
class PreviewWorker {
public:
    /// Runs on the queue and answers what is then to be done on the main thread (may be nothing).
    /// Must not touch what the main thread may take away meanwhile; what it answers may.
    using Work = std::function<Job(PreviewToken& token)>;

    explicit PreviewWorker(MainQueue& main);
    ~PreviewWorker();
    PreviewWorker(const PreviewWorker&) = delete;
    PreviewWorker& operator=(const PreviewWorker&) = delete;

    void run(Work work);
    /// The last thing done on the queue when the worker goes, whatever was cancelled before.
    void setLastJob(Job job) { lastJob_ = std::move(job); }
    /// Nothing that was given before is done any more, neither there nor here.
    void cancel();

private:
    MainQueue& main_;
    std::shared_ptr<PreviewToken> token_;
    std::unique_ptr<WorkQueue> queue_;
    Job lastJob_;
};

/// What a document is on the disk: a package is a folder.
enum class DocumentForm { file, package };

/// Reads a document while nobody changes it; within Work. `read` gets the path of a file with
/// something in it, or of a package, and its error is the answer's. A document of the other form,
/// one without contents, or one that is not on the device, is an error as well.
Failure readDocument(const Url& file, PreviewToken& token,
                     const std::function<Failure(const std::string& path)>& read,
                     DocumentForm form = DocumentForm::file);

/// "… is damaged", with what the decoder said where it said anything.
Error damagedDocument(const Url& file, const std::string& detail = {});

} // namespace platform
