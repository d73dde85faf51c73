#pragma once

#include "items/VXItem.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/WorkQueue.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FilePresenter.h"
#include "platform/launch/DocumentInteractionController.h"
#include "platform/ui/NavigationController.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>

namespace tavrin {

/// What a preview shows of its item. Numbers of other origin (a restored state) are taken as well:
/// every one but 0 shows the details.
enum PreviewMode : int { fullPreviewMode = 0, detailsMode = 1 };

class PreviewDetailsViewController;
class PreviewDownloadViewController;

/// The coordinator of one preview: chooses the screen that shows an item, downloads it when it is
/// not on the device, follows its file and serves the screens' buttons. Told over several files.
/// Main thread, except where told; its owner drops it when a list comes back.
class PreviewItemManager : public platform::FilePresenter,
                           public platform::DocumentTargetSelectionControllerDelegate,
                           public std::enable_shared_from_this<PreviewItemManager> {
public:
    using ItemPointer = std::shared_ptr<VXItem>;
    using Screen = std::shared_ptr<platform::ViewController>;
    /// The URL that was asked for, the URL to read (none on failure), the error (none on success).
    using DownloadCompletion = std::function<void(const std::optional<platform::Url>& oldUrl,
                                                  const std::optional<platform::Url>& newUrl,
                                                  const platform::Failure& error)>;

    static std::shared_ptr<PreviewItemManager> create();
    ~PreviewItemManager() override;
    PreviewItemManager(const PreviewItemManager&) = delete;
    PreviewItemManager& operator=(const PreviewItemManager&) = delete;

    // Screens (PreviewItemManager.cpp)
    void previewItem(const ItemPointer& item) { setItem(item, true); }
    void setItem(const ItemPointer& item) { setItem(item, true); }
    void setItem(const ItemPointer& item, bool updatePreview);
    /// Makes the item current and builds its screen without showing it; none when there is nothing
    /// to show.
    Screen prepareToPreviewItem(const ItemPointer& item);
    /// Starts the automatic download once the download screen is on top.
    void finishPreviewingItem();
    bool shouldAutoDownload() const;
    Screen createDownloadViewController();
    Screen createDetailsViewController();
    Screen createGlimpseController();
    void replaceLastViewController(const Screen& screen);
    static bool isPreviewControllerDisplayed(const platform::ViewController* screen);
    void viewControllerWillDisappear(const platform::ViewController& screen);

    // Moving and deleting from a preview (PreviewItemManagerActions.cpp)
    void showMoveTarget(platform::ViewController& asking);
    void documentTargetSelectionControllerDidSelectItemAtURL(
        platform::DocumentTargetSelectionController& chooser, const platform::Url& folder) override;
    void showWarningAndDeleteDocument(const Screen& asking,
                                      const platform::BarButtonItem::Pointer& barButton);

    // Downloading (PreviewItemManagerDownload.cpp)
    void startDownload();
    void startDownloading(DownloadCompletion completion);
    /// Ends the download that runs and those that wait for it. From any thread.
    void cancelDownload();
    void showDownloadError(const platform::Failure& error);

    // Following the file (PreviewItemManagerPresenter.cpp)
    void registerAsFilePresenter();
    /// Main thread or fcQueue().
    void unregisterAsFilePresenter();
    void refreshItem(const platform::Url& url);
    std::optional<platform::Url> presentedItemURL() const override;
    std::shared_ptr<platform::Executor> presentedItemOperationQueue() const override;
    void presentedItemDidChange() override;
    void presentedItemDidMoveToURL(const platform::Url& newUrl) override;
    void accommodatePresentedItemDeletionWithCompletionHandler(DeletionHandler handler) override;
    void accommodatePresentedSubitemDeletionAtURL(const platform::Url& part,
                                                  DeletionHandler handler) override;

    /// Safe from any thread.
    ItemPointer item() const;
    /// A PreviewMode.
    int mode() const { return mode_; }
    void setMode(int mode) { mode_ = mode; }
    std::shared_ptr<platform::NavigationController> navigationController() const;
    void setNavigationController(const std::shared_ptr<platform::NavigationController>& navigation);
    const std::shared_ptr<platform::DocumentInteractionController>&
    documentInteractionController() const {
        return documentInteractionController_;
    }
    void setDocumentInteractionController(
        std::shared_ptr<platform::DocumentInteractionController> controller) {
        documentInteractionController_ = std::move(controller);
    }
    bool filePresenterRegistered() const;
    bool refreshPending() const;
    const std::shared_ptr<platform::OperationQueue>& fcQueue() const { return fcQueue_; }
    const std::shared_ptr<platform::WorkQueue>& downloadQueue() const { return downloadQueue_; }
    std::shared_ptr<platform::FileCoordinator> downloadFC() const;
    std::optional<platform::Date> modifiedDate() const { return modifiedDate_; }
    std::shared_ptr<PreviewDownloadViewController> downloadViewController() const;
    std::shared_ptr<PreviewDetailsViewController> detailsViewController() const;
    bool autoDownload() const { return autoDownload_; }

private:
    PreviewItemManager();
    void didBecomeActiveNotification();
    void willResignActiveNotification();
    /// The person has gone back from the screen that this manager put on the stack.
    bool wasLeft() const { return left_; }
    void replaceItem(const ItemPointer& item);
    void setScreens(std::shared_ptr<PreviewDownloadViewController> download,
                    std::shared_ptr<PreviewDetailsViewController> details);
    std::optional<platform::Url> itemUrl() const;
    std::optional<platform::Url> itemResolvedUrl() const;
    bool takeRefreshTurn();
    void finishRefreshTurn();
    bool fullPreviewLagsBehind() const;
    /// Leaves the preview of a file that is gone.
    void popScreen();
    /// The screen is a preview screen of this manager's item.
    bool worksFor(const Screen& screen) const;

    struct Download;
    std::shared_ptr<platform::FileCoordinator>
    replaceDownloadCoordinator(std::uint64_t cancellations);
    void cancelCoordinator();
    bool showsContentsOf(const std::optional<platform::Url>& url) const;
    void finishDownload(const Download& download, const std::optional<platform::Url>& newUrl,
                        const platform::Failure& error);

    mutable std::mutex lock_; // guards the members down to the blank line
    ItemPointer item_;
    std::shared_ptr<platform::FileCoordinator> downloadFC_;
    std::shared_ptr<PreviewDownloadViewController> downloadViewController_;
    std::shared_ptr<PreviewDetailsViewController> detailsViewController_;
    /// How often cancelDownload was called: a download that was asked for before does not begin.
    std::uint64_t cancellations_ = 0;
    bool refreshPending_ = false;

    // Of its own: registration asks for the presented URL, which takes the lock above.
    mutable std::mutex registrationLock_;
    bool filePresenterRegistered_ = false; // guarded by registrationLock_

    int mode_ = fullPreviewMode;
    bool autoDownload_ = false;
    bool left_ = false;
    std::optional<platform::Date> modifiedDate_;
    std::weak_ptr<platform::NavigationController> navigationController_; // it owns this manager
    std::shared_ptr<platform::DocumentInteractionController> documentInteractionController_;
    std::shared_ptr<platform::OperationQueue> fcQueue_;
    std::shared_ptr<platform::WorkQueue> downloadQueue_;
    platform::Observation becameActive_;
    platform::Observation willResign_;
    platform::Observation willTerminate_;
};

} // namespace tavrin
