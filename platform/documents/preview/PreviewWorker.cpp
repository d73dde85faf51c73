#include "platform/documents/preview/PreviewWorker.h"

#include "platform/base/Text.h"
#include "platform/base/WorkQueue.h"
#include "platform/documents/DisplayName.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"

#include <QCoreApplication>

#include <atomic>
#include <utility>
#include <vector>

namespace platform {
namespace {

Failure checkContents(const Url& file, DocumentForm form) {
    const Result<FileAttributes> attributes =
        FileManager::attributes(file.path(), FollowLinks::yes);
    if (!attributes)
        return attributes.error();
    if (form == DocumentForm::package)
        return attributes->kind == FileKind::directory ? Failure() : damagedDocument(file);
    if (attributes->kind != FileKind::file)
        return makeErrorWithText(ErrorCode::unsupportedOperation,
                                 attributes->kind == FileKind::directory
                                     ? localized("This is a folder, not a document.")
                                     : localized("This kind of document cannot be shown here."));
    if (attributes->size == 0)
        return makeErrorWithText(ErrorCode::readCorrupt,
                                 localized("There is nothing in this document."));
    return std::nullopt;
}

/// The queues of workers that have gone, until what they were doing is done. Nobody waits for that
/// but the end of the toolkit, whose threads and locks a decoder may be using. Of the main thread.
class Leftovers {
public:
    static Leftovers& shared() {
        static Leftovers* const leftovers = new Leftovers(); // lives as long as the process
        return *leftovers;
    }

    void take(std::unique_ptr<WorkQueue> queue, Job last) {
        std::erase_if(queues_, [](const Entry& each) { return each.over->load(); });
        const auto over = std::make_shared<std::atomic<bool>>(false);
        queue->async([last = std::move(last), over] {
            if (last)
                last();
            *over = true;
        });
        queues_.push_back({std::move(queue), over});
        if (!std::exchange(known_, true))
            qAddPostRoutine([] { shared().finish(); });
    }

private:
    struct Entry {
        std::unique_ptr<WorkQueue> queue;
        std::shared_ptr<std::atomic<bool>> over;
    };

    void finish() {
        queues_.clear();
        known_ = false;
    }

    std::vector<Entry> queues_;
    /// The toolkit will call at its end.
    bool known_ = false;
};

} // namespace

void PreviewToken::cancel() {
    cancel_.cancel();
    const std::lock_guard lock(mutex_); // what runs under it sees the end of it
}

void PreviewToken::ifWanted(const Job& job) {
    const std::lock_guard lock(mutex_);
    if (!isCancelled())
        job();
}

void PreviewToken::deliver(MainQueue& main, Job job) {
    ifWanted([&] {
        main.async([token = shared_from_this(), job = std::move(job)] {
            if (!token->isCancelled())
                job();
        });
    });
}

PreviewWorker::PreviewWorker(MainQueue& main)
    : main_(main),
      token_(std::make_shared<PreviewToken>(main.clock())),
      queue_(std::make_unique<WorkQueue>("platform.preview", WorkPriority::userInitiated)) {
}

PreviewWorker::~PreviewWorker() {
    token_->cancel();
    Leftovers::shared().take(std::move(queue_), std::move(lastJob_));
}

void PreviewWorker::run(Work work) {
    queue_->async([&main = main_, token = token_, work = std::move(work)] {
        if (token->isCancelled())
            return;
        Job rest = work(*token);
        if (rest)
            token->deliver(main, std::move(rest));
    });
}

void PreviewWorker::cancel() {
    token_->cancel();
    token_ = std::make_shared<PreviewToken>(main_.clock());
}

Failure readDocument(const Url& file, PreviewToken& token,
                     const std::function<Failure(const std::string& path)>& read,
                     DocumentForm form) {
    // A coordinated read would fetch the contents, which is for the user to ask for.
    if (ContentProvider* const provider = FileCoordinator::contentProvider();
        provider && provider->isPromised(file))
        return makeErrorWithText(ErrorCode::noSuchItem,
                                 localized("This document is not on this device. Download it "
                                           "first."));
    FileCoordinator coordinator;
    token.flag().setHandler([&coordinator] { coordinator.cancel(); });
    Failure failure;
    const Failure refused =
        coordinator.coordinateReading(file, ReadingOptions::withoutChanges, [&](const Url& url) {
            failure = checkContents(url, form);
            if (!failure && !token.isCancelled())
                failure = read(url.path());
        });
    token.flag().setHandler({});
    return refused ? refused : failure;
}

Error damagedDocument(const Url& file, const std::string& detail) {
    Error error = makeErrorWithText(ErrorCode::readCorrupt,
                                    localizedFormat("“%1$@” is damaged, or not what its name says.",
                                                    displayName(file.lastPathComponent())));
    if (!detail.empty())
        error.localizedFailureReason = detail;
    return error;
}

} // namespace platform
