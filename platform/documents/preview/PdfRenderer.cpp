#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/LatestWishes.h"
#include "platform/documents/preview/PagesContent.h"
#include "platform/documents/preview/PdfFile.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <algorithm>
#include <cmath>
#include <optional>

namespace platform {
namespace {

constexpr double pageGap = 12;
constexpr double pageMargin = 12;
/// Measured before the first of a document is shown; a millisecond.
constexpr std::size_t measuredFirst = 8;
/// Measured at a time later, when no page waits to be drawn; 5 milliseconds.
constexpr std::size_t measuredAtOnce = 50;
/// The pages behind these are taken to be like the last: to measure them all would take 60 MB and
/// seconds.
constexpr std::size_t mostMeasured = 20'000;

/// A page, and how many pixels wide.
using RenderWishes = LatestWishes<std::pair<int, int>>;

constexpr ZoomPlace::Limits pdfLimits{ZoomPlace::Fit::width, pageMargin, 6};

/// What has been read of a document, to be shown.
struct PdfStart {
    std::vector<QSizeF> sizes;
    std::size_t count = 0;
    /// Of the first page, as it will be wanted; null where that is not known.
    QImage top;
};

/// The open document; of the worker's queue alone.
struct PdfSlot {
    std::unique_ptr<PdfFile> file;
};

class PdfRenderer final : public PreviewRenderer {
public:
    PdfRenderer(MainQueue& main, PreviewReports reports)
        : reports_(std::move(reports)), worker_(main) {
        auto content = std::make_unique<PagesContent>(
            [this](auto pages) { render(std::move(pages)); }, pageGap);
        content_ = content.get();
        auto widget = std::make_unique<ZoomWidget>(std::move(content),
                                                   ZoomWidget::Settings{pdfLimits, false, true});
        widget_ = widget.get();
        widget_->setMovedHandler([this] { moved(); });
        view_ = std::make_shared<WidgetView>(std::move(widget));
        worker_.setLastJob([slot = slot_] { slot->file.reset(); });
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        view_->setAccessibleName(displayName(file.lastPathComponent()));
        read(measuredFirst, widget_->size());
    }

    void reload() override {
        worker_.cancel();
        // As far as one has looked, so that the place is found again.
        read(measuredAtOnce +
                 (content_->pageCount() ? content_->pageIn(widget_->visibleRect()) : 0),
             {});
    }

    std::optional<std::function<void(double)>> zoom() override {
        return [this](double factor) { widget_->zoomBy(factor); };
    }

private:
    /// Measures so many pages, and draws what a view of that size, unless it is empty, shows of the
    /// first one: whoever opens a document waits for no more than that, and for no way to the main
    /// thread and back.
    void read(std::size_t measured, QSize view) {
        worker_.run([this, file = file_, slot = slot_, measured, view,
                     density = widget_->devicePixelRatioF()](PreviewToken& token) -> Job {
            slot->file = std::make_unique<PdfFile>();
            const auto start = std::make_shared<PdfStart>();
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                Failure fault = slot->file->open(file, path);
                if (fault)
                    return fault;
                start->count = slot->file->pageCount();
                start->sizes = slot->file->pageSizes(0, std::min(measured, mostMeasured));
                if (!view.isEmpty())
                    start->top = topOfFirst(*slot->file, *start, view, density);
                return Failure();
            });
            return [this, start, failure] { take(std::move(*start), failure); };
        });
    }

    static QImage topOfFirst(const PdfFile& file, const PdfStart& start, QSize view,
                             double density) {
        PagesContent pages([](const auto&) {}, pageGap);
        pages.set(start.sizes, start.count);
        ZoomPlace place(pdfLimits);
        place.setSizes(view, pages.contentSize());
        pages.setRestingZoom(place.zoom());
        return file.renderTop(0, pages.renderWidth(start.sizes.front(), place.zoom(), density),
                              static_cast<int>(std::lround(view.height() * density)));
    }

    void take(PdfStart start, const Failure& failure) {
        if (failure) {
            reports_.failed(*failure);
            return;
        }
        const std::size_t measured = start.sizes.size();
        content_->set(std::move(start.sizes), start.count);
        if (!start.top.isNull())
            content_->setTop(0, std::move(start.top));
        widget_->contentChanged();
        reports_.shown();
        measureFrom(measured);
    }

    void measureFrom(std::size_t page) {
        if (page >= std::min(content_->pageCount(), mostMeasured))
            return;
        worker_.run([this, slot = slot_, wishes = wishes_, page](PreviewToken&) -> Job {
            // What one looks at goes first; it is already on its way to this queue.
            if (!wishes->isEmpty())
                return [this, page] { measureFrom(page); };
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

    void moved() {
        content_->setRestingZoom(widget_->fittingZoom());
        tellPlace();
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
