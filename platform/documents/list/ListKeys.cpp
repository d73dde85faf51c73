#include "platform/documents/list/ListKeys.h"

#include "platform/base/Runtime.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/DocumentListController.h"
#include "platform/ui/Application.h"

#include <QKeyEvent>

#include <algorithm>

namespace platform {
namespace {

/// After this pause typing begins a new word.
constexpr Duration typingPause = std::chrono::milliseconds(1200);

bool offers(const ListState& state, DocumentAction action) {
    return (state.client->listActions() & (1U << static_cast<unsigned>(action))) != 0;
}

} // namespace

bool ListKeys::press(const QKeyEvent& event) {
    if (state_.model.count() != 0 && (moveCurrent(event) || actOnCurrent(event)))
        return true;
    if (event.key() == Qt::Key_Escape)
        return leave();
    if (event.matches(QKeySequence::Refresh)) {
        refresh_();
        return true;
    }
    if (event.matches(QKeySequence::SelectAll))
        return selectAll();
    const Qt::KeyboardModifiers harmless = Qt::ShiftModifier | Qt::KeypadModifier;
    const QString text = event.text();
    if ((event.modifiers() & ~harmless) == Qt::NoModifier && !text.isEmpty() && text[0].isPrint())
        return find(text);
    return false;
}

bool ListKeys::moveCurrent(const QKeyEvent& event) {
    const std::optional<std::size_t> at = state_.indexOf(state_.current);
    const std::size_t last = state_.model.count() - 1;
    const std::size_t page = pageStep();
    std::size_t to = 0;
    // Where to look for a row that is allowed, should that one not be.
    bool forward = true;
    switch (event.key()) {
    case Qt::Key_Down:
        to = at ? std::min(last, *at + 1) : state_.firstWholeInView();
        break;
    case Qt::Key_Up:
        to = at ? *at - std::min<std::size_t>(*at, 1) : state_.firstWholeInView();
        forward = false;
        break;
    case Qt::Key_PageDown:
        to = std::min(last, at.value_or(0) + page);
        forward = false;
        break;
    case Qt::Key_PageUp:
        to = at.value_or(0) - std::min(at.value_or(0), page);
        break;
    case Qt::Key_Home:
        break;
    case Qt::Key_End:
        to = last;
        forward = false;
        break;
    default:
        return false;
    }
    if (event.modifiers() & (Qt::AltModifier | Qt::MetaModifier))
        return false;
    if (const auto allowed = state_.nextAllowed(to, forward))
        moveTo(*allowed, event.modifiers().testFlag(Qt::ShiftModifier));
    return true;
}

void ListKeys::moveTo(std::size_t index, bool extend) {
    if (extend && state_.editing) {
        if (const auto from = state_.indexOf(state_.current); from && state_.selection.size() == 0)
            state_.selection.setAnchor(*state_.current);
        if (state_.selection.extendTo(state_.model, index))
            state_.client->listSelectionDidChange();
    }
    state_.setCurrent(index);
    state_.reveal(index, false);
}

bool ListKeys::actOnCurrent(const QKeyEvent& event) {
    const std::optional<std::size_t> at = state_.indexOf(state_.current);
    if (!at || (event.modifiers() & (Qt::ControlModifier | Qt::AltModifier)))
        return false;
    std::optional<DocumentAction> action;
    switch (event.key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Select:
        state_.reveal(*at, false);
        state_.activate(*at);
        return true;
    case Qt::Key_Space:
        // A blank within a name that is being typed.
        if (!typed_.isEmpty())
            return false;
        if (state_.editing)
            state_.toggleSelected(*at);
        return state_.editing;
    case Qt::Key_F2:
        action = DocumentAction::rename;
        break;
    case Qt::Key_Delete:
        action = DocumentAction::remove;
        break;
    default:
        return false;
    }
    if (state_.editing || !offers(state_, *action))
        return false;
    state_.reveal(*at, false);
    state_.chooseAction(static_cast<int>(*action), *at, state_.moreRect(*at));
    return true;
}

bool ListKeys::leave() {
    if (!typed_.isEmpty()) {
        typed_.clear();
        return true;
    }
    if (!state_.swipe.row())
        return false;
    state_.swipe.close();
    return true;
}

bool ListKeys::selectAll() {
    if (!state_.editing)
        return false;
    state_.selectAll();
    return true;
}

bool ListKeys::find(const QString& typed) {
    if (state_.model.count() == 0 || (typed_.isEmpty() && typed[0].isSpace()))
        return false;
    typed_ += typed;
    forget_ = Runtime::current().mainQueue.timer(typingPause, [this] { typed_.clear(); });
    const std::size_t count = state_.model.count();
    // The same letter again goes to the next name that begins with it; a longer word stays.
    const bool again = typed_.size() > 1 && typed_.count(typed_[0]) == typed_.size();
    const QString wanted = again ? QString(typed_[0]) : typed_;
    const std::optional<std::size_t> at = state_.indexOf(state_.current);
    const std::size_t from = at ? *at + (typed_.size() == 1 || again ? 1 : 0) : 0;
    for (std::size_t i = 0; i < count; ++i) {
        const std::size_t index = (from + i) % count;
        if (!state_.allows(index) ||
            !shownName(state_.model.entryAt(index).title()).startsWith(wanted, Qt::CaseInsensitive))
            continue;
        state_.setCurrent(index);
        state_.reveal(index, false);
        break;
    }
    return true;
}

std::size_t ListKeys::pageStep() const {
    const double rows = state_.size.height / std::max(1.0, state_.style.rowHeight) - 1;
    return static_cast<std::size_t>(std::max(1.0, rows));
}

} // namespace platform
