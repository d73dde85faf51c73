#include "platform/documents/list/RowSwipe.h"

#include "platform/base/Text.h"
#include "platform/documents/DocumentListController.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Font.h"
#include "platform/ui/Image.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QFontMetricsF>
#include <QPainter>

#include <algorithm>
#include <array>
#include <cmath>

namespace platform {
namespace {

constexpr Duration settleTime = std::chrono::milliseconds(200);
constexpr double widestButton = 76;
/// What of the row stays in sight beside its actions: its picture and the head of its name.
constexpr double leastRow = 136;
constexpr double fastEnough = 300; // points a second
constexpr double iconEdge = 22;
constexpr double captionGap = 2;

Color fillOf(int action) {
    switch (static_cast<DocumentAction>(action)) {
    case DocumentAction::remove:
        return Theme::destructive;
    case DocumentAction::more:
        return Theme::secondaryText;
    case DocumentAction::rename:
        return Theme::accent;
    case DocumentAction::information:
        return Theme::accentPressed;
    }
    return Theme::secondaryText;
}

Image pictureOf(int action) {
    switch (static_cast<DocumentAction>(action)) {
    case DocumentAction::remove:
        return Image::system(SystemImage::trash);
    case DocumentAction::rename:
        return Image::named("ui-rename");
    case DocumentAction::information:
        return Image::named("ui-info");
    case DocumentAction::more:
        break;
    }
    return Image::system(SystemImage::more);
}

} // namespace

std::string actionTitle(int action) {
    switch (static_cast<DocumentAction>(action)) {
    case DocumentAction::remove:
        return localized("Delete");
    case DocumentAction::rename:
        return localized("Rename");
    case DocumentAction::information:
        return localized("Info");
    case DocumentAction::more:
        break;
    }
    return localized("More");
}

std::vector<int> offeredActions(unsigned bits) {
    constexpr std::array order{DocumentAction::information, DocumentAction::rename,
                               DocumentAction::more, DocumentAction::remove};
    std::vector<int> offered;
    for (const DocumentAction action : order)
        if (bits & (1U << static_cast<unsigned>(action)))
            offered.push_back(static_cast<int>(action));
    return offered;
}

void RowSwipe::begin(RowId row, const std::vector<int>& actions, double rowWidth) {
    motion_.stop();
    if (row_ != row)
        distance_ = 0;
    row_ = row;
    actions_.assign(actions.rbegin(), actions.rend());
    const double room = std::max(0.0, rowWidth - leastRow);
    const double count = static_cast<double>(std::max<std::size_t>(1, actions_.size()));
    buttonWidth_ = std::floor(std::min(widestButton, room / count));
    start_ = distance_;
}

void RowSwipe::dragTo(double distance) {
    const double wanted = start_ + distance;
    const double inside = std::clamp(wanted, 0.0, fullWidth());
    distance_ = inside + (wanted > inside ? (wanted - inside) * 0.2 : 0);
    changed_();
}

void RowSwipe::release(double speed) {
    const bool opens = std::abs(speed) > fastEnough ? speed > 0 : distance_ > fullWidth() / 2;
    settle(opens ? fullWidth() : 0, opens);
}

void RowSwipe::open() {
    settle(fullWidth(), true);
}

void RowSwipe::close() {
    if (row_)
        settle(0, false);
}

void RowSwipe::forget() {
    motion_.stop();
    row_.reset();
    open_ = false;
    distance_ = 0;
    pressed_.reset();
    changed_();
}

void RowSwipe::settle(double distance, bool open) {
    open_ = open;
    const double from = distance_;
    motion_.start(
        settleTime, AnimationCurve::easeOut,
        [this, from, distance](double progress) {
            distance_ = from + (distance - from) * progress;
            changed_();
        },
        [this, open] {
            if (!open)
                forget();
        });
}

std::optional<int> RowSwipe::actionAt(double fromEnd) const {
    if (!open_ || fromEnd < 0 || fromEnd >= distance_ || buttonWidth_ <= 0)
        return std::nullopt;
    const auto index = static_cast<std::size_t>(fromEnd / buttonWidth_);
    return index < actions_.size() ? std::optional(actions_[index]) : std::nullopt;
}

Rect RowSwipe::buttonRect(int action, Size row) const {
    const auto found = std::find(actions_.begin(), actions_.end(), action);
    const auto index = static_cast<double>(found - actions_.begin());
    return {row.width - (index + 1) * buttonWidth_, 0, buttonWidth_, row.height};
}

void RowSwipe::setPressed(std::optional<int> action) {
    pressed_ = action;
    changed_();
}

void RowSwipe::paint(QPainter& painter, const QRectF& area) const {
    const double width = fullWidth();
    if (width <= 0 || distance_ <= 0)
        return;
    const Font caption = Font::preferred(TextStyle::caption);
    const QFontMetricsF metrics(toQt(caption));
    // All have their words, or none: a lone word would look like the main thing.
    const bool captioned = std::all_of(actions_.begin(), actions_.end(), [&](int action) {
        return metrics.horizontalAdvance(toQt(actionTitle(action))) <= buttonWidth_ - 4;
    });
    // The buttons spread from the trailing edge as the row is drawn aside.
    const double share = distance_ / width;
    for (std::size_t i = 0; i < actions_.size(); ++i) {
        const double left = area.width() - (static_cast<double>(i) + 1) * buttonWidth_ * share;
        const Rect reading{left, 0, buttonWidth_ * share + 1, area.height()};
        const QRectF button = toQt(mirrored(reading, area.width())).translated(area.topLeft());
        painter.fillRect(button, toQt(fillOf(actions_[i])));
        if (pressed_ == actions_[i])
            painter.fillRect(button, toQt(Color::black.withAlpha(0.18)));
        const QString title = toQt(actionTitle(actions_[i]));
        const double content = captioned ? iconEdge + captionGap + caption.lineHeight() : iconEdge;
        QRectF icon(0, 0, iconEdge, iconEdge);
        icon.moveCenter(button.center());
        icon.moveTop(std::round(button.center().y() - content / 2));
        painter.save();
        painter.setClipRect(button, Qt::IntersectClip);
        paintImage(painter, pictureOf(actions_[i]).tinted(Color::white), icon);
        if (captioned) {
            painter.setFont(toQt(caption));
            painter.setPen(Qt::white);
            const double x = button.center().x() - metrics.horizontalAdvance(title) / 2;
            painter.drawText(QPointF(x, icon.bottom() + captionGap + caption.ascender()), title);
        }
        painter.restore();
    }
}

} // namespace platform
