#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/LatestWishes.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/TableContent.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QLabel>
#include <QResizeEvent>

#include <optional>

namespace platform {
namespace {

/// So many rows tell how wide columns are and what is in them.
constexpr std::size_t telltaleRows = 400;

/// The open file; of the worker's queue alone.
struct TableSlot {
    std::optional<TableFile> file;
};

/// The table, and below it the whole text of the cell that was touched.
class TableWidget final : public ZoomWidget {
public:
    TableWidget(std::unique_ptr<TableContent> content, const Settings& settings)
        : ZoomWidget(std::move(content), settings), text_(new QLabel(this)) {
        text_->setTextFormat(Qt::PlainText);
        text_->setWordWrap(true);
        text_->setFont(toQt(Font::preferred(TextStyle::footnote)));
        text_->setTextInteractionFlags(Qt::TextSelectableByMouse);
        text_->setAlignment(Qt::AlignLeading | Qt::AlignTop);
        text_->setStyleSheet(QStringLiteral("background:%1;color:%2;border:1px solid %3;"
                                            "border-radius:8px;padding:10px")
                                 .arg(toQt(Theme::page).name(), toQt(Theme::text).name(),
                                      toQt(Theme::hairline).name()));
        text_->hide();
    }

    /// "" for nothing.
    void showText(const QString& text) {
        text_->setText(text);
        text_->setVisible(!text.isEmpty());
        place();
    }

protected:
    void resizeEvent(QResizeEvent* event) override {
        ZoomWidget::resizeEvent(event);
        place();
    }

private:
    void place() {
        constexpr int edge = 12;
        // The buttons that make larger and smaller float at the end.
        constexpr int besideButtons = 72;
        const int room = std::max(80, width() - edge - besideButtons);
        const int high = std::min(text_->heightForWidth(room), height() / 3);
        const Rect box = mirrored({edge, static_cast<double>(height() - high - edge),
                                   static_cast<double>(room), static_cast<double>(high)},
                                  width());
        text_->setGeometry(toQt(box).toRect());
    }

    QLabel* text_;
};

/// A table of any length: its rows are counted meanwhile, and read as they come into view.
class TableRenderer final : public PreviewRenderer {
public:
    TableRenderer(MainQueue& main, PreviewReports reports)
        : reports_(std::move(reports)), worker_(main) {
        const bool rightToLeft = readingSign() < 0;
        auto content = std::make_unique<TableContent>(
            [this](std::vector<std::uint64_t> blocks) { read(std::move(blocks)); }, rightToLeft);
        content_ = content.get();
        ZoomPlace::Limits limits{ZoomPlace::Fit::none, 0, 3, 0.5, rightToLeft};
        auto widget = std::make_unique<TableWidget>(
            std::move(content), ZoomWidget::Settings{limits, false, true, Theme::page});
        widget_ = widget.get();
        widget_->setTapHandler([this](QPointF place) { return tapped(place); });
        view_ = std::make_shared<WidgetView>(std::move(widget));
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        view_->setAccessibleName(displayName(file.lastPathComponent()));
        open(0);
    }

    void reload() override { open(content_->rowCount()); }

    std::optional<std::function<void(double)>> zoom() override {
        return [this](double factor) { widget_->zoomBy(factor); };
    }

private:
    /// Shows it when so many rows are counted, so that the place is there again.
    void open(std::uint64_t rows) {
        worker_.cancel();
        worker_.run([this, file = file_, slot = slot_, rows](PreviewToken& token) -> Job {
            slot->file.reset();
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                Result<TableFile> table = TableFile::open(file, path);
                if (!table)
                    return Failure(table.error());
                slot->file.emplace(std::move(*table));
                while (slot->file->rowCount() < rows && !slot->file->isCounted() &&
                       !token.isCancelled())
                    slot->file->countMore();
                return Failure();
            });
            if (failure || !slot->file)
                return [this, failure] {
                    if (failure)
                        reports_.failed(*failure);
                };
            auto shape = TableShape::of(slot->file->rows(0, telltaleRows), true);
            return [this, shape = std::move(shape), count = slot->file->rowCount()] {
                content_->set(shape, count);
                widget_->showText({});
                widget_->contentChanged();
                reports_.shown();
                countOn();
            };
        });
    }

    void countOn() {
        worker_.run([this, slot = slot_](PreviewToken&) -> Job {
            if (slot->file->isCounted())
                return {};
            slot->file->countMore();
            return [this, count = slot->file->rowCount()] {
                content_->setRowCount(count);
                widget_->contentChanged();
                countOn();
            };
        });
    }

    void read(std::vector<std::uint64_t> blocks) {
        const bool idle = blocks.empty();
        wishes_->set(std::move(blocks));
        if (!idle)
            readNext();
    }

    void readNext() {
        worker_.run([this, slot = slot_, wishes = wishes_](PreviewToken&) -> Job {
            const auto block = wishes->take();
            if (!block || !slot->file)
                return {};
            auto rows =
                slot->file->rows(*block * TableContent::rowsABlock, TableContent::rowsABlock);
            auto shape = TableShape::of(rows, false);
            return [this, block = *block, rows = std::move(rows), shape = std::move(shape)] {
                if (content_->setBlock(block, rows, shape))
                    widget_->contentChanged();
                widget_->update();
                readNext();
            };
        });
    }

    bool tapped(QPointF place) {
        auto cell = content_->cellAt(place, widget_->visibleRect());
        if (cell == content_->selected())
            cell.reset();
        content_->select(cell);
        widget_->showText(cell ? content_->textOf(*cell) : QString());
        widget_->update();
        return true;
    }

    PreviewReports reports_;
    Url file_;
    const std::shared_ptr<TableSlot> slot_ = std::make_shared<TableSlot>();
    const std::shared_ptr<LatestWishes<std::uint64_t>> wishes_ =
        std::make_shared<LatestWishes<std::uint64_t>>();
    TableContent* content_ = nullptr;
    TableWidget* widget_ = nullptr;
    std::shared_ptr<View> view_;
    PreviewWorker worker_;
};

bool isTable(std::string_view identifier) {
    return TypeRegistry::conformsTo(identifier, types::csv) ||
           TypeRegistry::conformsTo(identifier, "public.tab-separated-values-text");
}

} // namespace

const PreviewKind tablePreview{
    &isTable, [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<TableRenderer>(main, std::move(reports));
    }};

} // namespace platform
