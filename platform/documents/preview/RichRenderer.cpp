#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/AddressOpener.h"
#include "platform/documents/preview/LatestWishes.h"
#include "platform/documents/preview/PagesContent.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/RichDocument.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <algorithm>
#include <cmath>
#include <optional>

namespace platform {
namespace {

constexpr double smallestScale = 0.6;
constexpr double largestScale = 4;

/// A page is drawn in pieces that high, in points.
constexpr double pieceHeight = 480;

/// The open document; of the worker's queue alone.
struct RichSlot {
    std::unique_ptr<RichDocument> document;
};

/// One view over the whole of it.
class Frame final : public View {
public:
    void show(const std::shared_ptr<View>& content) {
        if (shown_)
            shown_->removeFromSuperview();
        shown_ = content;
        addSubview(content);
        setNeedsLayout();
    }
    const std::shared_ptr<View>& shown() const { return shown_; }

protected:
    void layoutSubviews() override {
        if (shown_)
            shown_->setFrame(bounds());
    }

private:
    std::shared_ptr<View> shown_;
};

/// A text with structure: laid out for the width of the view and the size of letters that one
/// wants, again when these change, and drawn in pieces as they come into view. One that is too
/// long for that is shown as its source.
class RichRenderer final : public PreviewRenderer {
public:
    RichRenderer(MainQueue& main, PreviewReports reports, RichFormat format)
        : main_(main), reports_(std::move(reports)), format_(format), worker_(main) {
        auto content =
            std::make_unique<PagesContent>([this](auto pieces) { draw(std::move(pieces)); }, 0);
        content_ = content.get();
        auto widget = std::make_unique<ZoomWidget>(
            std::move(content),
            ZoomWidget::Settings{{ZoomPlace::Fit::width, 0, 4}, false, true, Theme::page});
        widget_ = widget.get();
        widget_->setMovedHandler([this] { layOutAgain(); });
        widget_->setZoomHandler([this](double factor) { zoomBy(factor); });
        widget_->setTapHandler([this](QPointF place) {
            follow(place);
            return true;
        });
        rich_ = std::make_shared<WidgetView>(std::move(widget));
        frame_->show(rich_);
        worker_.setLastJob([slot = slot_] { slot->document.reset(); });
    }

    std::shared_ptr<View> view() override { return frame_; }

    void load(const Url& file) override {
        file_ = file;
        rich_->setAccessibleName(displayName(file.lastPathComponent()));
        rich_->setFrame(frame_->bounds()); // what is read first is laid out for it
        read();
    }

    void reload() override {
        if (plain_)
            plain_->reload();
        else
            read();
    }

    std::optional<std::function<void(double)>> zoom() override {
        if (plain_)
            return plain_->zoom();
        return [this](double factor) { zoomBy(factor); };
    }

private:
    using Shape = RichDocument::Shape;

    Shape wantedShape() const { return {static_cast<double>(widget_->width()), scale_}; }
    double top() const { return widget_->visibleRect().top(); }

    void read() {
        worker_.cancel();
        busy_ = true;
        worker_.run([this, file = file_, slot = slot_, format = format_, shape = wantedShape(),
                     top = top()](PreviewToken& token) -> Job {
            if (!slot->document)
                slot->document = std::make_unique<RichDocument>();
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                const Result<bool> read = slot->document->read(file, path, format, token);
                return read ? Failure() : Failure(read.error());
            });
            if (failure)
                return [this, failure] { reports_.failed(*failure); };
            if (token.isCancelled())
                return {};
            if (!slot->document->isRead())
                return [this] { showSource(); };
            const double now = slot->document->layOut(shape, top);
            return [this, shape, top, now, page = slot->document->pageSize(),
                    text = slot->document->plainText()] {
                widget_->setReadableText(text);
                show(shape, page, top, now);
                reports_.shown();
            };
        });
    }

    /// Where the view or the letters have another size than the document was laid out for.
    void layOutAgain() {
        if (busy_ || content_->pageCount() == 0 || wantedShape() == shape_)
            return;
        busy_ = true;
        worker_.run([this, slot = slot_, shape = wantedShape(), top = top()](PreviewToken&) -> Job {
            if (!slot->document->isRead())
                return {};
            const double now = slot->document->layOut(shape, top);
            return [this, shape, top, now, page = slot->document->pageSize()] {
                show(shape, page, top, now);
            };
        });
    }

    /// What was at `before` when that was asked for is at `now`.
    void show(const Shape& shape, QSizeF page, double before, double now) {
        busy_ = false;
        // One went on scrolling meanwhile: about the same share is near enough.
        if (const double height = content_->contentSize().height(); top() != before && height > 1)
            now = top() * page.height() / height;
        shape_ = shape;
        const auto pieces = static_cast<std::size_t>(std::ceil(page.height() / pieceHeight));
        content_->set({{page.width(), pieceHeight}}, pieces);
        content_->correct(
            pieces - 1,
            {{page.width(), page.height() - static_cast<double>(pieces - 1) * pieceHeight}});
        widget_->contentChanged();
        widget_->showTop(now);
    }

    void draw(std::vector<std::pair<int, int>> pieces) {
        const bool idle = pieces.empty();
        wishes_->set(std::move(pieces));
        if (!idle)
            drawNext();
    }

    void drawNext() {
        worker_.run([this, slot = slot_, wishes = wishes_](PreviewToken&) -> Job {
            const auto next = wishes->take();
            if (!next || !slot->document->isRead())
                return {};
            const auto [piece, width] = *next;
            const double top = piece * pieceHeight;
            const QSizeF page = slot->document->pageSize();
            QImage image =
                slot->document->draw(top, std::min(pieceHeight, page.height() - top), width);
            return [this, page, piece = piece, image = std::move(image)] {
                // Not one that was drawn before the document was laid out anew.
                if (page.width() == content_->contentSize().width())
                    content_->setRendered(piece, image);
                widget_->update();
                drawNext();
            };
        });
    }

    void zoomBy(double factor) {
        scale_ = std::clamp(scale_ * factor, smallestScale, largestScale);
        layOutAgain();
    }

    void follow(QPointF place) {
        worker_.run([this, slot = slot_, place](PreviewToken&) -> Job {
            const QString address = slot->document ? slot->document->linkAt(place) : QString();
            if (address.startsWith(u'#')) {
                const auto top = slot->document->topOfAnchor(address.sliced(1));
                return top ? Job([this, top = *top] { widget_->showTop(top); }) : Job();
            }
            return address.isEmpty() ? Job() : [address] { openAddress(address.toStdString()); };
        });
    }

    void showSource() {
        const PreviewKind& kind = format_ == RichFormat::html ? sourcePreview : textPreview;
        plain_ = kind.make(main_, reports_);
        frame_->show(plain_->view());
        plain_->load(file_);
    }

    MainQueue& main_;
    PreviewReports reports_;
    const RichFormat format_;
    Url file_;
    const std::shared_ptr<RichSlot> slot_ = std::make_shared<RichSlot>();
    const std::shared_ptr<LatestWishes<std::pair<int, int>>> wishes_ =
        std::make_shared<LatestWishes<std::pair<int, int>>>();
    PagesContent* content_ = nullptr;
    ZoomWidget* widget_ = nullptr;
    std::shared_ptr<View> rich_;
    const std::shared_ptr<Frame> frame_ = std::make_shared<Frame>();
    /// Of a document that is shown as its source.
    std::unique_ptr<PreviewRenderer> plain_;
    double scale_ = 1;
    /// What is shown was laid out for it.
    Shape shape_;
    bool busy_ = false;
    PreviewWorker worker_;
};

} // namespace

const PreviewKind markdownPreview{
    [](std::string_view identifier) {
        return TypeRegistry::conformsTo(identifier, types::markdown);
    },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<RichRenderer>(main, std::move(reports), RichFormat::markdown);
    }};

const PreviewKind htmlPreview{
    [](std::string_view identifier) { return TypeRegistry::conformsTo(identifier, types::html); },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<RichRenderer>(main, std::move(reports), RichFormat::html);
    }};

} // namespace platform
