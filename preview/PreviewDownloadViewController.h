#pragma once

#include "platform/ui/StackView.h"
#include "preview/DownloadView.h"
#include "preview/PreviewBaseViewController.h"
#include "preview/ThumbnailImageView.h"

#include <atomic>
#include <memory>

namespace tavrin {

/// The screen of a document whose contents are not on the device: its thumbnail and the download
/// widget.
class PreviewDownloadViewController : public PreviewBaseViewController,
                                      public DownloadViewDelegate {
public:
    void viewDidLoad() override;
    void viewWillAppear(bool animated) override;
    void viewWillTransitionToSize(platform::Size size,
                                  platform::TransitionCoordinator& coordinator) override;
    void refreshItem() override;
    void updateProgress(const std::shared_ptr<platform::Progress>& progress) override;
    void downloadViewDidPressStartDownload(DownloadView& view,
                                           const std::optional<platform::Url>& url) override;
    void downloadViewDidPressCancelDownload(DownloadView& view,
                                            const std::optional<platform::Url>& url) override;

    void setupViewsAndConstraints();
    void adjustViewsForOrientation(platform::Orientation orientation);
    bool downloading() const { return downloading_; }
    /// Kept until the view is there, and applied again at each appearance.
    void setDownloading(bool downloading);

    const std::shared_ptr<platform::StackView>& mainStackView() const { return mainStackView_; }
    const std::shared_ptr<DownloadView>& downloadView() const { return downloadView_; }
    const std::shared_ptr<ThumbnailImageView>& thumbnailView() const { return thumbnailView_; }

private:
    void takeReport(const std::shared_ptr<platform::Progress>& progress);
    void showWaitingReport();

    bool downloading_ = false;
    std::shared_ptr<platform::StackView> mainStackView_;
    std::shared_ptr<DownloadView> downloadView_;
    std::shared_ptr<ThumbnailImageView> thumbnailView_;
    /// Waits for the next step of the pie, so that both are painted at once.
    std::shared_ptr<platform::Progress> waitingReport_;
    /// Whether a report already waits on the main queue: reports come faster than frames.
    std::shared_ptr<std::atomic<bool>> reportWaiting_ = std::make_shared<std::atomic<bool>>(false);
};

} // namespace tavrin
