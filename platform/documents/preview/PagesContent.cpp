#include "platform/documents/preview/PagesContent.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QPainter>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// A page is rendered in steps of this factor, so that a pinch does not ask for every size.
constexpr double sizeStep = 1.25;
/// Beyond that a page is drawn enlarged: 12 million pixels take 48 MB.
constexpr double mostPagePixels = 12e6;
/// Of rendered pages, beside those in view.
constexpr double mostCachedPixels = 24e6;

double pixelsOf(const QImage& image) {
    return static_cast<double>(image.width()) * image.height();
}

/// A picture that has as many pixels as its place is copied pixel by pixel: a fraction of the time
/// that any scaling takes, and as sharp as it is.
void drawSharp(QPainter& painter, const QRectF& target, const QImage& image) {
    const double density = painter.device()->devicePixelRatioF();
    const QRectF place = painter.worldTransform().mapRect(target);
    if (std::abs(place.width() * density - image.width()) > 1 ||
        std::abs(place.height() * density - image.height()) > 1) {
        painter.drawImage(target, image);
        return;
    }
    const QPointF corner(std::round(place.x() * density) / density,
                         std::round(place.y() * density) / density);
    QImage pixels = image;
    pixels.setDevicePixelRatio(density);
    painter.save();
    painter.resetTransform();
    painter.drawImage(corner, pixels);
    painter.restore();
}

} // namespace

void PagesContent::set(std::vector<QSizeF> sizes, std::size_t pageCount) {
    sizes_ = std::move(sizes);
    sizes_.resize(pageCount, sizes_.back());
    rendered_.clear();
    asked_.clear();
    arrange();
}

bool PagesContent::correct(std::size_t from, const std::vector<QSizeF>& sizes) {
    if (std::all_of(sizes.begin(), sizes.end(),
                    [&](const QSizeF& size) { return size == sizes_.back(); }))
        return false;
    const auto first = sizes_.begin() + static_cast<std::ptrdiff_t>(from);
    std::fill(std::copy(sizes.begin(), sizes.end(), first), sizes_.end(), sizes.back());
    arrange();
    return true;
}

void PagesContent::arrange() {
    tops_.clear();
    width_ = 1;
    double y = 0;
    for (const QSizeF& size : sizes_) {
        tops_.push_back(y);
        y += size.height() + gap_;
        width_ = std::max(width_, size.width());
    }
    height_ = std::max(1.0, y - gap_);
}

void PagesContent::setRendered(int page, QImage image) {
    rendered_[page] = {std::move(image), ++uses_};
    dropOldPages();
}

void PagesContent::setTop(int page, QImage image) {
    setRendered(page, std::move(image));
    RenderedPage& top = rendered_[page];
    const QSizeF& size = sizes_[static_cast<std::size_t>(page)];
    top.topAlone = top.image.height() + 1 < top.image.width() * size.height() / size.width();
}

std::size_t PagesContent::pageIn(const QRectF& visible) const {
    return pageAt(visible.top() + visible.height() * 0.4);
}

std::size_t PagesContent::pageAt(double y) const {
    const auto above = std::upper_bound(tops_.begin(), tops_.end(), y);
    return above == tops_.begin() ? 0 : static_cast<std::size_t>(above - tops_.begin()) - 1;
}

void PagesContent::paintContent(QPainter& painter, const QRectF& visible, double zoom) {
    if (sizes_.empty())
        return;
    const double density = painter.device()->devicePixelRatioF();
    std::vector<std::pair<int, int>> wanted;
    for (std::size_t i = pageAt(visible.top()); i < sizes_.size(); ++i) {
        if (tops_[i] > visible.bottom())
            break;
        const int page = static_cast<int>(i);
        const int width = renderWidth(sizes_[i], zoom, density);
        const auto found = rendered_.find(page);
        if (found == rendered_.end() || found->second.image.width() != width ||
            found->second.topAlone)
            wanted.emplace_back(page, width);
        paintPage(painter, i, found == rendered_.end() ? nullptr : &found->second, zoom);
    }
    if (wanted != asked_) {
        asked_ = wanted;
        wish_(std::move(wanted));
    }
}

int PagesContent::renderWidth(const QSizeF& size, double zoom, double density) const {
    const double pixels = zoom * density;
    // Letters stay sharp where a page is drawn as it was rendered, or a point is whole pixels.
    const bool resting = std::abs(zoom - restingZoom_) < 1e-9;
    const bool even = std::abs(pixels - std::round(pixels)) < 1e-3 && pixels > 0.5;
    const double step = std::ceil(std::log(std::max(0.05, pixels)) / std::log(sizeStep));
    const double scale = resting ? pixels : even ? std::round(pixels) : std::pow(sizeStep, step);
    const double most = std::sqrt(mostPagePixels * size.width() / size.height());
    return std::max(1, static_cast<int>(std::lround(std::min(size.width() * scale, most))));
}

/// Where the picture of a page belongs that has its place there.
QRectF PagesContent::placeOf(const RenderedPage& rendered, const QRectF& page) {
    const QSizeF pixels = rendered.image.size();
    if (rendered.topAlone)
        return {page.topLeft(), pixels * (page.width() / pixels.width())};
    // One that was never measured may have another shape than its place.
    const QSizeF shape = pixels.scaled(page.size(), Qt::KeepAspectRatio);
    if (std::abs(shape.width() - page.width()) < 1 && std::abs(shape.height() - page.height()) < 1)
        return page;
    QRectF place(QPointF(), shape);
    place.moveCenter(page.center());
    return place;
}

void PagesContent::paintPage(QPainter& painter, std::size_t index, RenderedPage* rendered,
                             double zoom) {
    const QSizeF size = sizes_[index];
    const QRectF page(QPointF((width_ - size.width()) / 2, tops_[index]), size);
    const QRectF covered = rendered ? placeOf(*rendered, page) : QRectF();
    if (covered != page)
        painter.fillRect(page, Qt::white);
    if (rendered) {
        rendered->lastUse = ++uses_;
        drawSharp(painter, covered, rendered->image);
    }
    if (gap_ <= 0)
        return;
    painter.setPen(QPen(toQt(Theme::hairline), 1 / zoom));
    painter.setBrush(Qt::NoBrush);
    painter.drawRect(page);
}

void PagesContent::dropOldPages() {
    double pixels = 0;
    for (const auto& [number, page] : rendered_)
        pixels += pixelsOf(page.image);
    while (pixels > mostCachedPixels && rendered_.size() > 3) {
        const auto oldest =
            std::min_element(rendered_.begin(), rendered_.end(), [](const auto& a, const auto& b) {
                return a.second.lastUse < b.second.lastUse;
            });
        pixels -= pixelsOf(oldest->second.image);
        rendered_.erase(oldest);
    }
}

} // namespace platform
