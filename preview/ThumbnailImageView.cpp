#include "preview/ThumbnailImageView.h"

#include "platform/launch/DocumentProxy.h"
#include "platform/ui/Canvas.h"
#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>

namespace tavrin {
namespace {

using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;

constexpr double pieSide = 22;
constexpr double frameAlpha = 0.16;

} // namespace

ThumbnailImageView::ThumbnailImageView(platform::Rect frame)
    : View(frame),
      thumbnailView_(std::make_shared<platform::ImageView>()),
      progressView_(std::make_shared<PieProgressIndicatorView>()),
      frameView_(std::make_shared<View>()),
      frameLayer_(std::make_shared<platform::ShapeLayer>()) {
    setLaidOutByConstraints(true);
    thumbnailView_->setContentMode(platform::ContentMode::aspectFit);
    thumbnailView_->setLaidOutByConstraints(true);
    addSubview(thumbnailView_);
    frameLayer_->setStrokeColor(platform::Theme::text.withAlpha(frameAlpha));
    frameView_->addLayer(frameLayer_);
    frameView_->setUserInteractionEnabled(false);
    frameView_->setHidden(true);
    addSubview(frameView_);
    progressView_->setLaidOutByConstraints(true);
    progressView_->setHidden(true);
    addSubview(progressView_);

    View& image = *thumbnailView_;
    View& pie = *progressView_;
    const auto notLarger = [&](LayoutAttribute side) {
        return LayoutConstraint::make(image, side, LayoutRelation::lessOrEqual, this, side);
    };
    const auto pieSize = [&](LayoutAttribute side) {
        return LayoutConstraint::constant(pie, side, LayoutRelation::equal, pieSide);
    };
    LayoutConstraint::activate(
        {LayoutConstraint::equal(image, LayoutAttribute::centerX, *this, LayoutAttribute::centerX),
         notLarger(LayoutAttribute::width),
         LayoutConstraint::equal(image, LayoutAttribute::centerY, *this, LayoutAttribute::centerY),
         notLarger(LayoutAttribute::height),
         LayoutConstraint::equal(pie, LayoutAttribute::trailing, image, LayoutAttribute::trailing),
         pieSize(LayoutAttribute::width),
         LayoutConstraint::equal(pie, LayoutAttribute::bottom, image, LayoutAttribute::bottom),
         pieSize(LayoutAttribute::height)});
}

void ThumbnailImageView::setItem(const std::shared_ptr<VXItem>& item) {
    item_ = item;
    coming_.reset();
    const platform::Image thumbnail = item ? item->thumbnail() : platform::Image();
    if (!thumbnail.empty()) {
        showThumbnail(thumbnail);
        return;
    }
    showGenericImage();
    waitForThumbnail();
}

void ThumbnailImageView::waitForThumbnail() {
    // A promise has what was made before, and nothing is downloaded for a picture.
    if (!item_ || !item_->resolvedURL() || !item_->typeIdentifier() || item_->isDirectory() ||
        item_->isPackage() || item_->isPromise() || !item_->contentModificationDate())
        return;
    coming_ = std::make_unique<platform::DocumentThumbnail>(
        *item_->resolvedURL(), *item_->contentModificationDate(), *item_->typeIdentifier(),
        [this](const platform::Image& image) {
            item_->setThumbnail(image);
            showThumbnail(image);
        });
}

void ThumbnailImageView::showThumbnail(const platform::Image& image) {
    thumbnailView_->setImage(image);
    frameView_->setHidden(false);
    setNeedsLayout();
}

void ThumbnailImageView::layoutSubviews() {
    View::layoutSubviews();
    const platform::Size size = thumbnailView_->image().size();
    const platform::Rect room = thumbnailView_->frame();
    if (frameView_->isHidden() || size.width <= 0 || size.height <= 0)
        return;
    const double factor = std::min(room.width / size.width, room.height / size.height);
    const double width = size.width * factor;
    const double height = size.height * factor;
    frameView_->setFrame({room.x + std::round((room.width - width) / 2),
                          room.y + std::round((room.height - height) / 2), width, height});
    platform::Path line;
    line.addRoundedRect(frameView_->bounds().inset(0.5, 0.5), 0);
    frameLayer_->setPath(line);
}

void ThumbnailImageView::showGenericImage() {
    frameView_->setHidden(true);
    if (!item_ || !item_->resolvedURL()) {
        thumbnailView_->setImage({});
        return;
    }
    const platform::DocumentProxy proxy(std::string(item_->resolvedURL()->lastPathComponent()),
                                        item_->typeIdentifier().value_or(""));
    thumbnailView_->setImage(proxy.icon(platform::IconFormat::largeDocument));
}

void ThumbnailImageView::showProgress(bool shown) {
    progressView_->setHidden(!shown);
    if (shown)
        progressView_->setProgress(0);
}

void ThumbnailImageView::updateProgress(double fraction) {
    if (!progressView_->isHidden())
        progressView_->setProgress(static_cast<float>(fraction));
}

} // namespace tavrin
