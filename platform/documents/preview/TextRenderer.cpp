#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/SourceIndex.h"
#include "platform/documents/preview/TextWidget.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <optional>

namespace platform {
namespace {

/// The open file; of the worker's queue alone.
struct TextSlot {
    std::optional<TextFile> file;
    /// None for prose.
    std::optional<SourceIndex> index;

    void open(TextFile text, const SyntaxLanguage* language) {
        index.reset();
        file.emplace(std::move(text));
        if (language)
            index.emplace(*file, *language);
    }
    std::vector<TextLine> described(std::vector<TextLine> lines) {
        if (index)
            index->describe(lines);
        return lines;
    }
};

/// Text of any length, plain or of a program: windows of it are read as one comes near them.
class TextRenderer final : public PreviewRenderer {
public:
    TextRenderer(MainQueue& main, PreviewReports reports, TextWidget::Style style)
        : reports_(std::move(reports)), worker_(main) {
        auto widget = std::make_unique<TextWidget>(
            TextWidget::Wishes{
                [this](std::uint64_t offset) {
                    read([offset](const TextFile& file) { return file.linesFrom(offset); },
                         [this](auto lines) { widget_->appendLines(std::move(lines)); });
                },
                [this](std::uint64_t offset) {
                    read([offset](const TextFile& file) { return file.linesBefore(offset); },
                         [this](auto lines) { widget_->prependLines(std::move(lines)); });
                },
                [this](std::uint64_t offset) { show(offset); }},
            style);
        widget_ = widget.get();
        view_ = std::make_shared<WidgetView>(std::move(widget));
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        language_ =
            syntaxLanguageFor(TypeRegistry::identifierForFileName(file.lastPathComponent()));
        view_->setAccessibleName(displayName(file.lastPathComponent()));
        open(0);
    }

    void reload() override { open(widget_->topOffset()); }

    std::optional<std::function<void(double)>> zoom() override {
        return [this](double factor) { widget_->zoomBy(factor); };
    }

private:
    using Lines = std::vector<TextLine>;

    void open(std::uint64_t top) {
        worker_.cancel();
        worker_.run([this, file = file_, slot = slot_, widget = widget_, language = language_,
                     top](PreviewToken& token) -> Job {
            slot->index.reset();
            slot->file.reset();
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                Result<TextFile> text = TextFile::open(file, path);
                if (!text)
                    return Failure(text.error());
                slot->open(std::move(*text), language);
                return Failure();
            });
            if (failure || !slot->file)
                return [this, failure] {
                    if (failure)
                        reports_.failed(*failure);
                };
            return [this, lines = linesAround(*slot, top, widget)] {
                lines();
                reports_.shown();
            };
        });
    }

    void show(std::uint64_t place) {
        worker_.run([slot = slot_, widget = widget_, place](PreviewToken&) -> Job {
            return slot->file ? linesAround(*slot, place, widget) : Job();
        });
    }

    /// Reads them; the answer, on the main thread, puts them into the widget.
    static Job linesAround(TextSlot& slot, std::uint64_t place, TextWidget* widget) {
        const TextFile& file = *slot.file;
        const auto lines = std::make_shared<Lines>(slot.described(file.linesAround(place)));
        return [widget, lines, place, start = file.start(), size = file.size()] {
            widget->setLines(std::move(*lines), start, size, place);
        };
    }

    void read(std::function<Lines(const TextFile&)> what, std::function<void(Lines)> take) {
        worker_.run(
            [slot = slot_, what = std::move(what), take = std::move(take)](PreviewToken&) -> Job {
                if (!slot->file)
                    return {};
                const auto lines = std::make_shared<Lines>(slot->described(what(*slot->file)));
                return [lines, take] { take(std::move(*lines)); };
            });
    }

    PreviewReports reports_;
    Url file_;
    const SyntaxLanguage* language_ = nullptr;
    const std::shared_ptr<TextSlot> slot_ = std::make_shared<TextSlot>();
    TextWidget* widget_ = nullptr;
    std::shared_ptr<View> view_;
    PreviewWorker worker_;
};

} // namespace

const PreviewKind textPreview{
    [](std::string_view identifier) { return TypeRegistry::conformsTo(identifier, types::text); },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<TextRenderer>(main, std::move(reports), TextWidget::Style::prose);
    }};

const PreviewKind sourcePreview{
    [](std::string_view identifier) { return syntaxLanguageFor(identifier) != nullptr; },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<TextRenderer>(main, std::move(reports), TextWidget::Style::code);
    }};

} // namespace platform
