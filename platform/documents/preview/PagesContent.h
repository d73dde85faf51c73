#pragma once

#include "platform/documents/preview/ZoomWidget.h"

#include <QImage>
#include <QSizeF>

#include <functional>
#include <unordered_map>
#include <utility>
#include <vector>

namespace platform {

/// Pages, one below the other. Asks for pictures of those in view and draws what there is.
class PagesContent final : public ZoomContent {
public:
    /// Asks for pages, each so many pixels wide; the earlier wishes are void.
    using Wish = std::function<void(std::vector<std::pair<int, int>> pagesAndWidths)>;

    /// Pages with a gap between them have an edge that is drawn; without one they are pieces of
    /// one page.
    PagesContent(Wish wish, double gap) : wish_(std::move(wish)), gap_(gap) {}

    /// So many pages, of which the first are of these sizes and the others like the last of them.
    void set(std::vector<QSizeF> sizes, std::size_t pageCount);
    /// Those pages are of these sizes, and those behind them like the last. Answers whether that
    /// changes anything.
    bool correct(std::size_t from, const std::vector<QSizeF>& sizes);
    void setRendered(int page, QImage image);
    /// Its top alone, until the whole page is there.
    void setTop(int page, QImage image);
    /// At this zoom, where one stays, pages are asked for as wide as they are shown; at others in
    /// steps. 0 for none.
    void setRestingZoom(double zoom) { restingZoom_ = zoom; }
    /// How wide a page that is `size` points large is asked for at that zoom, with so many pixels a
    /// point of the view.
    int renderWidth(const QSizeF& size, double zoom, double density) const;

    std::size_t pageCount() const { return sizes_.size(); }
    /// The page that one looks at.
    std::size_t pageIn(const QRectF& visible) const;

    QSizeF contentSize() const override { return {width_, height_}; }
    void paintContent(QPainter& painter, const QRectF& visible, double zoom) override;

private:
    struct RenderedPage {
        QImage image;
        std::uint64_t lastUse = 0;
        bool topAlone = false;
    };

    void arrange();
    std::size_t pageAt(double y) const;
    static QRectF placeOf(const RenderedPage& rendered, const QRectF& page);
    void paintPage(QPainter& painter, std::size_t index, RenderedPage* rendered, double zoom);
    void dropOldPages();

    Wish wish_;
    const double gap_;
    double restingZoom_ = 0;
    std::vector<QSizeF> sizes_;
    std::vector<double> tops_;
    double width_ = 1;
    double height_ = 1;
    std::unordered_map<int, RenderedPage> rendered_;
    std::uint64_t uses_ = 0;
    std::vector<std::pair<int, int>> asked_;
};

} // namespace platform
