#include "platform/ui/qt/FocusOrder.h"

#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowWidget.h"

#include <QApplication>

#include <algorithm>
#include <cstdlib>

namespace platform {
namespace {

/// Siblings whose tops differ by less stand in one line.
constexpr int lineTolerance = 8;

bool comesBefore(const QWidget* a, const QWidget* b) {
    const QRect first = a->geometry();
    const QRect second = b->geometry();
    // A bar over the page that it belongs to, a field over the list that scrolls beneath it.
    if (const int distance = second.center().y() - first.center().y();
        first.intersects(second) && std::abs(distance) > lineTolerance)
        return distance > 0;
    const bool above = first.bottom() <= second.top() + lineTolerance;
    const bool below = second.bottom() <= first.top() + lineTolerance;
    if (above != below)
        return above;
    return isRightToLeft() ? first.right() > second.right() : first.left() < second.left();
}

void collect(const QWidget& parent, std::vector<QWidget*>& stops) {
    std::vector<QWidget*> children;
    for (QObject* const each : parent.children()) {
        auto* const widget = qobject_cast<QWidget*>(each);
        if (widget && !widget->isWindow() && widget->isVisible() &&
            !widget->testAttribute(Qt::WA_TransparentForMouseEvents))
            children.push_back(widget);
    }
    // Insertion keeps the order of siblings that overlap, for which neither comes first.
    for (auto each = children.begin(); each != children.end(); ++each)
        std::rotate(std::upper_bound(children.begin(), each, *each, comesBefore), each,
                    std::next(each));
    for (QWidget* const child : children) {
        if (canTakeFocus(*child))
            stops.push_back(child);
        collect(*child, stops);
    }
}

} // namespace

std::vector<QWidget*> focusOrder(const QWidget& scope) {
    std::vector<QWidget*> stops;
    collect(scope, stops);
    return stops;
}

bool isWithinReach(const QWidget& widget) {
    const auto* const window = dynamic_cast<const WindowWidget*>(widget.window());
    const QWidget* const scope = window ? window->focusScope() : nullptr;
    if (!widget.isVisible())
        return false;
    bool inScope = scope == nullptr;
    for (const QWidget* each = &widget; each; each = each->parentWidget()) {
        if (each->testAttribute(Qt::WA_TransparentForMouseEvents))
            return false;
        inScope = inScope || each == scope;
    }
    return inScope;
}

bool moveFocus(const QWidget& scope, bool forward) {
    const std::vector<QWidget*> stops = focusOrder(scope);
    if (stops.empty())
        return false;
    const auto current = std::ranges::find(stops, QApplication::focusWidget());
    const auto count = static_cast<std::ptrdiff_t>(stops.size());
    std::ptrdiff_t next = forward ? 0 : count - 1;
    if (current != stops.end())
        next = (current - stops.begin() + (forward ? 1 : count - 1)) % count;
    stops[static_cast<std::size_t>(next)]->setFocus(forward ? Qt::TabFocusReason
                                                            : Qt::BacktabFocusReason);
    return true;
}

} // namespace platform
