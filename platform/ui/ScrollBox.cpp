#include "platform/ui/ScrollBox.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/ViewWidget.h"

#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double lineStep = 48;
constexpr double dragSlop = 8;
constexpr double focusMargin = 12;
constexpr double indicatorWidth = 4;

} // namespace

struct ScrollBox::Scrolling : View::Impl {
    Scrolling();
    ~Scrolling() override {
        // The widget's own end moves the focus once more.
        QObject::disconnect(focusWatch);
    }

    /// Less than a point is rounding, not content.
    double farthest() const {
        const double hiddenPart = self ? contentHeight - self->bounds().height : 0;
        return hiddenPart < 1 ? 0 : hiddenPart;
    }
    void moveTo(double wanted) {
        offset = std::clamp(wanted, 0.0, farthest());
        content->impl().setTranslation({0, -std::round(offset)});
        indicator->setHidden(farthest() <= 0);
        if (farthest() > 0)
            placeIndicator();
    }
    void placeIndicator() const {
        const Rect area = self->bounds();
        const double length = std::max(24.0, area.height * area.height / contentHeight);
        const double y = (area.height - length) * offset / farthest();
        indicator->setFrame({isRightToLeft() ? 2 : area.width - indicatorWidth - 2, std::round(y),
                             indicatorWidth, std::round(length)});
    }
    void showFocused(const QWidget* focused) {
        const QWidget* const inside = content->impl().widget;
        if (!focused || !inside || !inside->isAncestorOf(focused))
            return;
        const double top = focused->mapTo(inside, QPoint()).y();
        const double bottom = top + focused->height();
        const double height = self->bounds().height;
        if (top - focusMargin < offset)
            moveTo(top - focusMargin);
        else if (bottom + focusMargin > offset + height)
            moveTo(bottom + focusMargin - height);
    }

    std::shared_ptr<View> content;
    std::shared_ptr<View> indicator;
    QMetaObject::Connection focusWatch;
    double contentHeight = 0;
    double offset = 0;
};

namespace {

class ScrollWidget : public ViewWidget {
public:
    explicit ScrollWidget(std::function<void(double)> scrollBy) : scrollBy_(std::move(scrollBy)) {}

protected:
    void wheelEvent(QWheelEvent* event) override {
        const double pixels = event->pixelDelta().y();
        scrollBy_(-(pixels != 0 ? pixels : event->angleDelta().y() / 120.0 * lineStep));
    }
    void mousePressEvent(QMouseEvent* event) override {
        last_ = event->position().y();
        moved_ = 0;
    }
    void mouseMoveEvent(QMouseEvent* event) override {
        const double step = last_ - event->position().y();
        last_ = event->position().y();
        moved_ += std::abs(step);
        if (moved_ > dragSlop)
            scrollBy_(step);
    }
    void keyPressEvent(QKeyEvent* event) override {
        switch (event->key()) {
        case Qt::Key_Up:
            return scrollBy_(-lineStep);
        case Qt::Key_Down:
            return scrollBy_(lineStep);
        case Qt::Key_PageUp:
            return scrollBy_(-height() * 0.9);
        case Qt::Key_PageDown:
            return scrollBy_(height() * 0.9);
        default:
            ViewWidget::keyPressEvent(event);
        }
    }

private:
    std::function<void(double)> scrollBy_;
    double last_ = 0;
    double moved_ = 0;
};

} // namespace

ScrollBox::Scrolling::Scrolling()
    : View::Impl(std::make_unique<ScrollWidget>([this](double step) { moveTo(offset + step); })) {
    focusWatch = QObject::connect(qApp, &QApplication::focusChanged, widget.data(),
                                  [this](QWidget*, QWidget* now) { showFocused(now); });
}

ScrollBox::ScrollBox(std::shared_ptr<View> content) : View(std::make_unique<Scrolling>()) {
    Scrolling& state = scrolling();
    state.content = std::move(content);
    state.indicator = std::make_shared<View>();
    state.indicator->setBackgroundColor(Theme::text.withAlpha(0.28));
    state.indicator->setCornerRadius(indicatorWidth / 2);
    state.indicator->setUserInteractionEnabled(false);
    addSubview(state.content);
    addSubview(state.indicator);
}

ScrollBox::~ScrollBox() = default;

ScrollBox::Scrolling& ScrollBox::scrolling() const {
    return static_cast<Scrolling&>(impl());
}

void ScrollBox::setContentHeight(double height) {
    scrolling().contentHeight = height;
    scrolling().content->setFrame({0, 0, bounds().width, height});
    scrollTo(offset());
}

double ScrollBox::offset() const {
    return scrolling().offset;
}

void ScrollBox::scrollTo(double offset) {
    scrolling().moveTo(offset);
}

void ScrollBox::layoutSubviews() {
    setContentHeight(scrolling().contentHeight);
}

} // namespace platform
