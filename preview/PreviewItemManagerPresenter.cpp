#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "preview/GlimpseItemController.h"
#include "preview/PreviewDetailsViewController.h"
#include "preview/PreviewItemManager.h"

namespace tavrin {
namespace {

using platform::FileCoordinator;
using platform::Url;

/// Notices of change that come within this time are merged into one refresh.
constexpr auto mergeTime = std::chrono::seconds(1);

platform::MainQueue& mainQueue() {
    return platform::Platform::current().mainQueue();
}

void reloadVisiblePreview() {
    const auto& preview = GlimpseItemController::defaultController();
    if (preview->isVisible())
        preview->refreshCurrentPreviewItem();
}

} // namespace

void PreviewItemManager::registerAsFilePresenter() {
    const std::lock_guard lock(registrationLock_);
    if (filePresenterRegistered_)
        return;
    FileCoordinator::addFilePresenter(shared_from_this());
    filePresenterRegistered_ = true;
}

void PreviewItemManager::unregisterAsFilePresenter() {
    const std::lock_guard lock(registrationLock_);
    if (!filePresenterRegistered_)
        return;
    FileCoordinator::removeFilePresenter(this); // also from the destructor: no shared pointer
    filePresenterRegistered_ = false;
}

bool PreviewItemManager::filePresenterRegistered() const {
    const std::lock_guard lock(registrationLock_);
    return filePresenterRegistered_;
}

bool PreviewItemManager::refreshPending() const {
    const std::lock_guard lock(lock_);
    return refreshPending_;
}

std::optional<Url> PreviewItemManager::presentedItemURL() const {
    return itemUrl();
}

std::shared_ptr<platform::Executor> PreviewItemManager::presentedItemOperationQueue() const {
    return fcQueue_;
}

bool PreviewItemManager::takeRefreshTurn() {
    const std::lock_guard lock(lock_);
    return !std::exchange(refreshPending_, true);
}

void PreviewItemManager::finishRefreshTurn() {
    const std::lock_guard lock(lock_);
    refreshPending_ = false;
}

void PreviewItemManager::presentedItemDidChange() {
    VXLOG(vxInfo, "%@ changed", itemUrl());
    if (!takeRefreshTurn())
        return;
    mainQueue().after(mergeTime, [weak = weak_from_this()] {
        const auto self = weak.lock();
        if (!self)
            return;
        if (const std::optional<Url> url = self->itemUrl())
            self->refreshItem(*url);
        self->finishRefreshTurn();
    });
}

void PreviewItemManager::refreshItem(const Url& url) {
    const auto fresh = std::make_shared<VXItem>(url);
    const std::optional<platform::Date> date = fresh->contentModificationDate();
    VXLOG(vxDebug, "%@: %@ vs %@", fresh->url(), modifiedDate_, date);
    const bool newer = modifiedDate_ && date && *modifiedDate_ < *date;
    modifiedDate_ = date;
    const ItemPointer current = item();
    const auto details = detailsViewController();
    const bool arrived = current && !current->isDownloaded() && fresh->isDownloaded();
    const bool rebuild = arrived && (!details || details->view()->isHidden()) && !wasLeft();
    setItem(fresh, rebuild);
    VXLOG(vxInfo, "Refreshing %@", itemUrl());
    if (fullPreviewLagsBehind())
        GlimpseItemController::defaultController()->glimpseNewItem(shared_from_this());
    else if (newer)
        reloadVisiblePreview();
    if (const auto shown = detailsViewController())
        shown->refreshItem();
}

/// The full preview shows this manager's document, at the place where it was before a move.
bool PreviewItemManager::fullPreviewLagsBehind() const {
    const auto& preview = GlimpseItemController::defaultController();
    const std::optional<std::vector<Url>>& shown = preview->arrayOfDocuments();
    const std::optional<Url> current = itemResolvedUrl();
    return preview->itemManager().get() == this && shown && !shown->empty() && current &&
           shown->front() != *current;
}

void PreviewItemManager::presentedItemDidMoveToURL(const Url& newUrl) {
    VXLOG(vxInfo, "presentedItemDidMoveToURL: %@ changed to %@", itemUrl(), newUrl);
    mainQueue().async([weak = weak_from_this(), newUrl] {
        if (const auto self = weak.lock())
            self->refreshItem(newUrl);
    });
}

void PreviewItemManager::accommodatePresentedItemDeletionWithCompletionHandler(
    DeletionHandler handler) {
    VXLOG(vxInfo, "%@ accommodate deletion", itemUrl());
    handler(std::nullopt);
    unregisterAsFilePresenter();
    mainQueue().async([self = shared_from_this()] { self->popScreen(); });
}

void PreviewItemManager::popScreen() {
    const auto navigation = navigationController();
    // Whoever deleted the file from its preview, or has left that, is back at the list already.
    if (navigation && worksFor(navigation->topViewController()))
        navigation->popViewController(true);
}

bool PreviewItemManager::worksFor(const Screen& screen) const {
    if (const auto preview = std::dynamic_pointer_cast<PreviewBaseViewController>(screen))
        return preview->itemManager().get() == this;
    const auto full = std::dynamic_pointer_cast<GlimpseItemController>(screen);
    return full && full->itemManager().get() == this;
}

void PreviewItemManager::accommodatePresentedSubitemDeletionAtURL(const Url& part,
                                                                  DeletionHandler handler) {
    VXLOG(vxInfo, "%@ accommodate subitem deletion at %@", itemUrl(), part);
    handler(std::nullopt);
    unregisterAsFilePresenter();
    mainQueue().after(mergeTime, [weak = weak_from_this()] {
        const auto self = weak.lock();
        if (!self)
            return;
        VXLOG(vxInfo, "Refreshing %@", self->itemUrl());
        reloadVisiblePreview();
        self->finishRefreshTurn();
    });
}

} // namespace tavrin
