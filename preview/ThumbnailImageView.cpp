#include "preview/ThumbnailImageView.h"

#include "platform/launch/DocumentProxy.h"

namespace tavrin {
namespace {

using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;

constexpr double pieSide = 22;

} // namespace

ThumbnailImageView::ThumbnailImageView(platform::Rect frame)
    : View(frame),
      thumbnailView_(std::make_shared<platform::ImageView>()),
      progressView_(std::make_shared<PieProgressIndicatorView>()) {
    setLaidOutByConstraints(true);
    thumbnailView_->setContentMode(platform::ContentMode::aspectFit);
    thumbnailView_->setLaidOutByConstraints(true);
    addSubview(thumbnailView_);
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
        thumbnailView_->setImage(thumbnail);
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
            thumbnailView_->setImage(image);
        });
}

void ThumbnailImageView::showGenericImage() {
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
