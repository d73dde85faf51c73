#include "platform/documents/list/ListState.h"

#include "platform/ui/Direction.h"
#include "platform/ui/qt/Settings.h"

#include <algorithm>

namespace platform {
namespace {

constexpr Duration editingTime = std::chrono::milliseconds(220);

/// In place of a client that has gone.
class NoClient final : public ListClient {
public:
    void listDidOpenRow(std::size_t) override {}
    unsigned listActions() const override { return 0; }
    void listDidChooseAction(int, std::size_t, Rect, std::function<void()> done) override {
        done();
    }
    void listDidAskForActions(std::size_t, Rect, std::function<void()> done) override { done(); }
};

NoClient noClient;

} // namespace

ListState::ListState(std::shared_ptr<RowModel> theModel, ListClient& theClient,
                     std::function<void()> scrolled, std::function<void()> repaint)
    : modelOwner(std::move(theModel)),
      model(*modelOwner),
      client(&theClient),
      thumbnails(repaint),
      scrolling(std::move(scrolled)),
      swipe(repaint),
      repaint_(std::move(repaint)) {
}

void ListState::leaveClient() {
    client = &noClient;
}

void ListState::measure() {
    if (!style.isCurrent()) {
        style = RowStyle::current();
        contents.clear();
    }
    spans.update(model, style, header);
    scrolling.setExtent(size.height, spans.total());
}

Rect ListState::rowRect(std::size_t index) const {
    return {0, yOf(index), size.width, spans.height(index)};
}

std::size_t ListState::firstInView() const {
    return model.count() == 0 ? 0 : spans.indexAt(scrolling.offset());
}

std::size_t ListState::firstWholeInView() const {
    const std::size_t first = firstInView();
    return yOf(first) < 0 && first + 1 < model.count() ? first + 1 : first;
}

std::size_t ListState::endInView() const {
    return spans.endAbove(scrolling.offset() + size.height);
}

std::optional<std::size_t> ListState::rowAt(double y) const {
    const double place = y + scrolling.offset();
    if (model.count() == 0 || place < header || place >= spans.total())
        return std::nullopt;
    return spans.indexAt(place);
}

ListHit ListState::hit(Point point) {
    const std::optional<std::size_t> index = rowAt(point.y);
    if (!index || point.x < 0 || point.x >= size.width)
        return {};
    const Rect row = rowRect(*index);
    const double reading = style.rightToLeft ? size.width - point.x : point.x;
    if (swipe.row() == model.idAt(*index))
        if (const std::optional<int> action = swipe.actionAt(size.width - reading))
            return {ListHit::Part::swipeAction, *index, *action};
    const RowLook look = lookOf(*index);
    if (look.more && !editing) {
        RowContent& content = contents.at(model, *index);
        const RowGeometry geometry(partsOf(content, look, row.width, row.height), style);
        if (geometry.more.contains({reading, point.y - row.y}))
            return {ListHit::Part::more, *index, 0};
    }
    return {ListHit::Part::row, *index, 0};
}

RowLook ListState::lookOf(std::size_t index) const {
    const RowId row = model.idAt(index);
    RowLook look;
    look.selected = editing && selection.contains(row);
    look.dimmed = !allows(index);
    look.hovered = hovered == row && !look.dimmed;
    look.pressed = pressed == row || pending == row;
    look.focused = hasFocus && current == row && showsKeyboardFocus();
    look.more = client->listActions() != 0 &&
                (style.alwaysShowsMore || look.hovered || (hasFocus && current == row));
    look.editing = editingShare;
    if (const auto found = arriving.find(row); found != arriving.end())
        look.progress = found->second;
    look.thumbnail = thumbnails.of(row);
    look.lastRow = index + 1 == model.count();
    return look;
}

Rect ListState::moreRect(std::size_t index) {
    const Rect row = rowRect(index);
    RowLook look = lookOf(index);
    look.more = true;
    const RowGeometry geometry(partsOf(contents.at(model, index), look, row.width, row.height),
                               style);
    Rect more = geometry.more.width > 0 ? geometry.more
                                        : Rect{row.width - row.height, 0, row.height, row.height};
    more = mirrored(more, row.width);
    more.y += row.y;
    return more;
}

std::optional<std::size_t> ListState::indexOf(const std::optional<RowId>& row) const {
    return row ? model.indexOf(*row) : std::nullopt;
}

std::optional<std::size_t> ListState::nextAllowed(std::size_t index, bool forward) const {
    while (index < model.count() && !allows(index)) {
        if (!forward && index == 0)
            return std::nullopt;
        forward ? ++index : --index;
    }
    return index < model.count() ? std::optional(index) : std::nullopt;
}

std::optional<std::size_t> ListState::allowedAround(std::size_t index) const {
    if (model.count() == 0)
        return std::nullopt;
    const auto after = nextAllowed(index, true);
    return after ? after : nextAllowed(std::min(index, model.count() - 1), false);
}

void ListState::reveal(std::size_t index, bool animated) {
    const double top = spans.top(index);
    const double bottom = top + spans.height(index);
    double wanted = scrolling.offset();
    if (bottom > wanted + size.height)
        wanted = bottom - size.height;
    if (top < wanted)
        wanted = index == 0 ? 0 : top;
    if (wanted == scrolling.offset())
        return;
    if (animated)
        scrolling.glideTo(wanted);
    else
        scrolling.jumpTo(wanted);
}

void ListState::setCurrent(std::size_t index) {
    current = model.idAt(index);
    repaint_();
}

void ListState::activate(std::size_t index) {
    if (!allows(index))
        return;
    if (editing)
        toggleSelected(index);
    else
        client->listDidOpenRow(index);
}

void ListState::toggleSelected(std::size_t index) {
    selection.toggle(model.idAt(index));
    repaint_();
    client->listSelectionDidChange();
}

void ListState::selectAll() {
    std::vector<RowId> all(model.count());
    for (std::size_t i = 0; i < all.size(); ++i)
        all[i] = model.idAt(i);
    if (!selection.set(all))
        return;
    repaint_();
    client->listSelectionDidChange();
}

void ListState::keepPending(std::size_t index) {
    swipe.close();
    pending = model.idAt(index);
    repaint_();
}

std::function<void()> ListState::pendingDone() {
    return [this, row = pending, weak = std::weak_ptr(alive_)] {
        if (weak.expired() || pending != row)
            return;
        pending.reset();
        repaint_();
    };
}

void ListState::chooseAction(int action, std::size_t index, Rect from) {
    keepPending(index);
    client->listDidChooseAction(action, index, from, pendingDone());
}

void ListState::askForActions(std::size_t index, Rect from) {
    if (client->listActions() == 0 || editing)
        return;
    keepPending(index);
    client->listDidAskForActions(index, from, pendingDone());
}

void ListState::setEditing(bool value, bool animated) {
    if (editing == value)
        return;
    editing = value;
    swipe.close();
    const double from = editingShare;
    const double to = value ? 1 : 0;
    editingMotion_.start(editingTime, AnimationCurve::easeOut, [this, from, to](double progress) {
        editingShare = from + (to - from) * progress;
        repaint_();
    });
    if (!animated)
        editingMotion_.finish();
    if (!value && selection.clear())
        client->listSelectionDidChange();
}

} // namespace platform
