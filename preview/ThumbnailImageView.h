#pragma once

#include "items/VXItem.h"
#include "platform/documents/DocumentThumbnail.h"
#include "platform/ui/Controls.h"
#include "platform/ui/ShapeLayer.h"
#include "preview/PieProgressIndicatorView.h"

#include <memory>

namespace tavrin {

/// How firmly a picture keeps its own size: less than anything else on its screen.
inline constexpr platform::LayoutPriority takesSpareRoom = 249;

/// An item's thumbnail, or its type's icon, with a small progress pie in its corner. A thumbnail
/// that is still to be made takes the icon's place when it is there. Main thread.
class ThumbnailImageView : public platform::View {
public:
    explicit ThumbnailImageView(platform::Rect frame = {});

    const std::shared_ptr<VXItem>& item() const { return item_; }
    void setItem(const std::shared_ptr<VXItem>& item);
    void showGenericImage();
    /// Shows the pie, empty, or hides it.
    void showProgress(bool shown);
    void updateProgress(double fraction);

    const std::shared_ptr<platform::ImageView>& thumbnailView() const { return thumbnailView_; }
    const std::shared_ptr<PieProgressIndicatorView>& progressView() const { return progressView_; }

protected:
    void layoutSubviews() override;

private:
    void showThumbnail(const platform::Image& image);
    void waitForThumbnail();

    std::shared_ptr<VXItem> item_;
    /// None while nothing is being made.
    std::unique_ptr<platform::DocumentThumbnail> coming_;
    std::shared_ptr<platform::ImageView> thumbnailView_;
    std::shared_ptr<PieProgressIndicatorView> progressView_;
    /// The line around a thumbnail, without which white paper would have no end.
    std::shared_ptr<platform::View> frameView_;
    std::shared_ptr<platform::ShapeLayer> frameLayer_;
};

} // namespace tavrin
