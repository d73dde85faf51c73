#include "platform/launch/Alerts.h"

#include "platform/base/ByteCount.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/ui/Application.h"
#include "platform/ui/Canvas.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ApplicationImpl.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double areaMargin = 16;
constexpr double barTop = 8;
constexpr double barHeight = 4;
constexpr double barTextGap = 8;
constexpr double areaBottom = 4;

std::string bytesText(std::int64_t count) {
    return byteCountText(static_cast<std::uint64_t>(std::max<std::int64_t>(count, 0)),
                         ByteCountStyle::file);
}

} // namespace

bool presentOverWindow(const std::shared_ptr<ViewController>& screen, bool animated) {
    const Application::Impl* const application = applicationImpl();
    Window* const window = application ? application->visibleWindow() : nullptr;
    const auto root = window ? window->rootViewController() : nullptr;
    if (!root) {
        platformLog(LogLevel::warning, "There is no window to show “%@” in", screen->title());
        return false;
    }
    root->presentViewController(screen, animated);
    return true;
}

void showFailure(std::string_view title, const Error& error) {
    const auto alert = AlertController::create(
        title, error.localizedDescription.value_or(error.localizedFailureReason.value_or("")),
        AlertStyle::alert);
    alert->addAction(AlertAction::make(localized("OK"), ActionStyle::standard));
    presentOverWindow(alert, true);
}

/// A bar that fills, and the bytes below it.
class ProgressAlert::Area : public View {
public:
    Area() {
        text_->setFont(Font::preferred(TextStyle::footnote));
        text_->setTextColor(Theme::secondaryText);
        text_->setTextAlignment(TextAlignment::center);
        text_->setText(localized("Waiting…"));
        addSubview(text_);
        setFrame({0, 0, 0, textTop() + text_->intrinsicContentSize().height + areaBottom});
    }

    void setProgress(std::int64_t completed, std::int64_t total) {
        fraction_ =
            total <= 0
                ? 0
                : std::clamp(static_cast<double>(completed) / static_cast<double>(total), 0.0, 1.0);
        text_->setText(
            total <= 0 ? bytesText(completed)
                       : localizedFormat("%1$@ of %2$@", bytesText(completed), bytesText(total)));
        setNeedsDisplay();
    }

protected:
    void layoutSubviews() override {
        const Rect all = bounds();
        text_->setFrame({areaMargin, textTop(), std::max(0.0, all.width - 2 * areaMargin),
                         text_->intrinsicContentSize().height});
    }
    void draw(Canvas& canvas) override {
        const Rect track{areaMargin, barTop, std::max(0.0, bounds().width - 2 * areaMargin),
                         barHeight};
        Rect done = track;
        done.width = std::round(track.width * fraction_);
        if (Application::shared().isRightToLeft())
            done.x = track.maxX() - done.width;
        fillBar(canvas, track, Theme::hairline);
        if (done.width > 0)
            fillBar(canvas, done, Theme::accent);
    }

private:
    static double textTop() { return barTop + barHeight + barTextGap; }
    static void fillBar(Canvas& canvas, Rect rect, Color color) {
        Path path;
        path.addRoundedRect(rect, std::min(barHeight, rect.width) / 2);
        canvas.fill(path, color);
    }

    std::shared_ptr<Label> text_ = std::make_shared<Label>();
    double fraction_ = 0;
};

namespace {

/// A screen that is one view.
class ViewScreen : public ViewController {
public:
    explicit ViewScreen(std::shared_ptr<View> shown) : shown_(std::move(shown)) {}
    void loadView() override { setView(shown_); }

private:
    std::shared_ptr<View> shown_;
};

} // namespace

ProgressAlert::ProgressAlert(std::string_view document, std::function<void()> cancelled)
    : area_(std::make_shared<Area>()),
      alert_(AlertController::create(localizedFormat("Downloading “%1$@”", document), "",
                                     AlertStyle::alert)) {
    alert_->setContentViewController(std::make_shared<ViewScreen>(area_));
    alert_->addAction(
        AlertAction::make(localized("Cancel"), ActionStyle::cancel,
                          [cancelled = std::move(cancelled)](AlertAction&) { cancelled(); }));
}

ProgressAlert::~ProgressAlert() = default;

void ProgressAlert::present() {
    shown_ = presentOverWindow(alert_, true);
}

void ProgressAlert::setProgress(std::int64_t completed, std::int64_t total) {
    area_->setProgress(completed, total);
}

void ProgressAlert::finish(std::function<void()> then) {
    if (!shown_)
        return then();
    // Chosen for the user: this very alert goes, whatever stands above it by now.
    alert_->choose(AlertAction::make("", ActionStyle::standard,
                                     [then = std::move(then)](AlertAction&) { then(); }));
}

} // namespace platform
