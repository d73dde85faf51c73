#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/MainOwned.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Application.h"
#include "preview/PreviewDownloadViewController.h"
#include "preview/PreviewItemManager.h"
#include "services/NetworkIndicator.h"
#include "services/NetworkWatcher.h"

namespace tavrin {
namespace {

using platform::ErrorCode;
using platform::Failure;
using platform::FileCoordinator;
using platform::ReadingOptions;
using platform::Url;

constexpr const char* indicatorKey = "PreviewDownload";

bool hasCode(const platform::Error& error, ErrorCode code) {
    return error.code == static_cast<int>(code); // whatever the domain
}

NetworkIndicator& indicator() {
    return *NetworkIndicator::sharedNetworkIndicator();
}

/// No download uses the platform any more once the application has told of its end.
platform::Observation waitAtTermination(const std::shared_ptr<platform::WorkQueue>& queue) {
    return platform::Platform::current().notifications().observe(
        platform::applicationWillTerminateNotification,
        [weak = std::weak_ptr(queue)](const platform::Notification&) {
            if (const auto running = weak.lock())
                running->sync([] {});
        });
}

void evictPartialCopy(const std::optional<Url>& url) {
    if (!url)
        return;
    if (const Failure failure = platform::Platform::current().documents().evictItem(*url))
        VXLOG(vxInfo, "Failed to evict %@: %@", *url, *failure);
    else
        VXLOG(vxDebug, "Evicted %@", *url);
}

} // namespace

void PreviewItemManager::startDownload() {
    startDownloading([weak = weak_from_this()](const std::optional<Url>& oldUrl,
                                               const std::optional<Url>& newUrl,
                                               const Failure& error) {
        if (error)
            VXLOG(vxError, "Error downloading %@: %@", oldUrl, *error);
        else
            VXLOG(vxInfo, "Showing preview of URL %@", newUrl);
        const auto self = weak.lock();
        if (!self)
            return;
        if (const auto screen = self->downloadViewController())
            screen->setDownloading(false);
        if (error)
            self->showDownloadError(error);
        else
            // The contents may come while the screen is already on its way out.
            self->setItem(std::make_shared<VXItem>(newUrl), !self->wasLeft());
    });
}

/// The preview was made from the document's contents: a change notice had found them arrived.
bool PreviewItemManager::showsContentsOf(const std::optional<Url>& url) const {
    const ItemPointer current = item();
    return current && current->isDownloaded() && current->resolvedURL() == url;
}

std::shared_ptr<FileCoordinator>
PreviewItemManager::replaceDownloadCoordinator(std::uint64_t cancellations) {
    cancelCoordinator();
    auto coordinator = std::make_shared<FileCoordinator>(
        std::weak_ptr<platform::FilePresenter>(shared_from_this()));
    const std::lock_guard lock(lock_);
    if (cancellations_ != cancellations)
        coordinator->cancel();
    downloadFC_ = coordinator;
    return coordinator;
}

/// One download on its queue. Holds the manager only for moments, so that its destruction can
/// cancel the blocking read.
struct PreviewItemManager::Download {
    std::weak_ptr<PreviewItemManager> manager;
    DownloadCompletion completion;
    std::shared_ptr<FileCoordinator> coordinator;
    std::uint64_t cancellations = 0; // when it was asked for
    std::optional<Url> url;

    void run() {
        if (!begin())
            return;
        const Failure failure = coordinator->coordinateReading(
            *url, ReadingOptions::withoutChanges | ReadingOptions::resolvesSymbolicLink,
            [this](const Url& readUrl) { succeed(readUrl); });
        if (failure)
            fail(*failure);
    }

    bool begin() {
        const auto self = platform::lockForMain(manager);
        if (!self)
            return false;
        VXLOG(vxDebug, "Download queue: changing FilePresenter");
        coordinator = self->replaceDownloadCoordinator(cancellations);
        url = self->itemResolvedUrl();
        if (!url)
            return false;
        if (FileUtils::exists(*url)) {
            VXLOG(vxDebug, "Dispatching download -- although file is already local");
        } else {
            VXLOG(vxInfo, "Dispatching download of %@", *url);
            indicator().show(indicatorKey);
        }
        const platform::MainOwned screen(self->downloadViewController());
        if (screen)
            screen->registerForProgress();
        return true;
    }

    void succeed(const Url& readUrl) const {
        // A read is granted for what is not there as well; there is nothing to show of it.
        if (!FileUtils::exists(readUrl)) {
            fail(platform::makeError(ErrorCode::noSuchItem, readUrl.lastPathComponent()));
            return;
        }
        auto self = platform::lockForMain(manager);
        const std::optional<Url> current = self ? self->itemResolvedUrl() : url;
        VXLOG(vxDebug, "coordinateReadingItemAtURL finished, old URL %@, new URL %@", current,
              readUrl);
        indicator().hide(indicatorKey);
        // Strong: the result is not lost to an owner that lets go between here and the main queue.
        platform::Platform::current().mainQueue().async(
            [held = self.get(), download = *this, readUrl] {
                if (held)
                    held->finishDownload(download, readUrl, std::nullopt);
                else
                    download.completion(download.url, readUrl, std::nullopt);
            });
    }

    void fail(const platform::Error& error) const {
        bool shown = false;
        if (const auto self = platform::lockForMain(manager)) {
            const platform::MainOwned screen(self->downloadViewController());
            if (screen)
                screen->unregisterProgress();
            shown = self->showsContentsOf(url);
        }
        indicator().hide(indicatorKey);
        if (hasCode(error, ErrorCode::userCancelled)) {
            VXLOG(vxDebug, "coordinateReadingItemAtURL was cancelled, URL %@", url);
            if (!shown)
                evictPartialCopy(url);
        } else {
            VXLOG(vxError, "coordinateReadingItemAtURL failed, URL %@: %@", url, error);
        }
        platform::Platform::current().mainQueue().async([download = *this, error] {
            if (const auto self = download.manager.lock())
                self->finishDownload(download, std::nullopt, error);
            else
                download.completion(download.url, std::nullopt, error);
        });
    }
};

void PreviewItemManager::startDownloading(DownloadCompletion completion) {
    VXLOG(vxDebug, "Dispatching download...");
    Download download{weak_from_this(), std::move(completion), nullptr, 0, std::nullopt};
    {
        const std::lock_guard lock(lock_);
        download.cancellations = cancellations_;
    }
    // Of the job, not of the manager: that one may be gone while its read still comes to an end.
    const auto ending = std::make_shared<platform::Observation>(waitAtTermination(downloadQueue_));
    // The job holds its queue, not the manager: a manager that goes away ends the read instead of
    // waiting for it.
    downloadQueue_->async([queue = downloadQueue_, ending, download]() mutable { download.run(); });
}

void PreviewItemManager::finishDownload(const Download& download, const std::optional<Url>& newUrl,
                                        const Failure& error) {
    download.completion(itemResolvedUrl(), newUrl, error);
    const std::lock_guard lock(lock_);
    if (downloadFC_ == download.coordinator) // a newer download keeps its own
        downloadFC_.reset();
}

void PreviewItemManager::cancelDownload() {
    {
        const std::lock_guard lock(lock_);
        ++cancellations_;
    }
    cancelCoordinator();
}

void PreviewItemManager::cancelCoordinator() {
    if (const auto coordinator = downloadFC())
        coordinator->cancel();
    indicator().hide(indicatorKey);
}

std::shared_ptr<FileCoordinator> PreviewItemManager::downloadFC() const {
    const std::lock_guard lock(lock_);
    return downloadFC_;
}

void PreviewItemManager::showDownloadError(const Failure& error) {
    if (!error || hasCode(*error, ErrorCode::userCancelled))
        return;
    std::string message = UIUtils::bestMessage(error);
    if (hasCode(*error, ErrorCode::serverNotAvailable) &&
        !NetworkWatcher::sharedNetworkWatcher()->isConnected())
        message = platform::localized(
            "Unable to download file. You are no longer connected to the Internet.");
    const auto navigation = navigationController();
    const Screen top = navigation ? navigation->topViewController() : nullptr;
    if (!top)
        return;
    auto alert = platform::AlertController::create("", message, platform::AlertStyle::alert);
    alert->addAction(
        platform::AlertAction::make(platform::localized("OK"), platform::ActionStyle::standard));
    top->presentViewController(alert, true);
}

} // namespace tavrin
