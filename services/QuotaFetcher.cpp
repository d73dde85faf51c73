#include "services/QuotaFetcher.h"

#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/MainOwned.h"
#include "platform/cloud/QuotaOperation.h"
#include "platform/ui/Application.h"
#include "services/NetworkWatcher.h"

namespace tavrin {
namespace {

constexpr platform::Duration pollingLeeway = std::chrono::seconds(1);

} // namespace

QuotaFetcher::QuotaFetcher()
    : queue_(std::make_shared<platform::WorkQueue>(std::string(platform::applicationIdentifier) +
                                                   ".quotafetcher")) {
}

std::shared_ptr<QuotaFetcher> QuotaFetcher::create() {
    std::shared_ptr<QuotaFetcher> fetcher(new QuotaFetcher());
    platform::NotificationCenter& center = platform::Platform::current().notifications();
    QuotaFetcher* const self = fetcher.get(); // its observations end with it, on the main thread
    fetcher->becameActive_ =
        center.observe(platform::applicationDidBecomeActiveNotification,
                       [self](const auto& notice) { self->didBecomeActiveNotification(notice); });
    fetcher->willResign_ =
        center.observe(platform::applicationWillResignActiveNotification,
                       [self](const auto& notice) { self->willResignActiveNotification(notice); });
    return fetcher;
}

QuotaFetcher::~QuotaFetcher() = default;

void QuotaFetcher::runWithInterval(double seconds) {
    timer_.reset();
    const auto interval = static_cast<std::uint64_t>(seconds * 1e9);
    timer_ =
        std::make_unique<platform::TimerSource>(platform::Platform::current().clock(), *queue_);
    timer_->schedule(platform::Duration::zero(),
                     platform::Duration(static_cast<std::int64_t>(interval)), pollingLeeway);
    timer_->setHandler([weak = weak_from_this()] {
        if (const auto self = platform::lockForMain(weak))
            self->performFetch();
    });
    timer_->resume();
}

void QuotaFetcher::performFetch() {
    if (!canFetch_ || !NetworkWatcher::sharedNetworkWatcher()->isConnected()) {
        VXLOG(vxDebug, "Not fetching quota. Background or offline");
        return;
    }
    auto operation = std::make_shared<platform::QuotaOperation>();
    operation->qualityOfService = platform::QualityOfService::utility;
    operation->allowsCellularAccess = true;
    operation->completion = [weak =
                                 weak_from_this()](const platform::Result<std::uint64_t>& bytes) {
        if (!bytes) {
            VXLOG(vxWarning, "can't update quota: %@", bytes.error());
            return;
        }
        platform::Platform::current().mainQueue().async([weak, free = *bytes] {
            if (const auto self = weak.lock())
                self->notify(free);
        });
    };
    platform::Platform::current()
        .privateDatabase(platform::cloudDocumentsContainerIdentifier)
        .addOperation(std::move(operation));
}

void QuotaFetcher::notify(std::uint64_t freeBytes) {
    freeBytes_ = freeBytes;
    if (const auto delegate = delegate_.lock())
        delegate->quotaFetcherDidUpdateValue(*this, freeBytes_);
}

void QuotaFetcher::didBecomeActiveNotification(const platform::Notification& notification) {
    VXLOG(vxInfo, "%@ (quota)", notification.name);
    canFetch_ = true;
}

void QuotaFetcher::willResignActiveNotification(const platform::Notification& notification) {
    VXLOG(vxInfo, "%@ (quota)", notification.name);
    canFetch_ = false;
}

} // namespace tavrin
