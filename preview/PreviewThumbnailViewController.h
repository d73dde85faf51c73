#pragma once

#include "preview/PreviewBaseViewController.h"
#include "preview/ThumbnailImageView.h"

#include <memory>

namespace tavrin {

/// A screen that shows only the item's thumbnail, with an optional progress pie.
class PreviewThumbnailViewController : public PreviewBaseViewController {
public:
    void viewDidLoad() override;
    void refreshItem() override;
    void updateProgress(const std::shared_ptr<platform::Progress>& /*progress*/) override {}
    void setupViewsAndConstraints();
    void showProgress(bool shown);
    const std::shared_ptr<ThumbnailImageView>& thumbnailView() const { return thumbnailView_; }

private:
    std::shared_ptr<ThumbnailImageView> thumbnailView_;
};

} // namespace tavrin
