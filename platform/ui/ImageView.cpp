#include "platform/ui/Controls.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QPainter>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

struct ImageViewImpl : View::Impl {
    void paintContent(QPainter& painter, const QRectF& bounds) override {
        paintImage(painter, image, target(bounds));
    }
    QAccessible::Role accessibleRole() const override { return QAccessible::Graphic; }

    QRectF target(const QRectF& bounds) const {
        const Size size = image.size();
        if (image.empty() || mode == ContentMode::scaleToFill || bounds.isEmpty())
            return bounds;
        double factor = 1;
        if (mode == ContentMode::aspectFit)
            factor = std::min(bounds.width() / size.width, bounds.height() / size.height);
        const double width = size.width * factor;
        const double height = size.height * factor;
        return {std::round(bounds.center().x() - width / 2),
                std::round(bounds.center().y() - height / 2), width, height};
    }

    Image image;
    ContentMode mode = ContentMode::scaleToFill;
};

ImageViewImpl& implOf(const ImageView& view) {
    return static_cast<ImageViewImpl&>(view.impl());
}

} // namespace

ImageView::ImageView(Rect frame) : View(std::make_unique<ImageViewImpl>()) {
    setFrame(frame);
}

const Image& ImageView::image() const {
    return implOf(*this).image;
}

void ImageView::setImage(const Image& image) {
    ImageViewImpl& impl = implOf(*this);
    if (impl.image == image)
        return;
    const Size before = impl.image.size();
    impl.image = image;
    if (!(before == image.size()))
        invalidateIntrinsicContentSize();
    setNeedsDisplay();
}

void ImageView::setContentMode(ContentMode mode) {
    implOf(*this).mode = mode;
    setNeedsDisplay();
}

Size ImageView::intrinsicContentSize() const {
    const Image& image = implOf(*this).image;
    return image.empty() ? View::intrinsicContentSize() : image.size();
}

} // namespace platform
