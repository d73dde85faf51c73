#include "platform/documents/preview/PreviewWorker.h"

#include "platform/base/Text.h"
#include "platform/base/WorkQueue.h"
#include "platform/documents/DisplayName.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"

namespace platform {
namespace {

Failure checkContents(const Url& file) {
    const Result<FileAttributes> attributes =
        FileManager::attributes(file.path(), FollowLinks::yes);
    if (!attributes)
        return attributes.error();
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

PreviewWorker::PreviewWorker(MainQueue& main)
    : main_(main),
      queue_(std::make_shared<WorkQueue>("platform.preview", WorkPriority::userInitiated)) {
}

PreviewWorker::~PreviewWorker() {
    token_->cancel();
    // The queue's own last job lets go of it, so that its thread ends by itself.
    const std::shared_ptr<WorkQueue> queue = std::move(queue_);
    queue->async([queue, last = std::move(lastJob_)] {
        if (last)
            last();
    });
}

void PreviewWorker::run(Work work) {
    queue_->async([&main = main_, token = token_, work = std::move(work)] {
        if (token->isCancelled())
            return;
        Job rest = work(*token);
        if (!rest)
            return;
        token->ifWanted([&] {
            main.async([token, rest = std::move(rest)] {
                if (!token->isCancelled())
                    rest();
            });
        });
    });
}

void PreviewWorker::cancel() {
    token_->cancel();
    token_ = std::make_shared<PreviewToken>();
}

Failure readDocument(const Url& file, PreviewToken& token,
                     const std::function<Failure(const std::string& path)>& read) {
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
            failure = checkContents(url);
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
