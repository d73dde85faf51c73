#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/MainOwned.h"
#include "preview/PreviewBaseViewController.h"
#include "preview/PreviewItemManager.h"
#include "preview/ProgressState.h"

namespace tavrin {
namespace {

using platform::FileProgressSubscription;
using platform::Progress;

/// A progress is logged in steps of a twentieth.
constexpr double chunkCount = 20;
constexpr platform::Duration screenHoldTime{16'666'667};

FileProgressSubscription& service() {
    return platform::Platform::current().fileProgress();
}

} // namespace

int PreviewBaseViewController::lastProgressChunk() const {
    return progress_->lastChunk;
}

void PreviewBaseViewController::registerForProgress() {
    const auto manager = platform::lockForMain(itemManager_);
    const auto item = manager ? manager->item() : nullptr;
    if (item && item->resolvedURL())
        progress_->begin(*item->resolvedURL(),
                         std::static_pointer_cast<PreviewBaseViewController>(shared_from_this()));
}

void PreviewBaseViewController::unregisterProgress() {
    progress_->end();
}

void PreviewBaseViewController::ProgressState::begin(
    const platform::Url& file, std::weak_ptr<PreviewBaseViewController> screen) {
    auto token = service().addSubscriber(
        file,
        [weak = weak_from_this(), screen = std::move(screen)](
            const std::shared_ptr<Progress>& progress) -> FileProgressSubscription::Unpublished {
            const auto self = weak.lock();
            return self ? self->observe(progress, screen) : FileProgressSubscription::Unpublished();
        });
    const std::lock_guard lock(mutex);
    subscriber.swap(token); // an earlier one ends outside the lock
}

void PreviewBaseViewController::ProgressState::end() {
    FileProgressSubscription::Token token;
    {
        const std::lock_guard lock(mutex);
        token.swap(subscriber);
    }
    if (token)
        service().removeSubscriber(token);
}

FileProgressSubscription::Unpublished PreviewBaseViewController::ProgressState::observe(
    const std::shared_ptr<Progress>& progress,
    const std::weak_ptr<PreviewBaseViewController>& screen) {
    const Progress::ObserverId observer = progress->addObserver(
        [weak = weak_from_this(), screen, held = std::weak_ptr(progress)](const Progress&) {
            const auto self = weak.lock();
            const auto current = held.lock();
            if (!self || !current)
                return;
            self->logStep(*current);
            if (const auto shown = self->hold(screen))
                (*shown)->updateProgress(current);
        });
    if (progress->kind() != platform::fileProgressKind)
        VXLOG(vxDebug, "ignoring progress with different kind %@, kind = %@", *progress,
              progress->kind());
    else if (progress->fractionCompleted() == 0)
        VXLOG(vxDebug, "ignoring progress with no progress done yet %@", *progress);
    else
        VXLOG(vxDebug, "got progress %@", *progress);
    return [weak = weak_from_this(), held = std::weak_ptr(progress), observer] {
        if (const auto current = held.lock())
            current->removeObserver(observer);
        if (const auto self = weak.lock())
            self->end();
    };
}

std::shared_ptr<PreviewBaseViewController::ProgressState::Screen>
PreviewBaseViewController::ProgressState::hold(
    const std::weak_ptr<PreviewBaseViewController>& screen) {
    const std::lock_guard lock(mutex);
    if (auto held = held_.lock())
        return held;
    auto held = std::make_shared<Screen>(screen.lock());
    if (!*held)
        return nullptr;
    held_ = held;
    platform::Platform::current().mainQueue().after(screenHoldTime, [held] {});
    return held;
}

void PreviewBaseViewController::ProgressState::logStep(const Progress& progress) {
    const double fraction = static_cast<double>(progress.completedUnitCount()) /
                            static_cast<double>(progress.totalUnitCount());
    const bool known = progress.totalUnitCount() > 0;
    const int chunk = known ? static_cast<int>(fraction * chunkCount) : 0;
    const int level = lastChunk.exchange(chunk) != chunk ? vxInfo : vxDebug;
    VXLOG(level, "Progress %@%%: %@", known ? fraction * 100 : 0.0, progress);
}

} // namespace tavrin
