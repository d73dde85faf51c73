#include "preview/PreviewThumbnailViewController.h"

#include "preview/PreviewItemManager.h"

namespace tavrin {

using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;

void PreviewThumbnailViewController::viewDidLoad() {
    PreviewBaseViewController::viewDidLoad();
    setupViewsAndConstraints();
}

void PreviewThumbnailViewController::setupViewsAndConstraints() {
    thumbnailView_ = std::make_shared<ThumbnailImageView>();
    thumbnailView_->setLaidOutByConstraints(true);
    wrapperView()->addSubview(thumbnailView_);
    const auto pinned = [this](LayoutAttribute attribute) {
        return LayoutConstraint::equal(*thumbnailView_, attribute, *wrapperView(), attribute);
    };
    LayoutConstraint::activate({pinned(LayoutAttribute::centerX),
                                LayoutConstraint::make(*thumbnailView_, LayoutAttribute::width,
                                                       LayoutRelation::lessOrEqual,
                                                       wrapperView().get(), LayoutAttribute::width),
                                pinned(LayoutAttribute::top), pinned(LayoutAttribute::bottom)});
}

void PreviewThumbnailViewController::refreshItem() {
    PreviewBaseViewController::refreshItem();
    if (!isViewLoaded())
        return;
    const auto manager = itemManager();
    thumbnailView_->setItem(manager ? manager->item() : nullptr);
}

void PreviewThumbnailViewController::showProgress(bool shown) {
    if (isViewLoaded())
        thumbnailView_->showProgress(shown);
}

} // namespace tavrin
