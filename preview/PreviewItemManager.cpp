#include "preview/PreviewItemManager.h"

#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "platform/Platform.h"
#include "platform/base/MainOwned.h"
#include "platform/documents/DocumentSearchController.h"
#include "platform/files/FileManager.h"
#include "platform/ui/Application.h"
#include "preview/GlimpseItemController.h"
#include "preview/PreviewDetailsViewController.h"
#include "preview/PreviewDownloadViewController.h"
#include "services/NetworkWatcher.h"

namespace tavrin {
namespace {

using platform::Url;

/// Files from here on are not downloaded unasked.
constexpr std::uint64_t autoDownloadLimit = 6'291'456; // 6 MiB

} // namespace

PreviewItemManager::PreviewItemManager()
    : fcQueue_(std::make_shared<platform::OperationQueue>()),
      downloadQueue_(std::make_shared<platform::WorkQueue>("downloadQueue")) {
}

std::shared_ptr<PreviewItemManager> PreviewItemManager::create() {
    std::shared_ptr<PreviewItemManager> manager(new PreviewItemManager());
    platform::NotificationCenter& center = platform::Platform::current().notifications();
    // Weak: the manager may come to its end on another thread while a notification is posted.
    const auto calling = [weak = std::weak_ptr(manager)](void (PreviewItemManager::*operation)()) {
        return [weak, operation](const platform::Notification&) {
            if (const auto self = weak.lock())
                ((*self).*operation)();
        };
    };
    manager->becameActive_ =
        center.observe(platform::applicationDidBecomeActiveNotification,
                       calling(&PreviewItemManager::didBecomeActiveNotification));
    manager->willResign_ =
        center.observe(platform::applicationWillResignActiveNotification,
                       calling(&PreviewItemManager::willResignActiveNotification));
    manager->willTerminate_ = center.observe(platform::applicationWillTerminateNotification,
                                             calling(&PreviewItemManager::cancelDownload));
    // So that the full-preview screen exists before the first preview.
    GlimpseItemController::defaultController();
    return manager;
}

PreviewItemManager::~PreviewItemManager() {
    cancelDownload();
    unregisterAsFilePresenter();
    // The last reference may have been a notice's, on another thread; the screens end on the main
    // one.
    const platform::MainOwned download(std::move(downloadViewController_));
    const platform::MainOwned details(std::move(detailsViewController_));
    const platform::MainOwned menu(std::move(documentInteractionController_));
}

void PreviewItemManager::setItem(const ItemPointer& item, bool updatePreview) {
    VXLOG(vxDebug, "Previewing %@", item ? item->url() : std::nullopt);
    if (!updatePreview) {
        replaceItem(item);
        return;
    }
    if (const Screen screen = prepareToPreviewItem(item)) {
        replaceLastViewController(screen);
        finishPreviewingItem();
    }
}

PreviewItemManager::Screen PreviewItemManager::prepareToPreviewItem(const ItemPointer& item) {
    const std::optional<Url> oldUrl = itemUrl();
    const std::optional<Url> newUrl = item ? item->url() : std::nullopt;
    // Before the cancellation: what has arrived whole and is shown now is not evicted by it.
    replaceItem(item);
    cancelDownload();
    if (!oldUrl || !newUrl || *oldUrl != *newUrl)
        unregisterAsFilePresenter();
    if (!item || !item->resolvedURL() || item->resolvedURL()->path().empty()) {
        VXLOG(vxWarning, "no preview URL, nothing to show");
        return nullptr;
    }
    modifiedDate_ = item->contentModificationDate();
    registerAsFilePresenter();
    const bool local = platform::FileManager::exists(item->resolvedURL()->path());
    setScreens(nullptr, nullptr);

    Screen screen;
    const char* name = "PreviewDetailsViewController";
    if (mode_ != fullPreviewMode) {
        screen = createDetailsViewController();
    } else if (local) {
        screen = createGlimpseController();
        name = "GlimpseItemController";
    } else {
        autoDownload_ = shouldAutoDownload();
        screen = createDownloadViewController();
        name = "PreviewDownloadViewController";
    }
    if (local)
        VXLOG(vxDebug, "Preview: File exists, using %@", name);
    else
        VXLOG(vxDebug, "Preview: File doesn't exist, using %@", name);
    return screen;
}

void PreviewItemManager::finishPreviewingItem() {
    const auto navigation = navigationController();
    if (!autoDownload_ || !navigation || mode_ != fullPreviewMode)
        return;
    if (!std::dynamic_pointer_cast<PreviewDownloadViewController>(navigation->topViewController()))
        return;
    if (const auto screen = downloadViewController())
        screen->setDownloading(true);
    startDownload();
}

bool PreviewItemManager::shouldAutoDownload() const {
    const ItemPointer current = item();
    if (!current || NetworkWatcher::sharedNetworkWatcher()->networkState() != networkWiFi)
        return false;
    if (current->fileSize().value_or(0) >= autoDownloadLimit)
        return false;
    VXLOG(vxInfo, "CanPreview=%@ for %@", current->canPreview(), current->resolvedURL());
    return current->canPreview();
}

PreviewItemManager::Screen PreviewItemManager::createDownloadViewController() {
    auto screen = std::make_shared<PreviewDownloadViewController>();
    setScreens(screen, nullptr);
    screen->setMode(mode_);
    screen->setItemManager(weak_from_this());
    return screen;
}

PreviewItemManager::Screen PreviewItemManager::createDetailsViewController() {
    auto screen = std::make_shared<PreviewDetailsViewController>();
    setScreens(nullptr, screen);
    screen->setMode(mode_);
    screen->setItemManager(weak_from_this());
    return screen;
}

PreviewItemManager::Screen PreviewItemManager::createGlimpseController() {
    const std::shared_ptr<GlimpseItemController> screen =
        GlimpseItemController::defaultController();
    screen->glimpseNewItem(shared_from_this());
    return screen;
}

void PreviewItemManager::replaceLastViewController(const Screen& screen) {
    const auto navigation = navigationController();
    if (!navigation)
        return;
    left_ = false;
    std::vector<Screen> screens = navigation->viewControllers();
    if (!screens.empty() && isPreviewControllerDisplayed(screens.back().get())) {
        screens.back() = screen;
        navigation->setViewControllers(std::move(screens), false);
        return;
    }
    const auto presented = navigation->presentedViewController();
    if (std::dynamic_pointer_cast<platform::DocumentSearchController>(presented)) {
        navigation->dismissViewController(true, [weak = navigationController_, screen] {
            if (const auto stack = weak.lock())
                stack->pushViewController(screen, true);
        });
        return;
    }
    navigation->pushViewController(screen, true);
}

bool PreviewItemManager::isPreviewControllerDisplayed(const platform::ViewController* screen) {
    return dynamic_cast<const PreviewBaseViewController*>(screen) != nullptr ||
           dynamic_cast<const GlimpseItemController*>(screen) != nullptr;
}

void PreviewItemManager::viewControllerWillDisappear(const platform::ViewController& screen) {
    const auto navigation = navigationController();
    left_ = !navigation || !worksFor(navigation->topViewController());
    const auto download = downloadViewController();
    const auto details = detailsViewController();
    if (static_cast<const platform::ViewController*>(download.get()) == &screen) {
        cancelDownload();
        setScreens(nullptr, details);
    } else if (static_cast<const platform::ViewController*>(details.get()) == &screen) {
        setScreens(download, nullptr);
    }
}

void PreviewItemManager::didBecomeActiveNotification() {
    VXLOG(vxDebug, "Becoming active for %@", itemUrl());
    registerAsFilePresenter();
}

void PreviewItemManager::willResignActiveNotification() {
    VXLOG(vxDebug, "Resigning active for %@", itemUrl());
    unregisterAsFilePresenter();
}

PreviewItemManager::ItemPointer PreviewItemManager::item() const {
    const std::lock_guard lock(lock_);
    return item_;
}

std::optional<Url> PreviewItemManager::itemUrl() const {
    const std::lock_guard lock(lock_);
    return item_ ? item_->url() : std::nullopt;
}

std::optional<Url> PreviewItemManager::itemResolvedUrl() const {
    const std::lock_guard lock(lock_);
    return item_ ? item_->resolvedURL() : std::nullopt;
}

void PreviewItemManager::replaceItem(const ItemPointer& item) {
    const std::lock_guard lock(lock_);
    item_ = item;
}

std::shared_ptr<platform::NavigationController> PreviewItemManager::navigationController() const {
    return navigationController_.lock();
}

void PreviewItemManager::setNavigationController(
    const std::shared_ptr<platform::NavigationController>& navigation) {
    navigationController_ = navigation;
}

void PreviewItemManager::setScreens(std::shared_ptr<PreviewDownloadViewController> download,
                                    std::shared_ptr<PreviewDetailsViewController> details) {
    // Swapped out, so that a screen that ends here ends outside the lock.
    const std::lock_guard lock(lock_);
    downloadViewController_.swap(download);
    detailsViewController_.swap(details);
}

std::shared_ptr<PreviewDownloadViewController> PreviewItemManager::downloadViewController() const {
    const std::lock_guard lock(lock_);
    return downloadViewController_;
}

std::shared_ptr<PreviewDetailsViewController> PreviewItemManager::detailsViewController() const {
    const std::lock_guard lock(lock_);
    return detailsViewController_;
}

} // namespace tavrin
