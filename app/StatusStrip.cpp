#include "app/StatusStrip.h"

#include "browse/AccountReport.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/system/NetworkActivityIndicator.h"

#include <chrono>
#include <optional>

namespace tavrin {
namespace {

using platform::localized;
using platform::Platform;

constexpr auto activityDelay = std::chrono::milliseconds(300);
/// Stands for the store of whoever is signed in.
constexpr const char* watchedHost = "www.pelmora.com";

std::string networkText(std::optional<std::uint32_t> flags) {
    if (!flags)
        return {};
    if ((*flags & platform::reachabilityReachable) == 0)
        return localized("Offline");
    return localized((*flags & platform::reachabilityCellular) != 0 ? "Cellular" : "Wi-Fi");
}

} // namespace

/// What reports reach; they may come while the strip is going.
struct StatusStrip::Reports {
    StatusStrip* strip = nullptr;
    std::optional<std::uint32_t> flags; // none before the first report
};

StatusStrip::StatusStrip(platform::Window& window)
    : window_(window),
      reports_(std::make_shared<Reports>()),
      queue_(std::make_shared<platform::WorkQueue>(std::string(platform::applicationIdentifier) +
                                                   ".statusstrip")) {
    reports_->strip = this;
    Platform& platform = Platform::current();
    const auto changed = [this](const platform::Notification&) { update(); };
    accountChanged_ =
        platform.notifications().observe(platform::cloudIdentityDidChangeNotification, changed);
    problemChanged_ =
        platform.notifications().observe(platform::cloudProblemDidChangeNotification,
                                         [this](const platform::Notification&) {
                                             update();
                                             askWhatWaits();
                                         });
    activityChanged_ = platform.notifications().observe(
        platform::networkActivityIndicatorDidChangeNotification, changed);
    transfersChanged_ = platform.notifications().observe(
        platform::cloudActivityDidChangeNotification, [this](const platform::Notification&) {
            if (!activityTimer_)
                activityTimer_ = Platform::current().mainQueue().timer(
                    activityDelay, [this] { updateActivity(); });
        });
    target_ = platform.reachability().createTarget(watchedHost);
    if (target_) {
        target_->setCallback([weak = std::weak_ptr(reports_)](std::uint32_t flags) {
            Platform::current().mainQueue().async([weak, flags] {
                const std::shared_ptr<Reports> reports = weak.lock();
                if (!reports)
                    return;
                reports->flags = flags;
                reports->strip->update();
            });
        });
        target_->setQueue(queue_);
    }
    update();
    askWhatWaits();
}

StatusStrip::~StatusStrip() {
    if (!target_)
        return;
    target_->setCallback({});
    target_->setQueue(nullptr);
}

void StatusStrip::updateActivity() {
    std::string now = transferSummary(Platform::current().cloud().transfers());
    if (now == activity_)
        return;
    activity_ = std::move(now);
    update();
}

void StatusStrip::askWhatWaits() {
    queue_->async([weak = std::weak_ptr(reports_)] {
        if (weak.expired())
            return;
        Platform::current().mainQueue().async(
            [weak, text = waitingSummary(Platform::current().cloud().pending())] {
                const std::shared_ptr<Reports> reports = weak.lock();
                if (!reports || reports->strip->waiting_ == text)
                    return;
                reports->strip->waiting_ = text;
                reports->strip->update();
            });
    });
}

void StatusStrip::update() {
    const platform::CloudAccountService& accounts = Platform::current().accounts();
    const auto account = accounts.account();
    std::string text = account ? account->name : localized("Not signed in");
    // What keeps the store from its work, or what had to be done to it; without an account the
    // screen says so itself.
    if (const auto problem = accounts.problem(); problem && accounts.identityToken())
        text += " – " + *problem;
    else if (account && !(activity_.empty() && waiting_.empty()))
        text += " – " + (activity_.empty() ? waiting_ : activity_);
    window_.setStatusStrip({text, account ? networkText(reports_->flags) : std::string(),
                            Platform::current().networkActivityIndicator().isVisible()});
}

} // namespace tavrin
