#include "preview/PreviewDownloadViewController.h"

#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/ByteCount.h"
#include "platform/base/Text.h"
#include "preview/ConstraintUtils.h"
#include "preview/PreviewItemManager.h"
#include "services/NetworkWatcher.h"

#include <utility>

namespace tavrin {
namespace {

using platform::Axis;
using platform::Orientation;

/// Larger files do not start on a cellular network. 100 MiB; exactly so much is allowed.
constexpr std::uint64_t cellularDownloadLimit = 104'857'600;
constexpr double stackSpacing = 15;
/// The widget hears of at most one report a frame.
constexpr platform::Duration frameTime{16'666'667};

platform::MainQueue& mainQueue() {
    return platform::Platform::current().mainQueue();
}

} // namespace

void PreviewDownloadViewController::viewDidLoad() {
    PreviewBaseViewController::viewDidLoad();
    setupViewsAndConstraints();
}

void PreviewDownloadViewController::setupViewsAndConstraints() {
    thumbnailView_ = std::make_shared<ThumbnailImageView>();
    downloadView_ = std::make_shared<DownloadView>();
    downloadView_->setDelegate(
        std::static_pointer_cast<PreviewDownloadViewController>(shared_from_this()));
    downloadView_->roundProgressView()->setStepHandler([weak = weak_from_this()] {
        if (const auto self = std::static_pointer_cast<PreviewDownloadViewController>(weak.lock()))
            self->showWaitingReport();
    });
    for (const Axis axis : {Axis::horizontal, Axis::vertical}) {
        thumbnailView_->setContentHuggingPriority(takesSpareRoom, axis);
        thumbnailView_->setCompressionResistancePriority(platform::layoutRequired, axis);
        downloadView_->setContentHuggingPriority(platform::layoutRequired, axis);
        downloadView_->setCompressionResistancePriority(platform::layoutRequired, axis);
    }
    thumbnailView_->setLaidOutByConstraints(true);
    downloadView_->setLaidOutByConstraints(true);

    mainStackView_ = std::make_shared<platform::StackView>(
        std::vector<std::shared_ptr<platform::View>>{thumbnailView_, downloadView_});
    mainStackView_->setLaidOutByConstraints(true);
    mainStackView_->setAxis(Axis::vertical);
    mainStackView_->setDistribution(platform::StackDistribution::fill);
    mainStackView_->setAlignment(platform::StackAlignment::center);
    mainStackView_->setSpacing(stackSpacing);
    wrapperView()->addSubview(mainStackView_);
    platform::LayoutConstraint::activate(
        ConstraintUtils::stretchSubviewConstraints(*mainStackView_, *wrapperView()));
    adjustViewsForOrientation(currentPseudoOrientation());
}

void PreviewDownloadViewController::viewWillAppear(bool animated) {
    PreviewBaseViewController::viewWillAppear(animated);
    if (downloading_)
        downloadView_->setDownloading(true);
}

void PreviewDownloadViewController::setDownloading(bool downloading) {
    downloading_ = downloading;
    waitingReport_ = nullptr;
    if (isViewLoaded())
        downloadView_->setDownloading(downloading);
}

void PreviewDownloadViewController::refreshItem() {
    PreviewBaseViewController::refreshItem();
    if (!isViewLoaded())
        return;
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    downloadView_->setItem(item);
    thumbnailView_->setItem(item);
}

void PreviewDownloadViewController::updateProgress(
    const std::shared_ptr<platform::Progress>& progress) {
    // Called on the transfer's thread, up to thousands of times a second.
    if (reportWaiting_->exchange(true))
        return;
    const auto show = [weak = weak_from_this(), waiting = reportWaiting_, progress] {
        waiting->store(false);
        const auto self = std::static_pointer_cast<PreviewDownloadViewController>(weak.lock());
        if (self && self->isViewLoaded())
            self->takeReport(progress);
    };
    const bool atAnEnd = progress->completedUnitCount() == 0 ||
                         progress->completedUnitCount() >= progress->totalUnitCount();
    if (atAnEnd)
        mainQueue().async(show);
    else
        mainQueue().after(frameTime, show);
}

void PreviewDownloadViewController::takeReport(
    const std::shared_ptr<platform::Progress>& progress) {
    waitingReport_ = progress;
    if (!downloadView_->roundProgressView()->isAnimating())
        showWaitingReport();
}

void PreviewDownloadViewController::showWaitingReport() {
    if (const auto report = std::exchange(waitingReport_, nullptr))
        downloadView_->updateProgress(*report);
}

void PreviewDownloadViewController::adjustViewsForOrientation(Orientation orientation) {
    const bool landscape =
        orientation == Orientation::landscapeLeft || orientation == Orientation::landscapeRight;
    mainStackView_->setAxis(landscape ? Axis::horizontal : Axis::vertical);
    mainStackView_->setDistribution(landscape ? platform::StackDistribution::fillEqually
                                              : platform::StackDistribution::fill);
}

void PreviewDownloadViewController::viewWillTransitionToSize(
    platform::Size size, platform::TransitionCoordinator& coordinator) {
    PreviewBaseViewController::viewWillTransitionToSize(size, coordinator);
    mainQueue().async([weak = weak_from_this(), size] {
        const auto self = std::static_pointer_cast<PreviewDownloadViewController>(weak.lock());
        if (!self || !self->isViewLoaded())
            return;
        self->adjustViewsForOrientation(platform::orientationForSize(size.width, size.height));
        self->configureMargins();
    });
}

void PreviewDownloadViewController::downloadViewDidPressStartDownload(
    DownloadView& view, const std::optional<platform::Url>& /*url*/) {
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    if (!item)
        return;
    const bool cellular = NetworkWatcher::sharedNetworkWatcher()->networkState() == networkCellular;
    if (cellular && item->fileSize().value_or(0) > cellularDownloadLimit) {
        const std::string limit =
            platform::byteCountText(cellularDownloadLimit, platform::ByteCountStyle::binary);
        UIUtils::showAlert(
            platform::localizedFormat("This item is over %@.", limit),
            platform::localizedFormat("“%@” will not download until you connect to Wi-Fi.",
                                      item->localizedName().value_or("")),
            shared_from_this());
        return;
    }
    view.setDownloading(true);
    manager->startDownload();
}

void PreviewDownloadViewController::downloadViewDidPressCancelDownload(
    DownloadView& view, const std::optional<platform::Url>& /*url*/) {
    waitingReport_ = nullptr;
    view.setDownloading(false);
    if (const auto manager = itemManager())
        manager->cancelDownload();
}

} // namespace tavrin
