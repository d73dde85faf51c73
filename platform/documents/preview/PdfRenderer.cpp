#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/LatestWishes.h"
#include "platform/documents/preview/PdfFile.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QPainter>

#include <algorithm>
#include <cmath>
#include <optional>
#include <unordered_map>

namespace platform {
namespace {

constexpr double pageGap = 12;
constexpr double pageMargin = 12;
/// A page is rendered in steps of this factor, so that a pinch does not ask for every size.
constexpr double sizeStep = 1.25;
/// Beyond that a page is drawn enlarged: 12 million pixels take 48 MB.
constexpr double mostPagePixels = 12e6;
/// Of rendered pages, beside those in view.
constexpr double mostCachedPixels = 24e6;
/// Measured before the first of a document is shown, and then at a time between pages that are
/// drawn; 30 milliseconds.
constexpr std::size_t measuredAtOnce = 200;
/// The pages behind these are taken to be like the last: to measure them all would take 60 MB and
/// seconds.
constexpr std::size_t mostMeasured = 20'000;

struct RenderedPage {
    QImage image;
    std::uint64_t lastUse = 0;
};

/// The pages, one below the other. Asks for pictures of those in view and draws what there is.
class PagesContent final : public ZoomContent {
public:
    /// Asks for a page, so many pixels wide; the earlier wishes are void.
    using Wish = std::function<void(std::vector<std::pair<int, int>> pagesAndWidths)>;

    explicit PagesContent(Wish wish) : wish_(std::move(wish)) {}

    /// So many pages, of which the first are of these sizes and the others like the last of them.
    void set(std::vector<QSizeF> sizes, std::size_t pageCount) {
        sizes_ = std::move(sizes);
        sizes_.resize(pageCount, sizes_.back());
        rendered_.clear();
        asked_.clear();
        arrange();
    }

    /// Those pages are of these sizes, and those behind them like the last. Answers whether that
    /// changes anything.
    bool correct(std::size_t from, const std::vector<QSizeF>& sizes) {
        if (std::all_of(sizes.begin(), sizes.end(),
                        [&](const QSizeF& size) { return size == sizes_.back(); }))
            return false;
        std::copy(sizes.begin(), sizes.end(), sizes_.begin() + static_cast<std::ptrdiff_t>(from));
        std::fill(sizes_.begin() + static_cast<std::ptrdiff_t>(from + sizes.size()), sizes_.end(),
                  sizes.back());
        arrange();
        return true;
    }

    void setRendered(int page, QImage image) {
        rendered_[page] = {std::move(image), ++uses_};
        dropOldPages();
    }

    std::size_t pageCount() const { return sizes_.size(); }

    /// The page that one looks at.
    std::size_t pageIn(const QRectF& visible) const {
        return pageAt(visible.top() + visible.height() * 0.4);
    }

    QSizeF contentSize() const override { return {width_, height_}; }

    void paintContent(QPainter& painter, const QRectF& visible, double zoom) override {
        if (sizes_.empty())
            return;
        const double pixels = zoom * painter.device()->devicePixelRatioF();
        std::vector<std::pair<int, int>> wanted;
        for (std::size_t i = pageAt(visible.top()); i < sizes_.size(); ++i) {
            if (tops_[i] > visible.bottom())
                break;
            const int page = static_cast<int>(i);
            const int width = renderWidth(sizes_[i], pixels);
            const auto found = rendered_.find(page);
            if (found == rendered_.end() || found->second.image.width() != width)
                wanted.emplace_back(page, width);
            paintPage(painter, i, found == rendered_.end() ? nullptr : &found->second, zoom);
        }
        if (wanted != asked_) {
            asked_ = wanted;
            wish_(std::move(wanted));
        }
    }

private:
    void arrange() {
        tops_.clear();
        width_ = 1;
        double y = 0;
        for (const QSizeF& size : sizes_) {
            tops_.push_back(y);
            y += size.height() + pageGap;
            width_ = std::max(width_, size.width());
        }
        height_ = std::max(1.0, y - pageGap);
    }

    std::size_t pageAt(double y) const {
        const auto above = std::upper_bound(tops_.begin(), tops_.end(), y);
        return above == tops_.begin() ? 0 : static_cast<std::size_t>(above - tops_.begin()) - 1;
    }

    static int renderWidth(const QSizeF& size, double pixels) {
        const double step = std::ceil(std::log(std::max(0.05, pixels)) / std::log(sizeStep));
        const double most = std::sqrt(mostPagePixels * size.width() / size.height());
        return std::max(1,
                        static_cast<int>(std::min(size.width() * std::pow(sizeStep, step), most)));
    }

    void paintPage(QPainter& painter, std::size_t index, RenderedPage* rendered, double zoom) {
        const QSizeF size = sizes_[index];
        const QRectF page(QPointF((width_ - size.width()) / 2, tops_[index]), size);
        if (rendered) {
            rendered->lastUse = ++uses_;
            // One that was never measured may have another shape than its place.
            const QSizeF shape =
                QSizeF(rendered->image.size()).scaled(page.size(), Qt::KeepAspectRatio);
            QRectF target(QPointF(), shape);
            target.moveCenter(page.center());
            if (std::abs(shape.width() - size.width()) < 1 &&
                std::abs(shape.height() - size.height()) < 1)
                target = page;
            else
                painter.fillRect(page, Qt::white);
            painter.drawImage(target, rendered->image);
        } else {
            painter.fillRect(page, Qt::white);
        }
        painter.setPen(QPen(toQt(Theme::hairline), 1 / zoom));
        painter.setBrush(Qt::NoBrush);
        painter.drawRect(page);
    }

    void dropOldPages() {
        const auto pixelsOf = [](const RenderedPage& page) {
            return static_cast<double>(page.image.width()) * page.image.height();
        };
        double pixels = 0;
        for (const auto& [number, page] : rendered_)
            pixels += pixelsOf(page);
        while (pixels > mostCachedPixels && rendered_.size() > 3) {
            const auto oldest = std::min_element(
                rendered_.begin(), rendered_.end(),
                [](const auto& a, const auto& b) { return a.second.lastUse < b.second.lastUse; });
            pixels -= pixelsOf(oldest->second);
            rendered_.erase(oldest);
        }
    }

    Wish wish_;
    std::vector<QSizeF> sizes_;
    std::vector<double> tops_;
    double width_ = 1;
    double height_ = 1;
    std::unordered_map<int, RenderedPage> rendered_;
    std::uint64_t uses_ = 0;
    std::vector<std::pair<int, int>> asked_;
};

/// A page, and how many pixels wide.
using RenderWishes = LatestWishes<std::pair<int, int>>;

/// The open document; of the worker's queue alone.
struct PdfSlot {
    std::unique_ptr<PdfFile> file;
};

class PdfRenderer final : public PreviewRenderer {
public:
    PdfRenderer(MainQueue& main, PreviewReports reports)
        : reports_(std::move(reports)), worker_(main) {
        auto content =
            std::make_unique<PagesContent>([this](auto pages) { render(std::move(pages)); });
        content_ = content.get();
        auto widget = std::make_unique<ZoomWidget>(
            std::move(content),
            ZoomWidget::Settings{{ZoomPlace::Fit::width, pageMargin, 6}, false, true});
        widget_ = widget.get();
        widget_->setMovedHandler([this] { tellPlace(); });
        view_ = std::make_shared<WidgetView>(std::move(widget));
        worker_.setLastJob([slot = slot_] { slot->file.reset(); });
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        view_->setAccessibleName(displayName(file.lastPathComponent()));
        reload();
    }

    void reload() override {
        worker_.cancel();
        // As far as one has looked, so that the place is found again.
        const std::size_t first =
            measuredAtOnce + (content_->pageCount() ? content_->pageIn(widget_->visibleRect()) : 0);
        worker_.run([this, file = file_, slot = slot_, first](PreviewToken& token) -> Job {
            slot->file = std::make_unique<PdfFile>();
            const auto sizes = std::make_shared<std::vector<QSizeF>>();
            std::size_t count = 0;
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                Failure fault = slot->file->open(file, path);
                if (fault)
                    return fault;
                count = slot->file->pageCount();
                *sizes = slot->file->pageSizes(0, std::min(first, mostMeasured));
                return Failure();
            });
            return [this, sizes, count, failure] { take(std::move(*sizes), count, failure); };
        });
    }

    std::optional<std::function<void(double)>> zoom() override {
        return [this](double factor) { widget_->zoomBy(factor); };
    }

private:
    void take(std::vector<QSizeF> sizes, std::size_t count, const Failure& failure) {
        if (failure) {
            reports_.failed(*failure);
            return;
        }
        const std::size_t measured = sizes.size();
        content_->set(std::move(sizes), count);
        widget_->contentChanged();
        reports_.shown();
        measureFrom(measured);
    }

    void measureFrom(std::size_t page) {
        if (page >= std::min(content_->pageCount(), mostMeasured))
            return;
        worker_.run([this, slot = slot_, page](PreviewToken&) -> Job {
            auto sizes = slot->file->pageSizes(page, measuredAtOnce);
            return [this, page, sizes = std::move(sizes)] {
                if (content_->correct(page, sizes))
                    widget_->contentChanged();
                measureFrom(page + sizes.size());
            };
        });
    }

    void render(std::vector<std::pair<int, int>> pages) {
        const bool idle = pages.empty();
        wishes_->set(std::move(pages));
        if (!idle)
            renderNext();
    }

    void renderNext() {
        worker_.run([this, slot = slot_, wishes = wishes_](PreviewToken&) -> Job {
            const auto next = wishes->take();
            if (!next || !slot->file)
                return {};
            const auto [page, width] = *next;
            QImage image = slot->file->render(page, width);
            return [this, page, image = std::move(image)] {
                if (!image.isNull())
                    content_->setRendered(page, image);
                widget_->update();
                renderNext();
            };
        });
    }

    void tellPlace() {
        if (content_->pageCount() < 2)
            return;
        const std::size_t page = content_->pageIn(widget_->visibleRect()) + 1;
        if (page == std::exchange(toldPage_, page))
            return;
        reports_.moved(localizedFormat("%1$@ of %2$@", page, content_->pageCount()));
    }

    PreviewReports reports_;
    Url file_;
    const std::shared_ptr<PdfSlot> slot_ = std::make_shared<PdfSlot>();
    const std::shared_ptr<RenderWishes> wishes_ = std::make_shared<RenderWishes>();
    PagesContent* content_ = nullptr;
    ZoomWidget* widget_ = nullptr;
    std::shared_ptr<View> view_;
    std::size_t toldPage_ = 0;
    PreviewWorker worker_;
};

} // namespace

const PreviewKind pdfPreview{
    [](std::string_view identifier) { return TypeRegistry::conformsTo(identifier, types::pdf); },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<PdfRenderer>(main, std::move(reports));
    }};

} // namespace platform
