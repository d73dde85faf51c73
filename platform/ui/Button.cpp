#include "platform/ui/Controls.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ButtonImpl.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextBlock.h"
#include "platform/ui/qt/TextMetrics.h"
#include "platform/ui/qt/ViewWidget.h"

#include <QKeyEvent>
#include <QPainter>
#include <QPainterPath>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double hoverShade = 0.05;
constexpr double pressedShade = 0.10;
constexpr double imageTitleGap = 8;

/// A rectangle of which some corners are those of the card below.
QPainterPath rowPath(const QRectF& bounds, RowCorners corners) {
    const auto has = [corners](RowCorners corner) {
        return (static_cast<unsigned>(corners) & static_cast<unsigned>(corner)) != 0;
    };
    const double r = Theme::overlayCorner;
    QPainterPath round;
    round.addRoundedRect(bounds, r, r);
    QPainterPath square;
    square.setFillRule(Qt::WindingFill);
    if (!has(RowCorners::topLeft))
        square.addRect(QRectF(bounds.left(), bounds.top(), r, r));
    if (!has(RowCorners::topRight))
        square.addRect(QRectF(bounds.right() - r, bounds.top(), r, r));
    if (!has(RowCorners::bottomLeft))
        square.addRect(QRectF(bounds.left(), bounds.bottom() - r, r, r));
    if (!has(RowCorners::bottomRight))
        square.addRect(QRectF(bounds.right() - r, bounds.bottom() - r, r, r));
    return round.united(square);
}

ButtonImpl* implOf(const QWidget* widget) {
    View* const view = ownerOf(widget);
    return view ? static_cast<ButtonImpl*>(&view->impl()) : nullptr;
}

} // namespace

ButtonImpl& implOf(const Button& button) {
    return static_cast<ButtonImpl&>(button.impl());
}

ButtonWidget::ButtonWidget() {
    setAutoDefault(false);
    setFlat(true);
    setFocusPolicy(Qt::TabFocus);
    setAttribute(Qt::WA_Hover);
    setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Ignored);
}

bool ButtonWidget::event(QEvent* event) {
    if (event->type() == QEvent::EnabledChange)
        update();
    return QPushButton::event(event);
}

void ButtonWidget::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    if (ButtonImpl* const impl = implOf(this))
        impl->paint(painter);
}

void ButtonWidget::keyPressEvent(QKeyEvent* event) {
    switch (event->key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
        // Qt would look for a dialog's default button.
        click();
        break;
    case Qt::Key_Space:
    case Qt::Key_Select:
        QPushButton::keyPressEvent(event);
        break;
    default:
        // The arrows are the screen's; Qt would move the focus by them.
        event->ignore();
    }
}

ButtonImpl::ButtonImpl(ButtonType buttonType)
    : View::Impl(std::make_unique<ButtonWidget>()), type(buttonType) {
    if (buttonType == ButtonType::custom)
        padding = 0;
    auto* const button = static_cast<ButtonWidget*>(widget.data());
    QObject::connect(button, &QPushButton::clicked, button, [this] { sendClick(); });
}

void ButtonImpl::sendClick() {
    keepUntilNextTurn(self->shared_from_this());
    static_cast<Button*>(self)->sendActions(ControlEvent::touchUpInside);
}

QString ButtonImpl::toQtTitle() const {
    return toQt(title);
}

void ButtonImpl::changed() {
    blocks_.clear();
    updateAccessibleName();
    self->invalidateIntrinsicContentSize();
    self->setNeedsDisplay();
}

Font ButtonImpl::shownFont() const {
    const Font base = font.value_or(Font::preferred(TextStyle::body));
    return titleScale == 1 ? base : base.scaled(titleScale);
}

Color ButtonImpl::shownTitleColor() const {
    if (titleColor)
        return *titleColor;
    if (type == ButtonType::custom)
        return Theme::text;
    return isPressed() ? Theme::accentPressed : Theme::accent;
}

bool ButtonImpl::isPressed() const {
    return widget && static_cast<QPushButton*>(widget.data())->isDown();
}

bool ButtonImpl::isHovered() const {
    return widget && widget->isEnabled() && pointerHovers() && widget->underMouse();
}

void ButtonImpl::paintFace(QPainter& painter, const QRectF& bounds) const {
    const double shade = isPressed() ? pressedShade : isHovered() ? hoverShade : 0;
    if (shade == 0)
        return;
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(Theme::text.withAlpha(shade)));
    if (isRow)
        painter.drawPath(rowPath(bounds, rowCorners));
    else
        painter.drawRoundedRect(bounds, Theme::buttonCorner, Theme::buttonCorner);
}

void ButtonImpl::paintContent(QPainter& painter, const QRectF& bounds) {
    paintFace(painter, bounds);
    const bool enabled = !widget || widget->isEnabled();
    if (!enabled)
        painter.setOpacity(Theme::disabledAlpha);
    else if (isPressed() && type == ButtonType::custom)
        painter.setOpacity(0.6);
    QRectF room = bounds.adjusted(padding, 0, -padding, 0);
    if (!image.empty()) {
        const Size size = image.size();
        const double shrink =
            std::min({1.0, bounds.width() / size.width, bounds.height() / size.height});
        const double width = size.width * shrink;
        const double height = size.height * shrink;
        const bool alone = title.empty() || titleHidden;
        const double whole = alone ? width : width + imageTitleGap + titleSize().width();
        const double start = std::floor(bounds.center().x() - std::min(whole, room.width()) / 2);
        const double y = std::floor(bounds.center().y() - height / 2);
        const bool rightToLeft = isRightToLeft();
        const double x = rightToLeft ? bounds.left() + bounds.right() - start - width : start;
        paintImage(painter, type == ButtonType::system ? image.tinted(shownTitleColor()) : image,
                   QRectF(x, y, width, height));
        if (rightToLeft)
            room.setRight(x - imageTitleGap);
        else
            room.setLeft(x + width + imageTitleGap);
    }
    if (!title.empty() && !titleHidden)
        paintTitle(painter, room);
    painter.setOpacity(1);
    if (widget && widget->hasFocus() && showsKeyboardFocus())
        paintFocusRing(painter, isRow ? bounds.adjusted(4, 4, -4, -4) : bounds,
                       Theme::buttonCorner);
}

void ButtonImpl::paintTitle(QPainter& painter, QRectF room) const {
    painter.setPen(toQt(shownTitleColor()));
    const TextAlignment alignment = image.empty() ? titleAlignment : TextAlignment::natural;
    titleBlock(room.width()).draw(painter, room, alignment);
}

const TextBlock& ButtonImpl::titleBlock(double width) const {
    return blocks_.block(toQtTitle(), {shownFont(), wraps ? 0 : 1, LineBreak::elideMiddle}, width);
}

QSizeF ButtonImpl::titleSize() const {
    return title.empty() ? QSizeF(0, 0) : titleBlock(TextBlock::unlimitedWidth).size();
}

void ButtonImpl::settingsChanged() {
    blocks_.clear();
    View::Impl::settingsChanged();
}

double ButtonImpl::heightForWidth(double width) const {
    if (!wraps || title.empty())
        return noIntrinsicMetric;
    const double height = titleBlock(width - 2 * padding).size().height();
    return std::max(Theme::minimumTarget, height + padding);
}

Button::Button(ButtonType type, Rect frame) : View(std::make_unique<ButtonImpl>(type)) {
    setFrame(frame);
}

ButtonType Button::buttonType() const {
    return implOf(*this).type;
}

const std::string& Button::title() const {
    return implOf(*this).title;
}

void Button::setTitle(std::string_view title) {
    ButtonImpl& impl = implOf(*this);
    if (impl.title == title)
        return;
    impl.title = title;
    impl.changed();
}

void Button::setTitleFont(Font font) {
    implOf(*this).font = font;
    implOf(*this).changed();
}

void Button::setTitleWraps(bool wraps) {
    implOf(*this).wraps = wraps;
    implOf(*this).changed();
}

void Button::setTitleColor(Color color) {
    implOf(*this).titleColor = color;
    setNeedsDisplay();
}

void Button::setImage(const Image& image) {
    implOf(*this).image = image;
    implOf(*this).changed();
}

bool Button::isEnabled() const {
    const QWidget* const widget = implOf(*this).widget;
    return widget && widget->isEnabled();
}

void Button::setEnabled(bool enabled) {
    if (QWidget* const widget = implOf(*this).widget)
        widget->setEnabled(enabled);
}

void Button::addAction(ControlEvent /*event*/, std::function<void()> action) {
    implOf(*this).actions.push_back(std::move(action));
}

void Button::sendActions(ControlEvent /*event*/) {
    if (!isEnabled())
        return;
    // A copy: an action may add actions or let go of the button.
    const std::vector<std::function<void()>> actions = implOf(*this).actions;
    for (const auto& action : actions)
        action();
}

Size Button::intrinsicContentSize() const {
    const ButtonImpl& impl = implOf(*this);
    const QSizeF title = impl.titleSize();
    double width = title.width();
    double height = title.height();
    if (!impl.image.empty()) {
        const Size picture = impl.image.size();
        width += picture.width + (title.isEmpty() ? 0 : imageTitleGap);
        height = std::max(height, picture.height);
    }
    width += 2 * impl.padding;
    if (impl.type == ButtonType::custom)
        return {width, height};
    return {std::max(width, Theme::minimumTarget), std::max(height, Theme::minimumTarget)};
}

double Button::intrinsicHeightForWidth(double width) const {
    return implOf(*this).heightForWidth(width);
}

} // namespace platform
