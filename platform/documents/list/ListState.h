#pragma once

#include "platform/documents/list/ListClient.h"
#include "platform/documents/list/RowContents.h"
#include "platform/documents/list/RowPainter.h"
#include "platform/documents/list/RowSelection.h"
#include "platform/documents/list/RowSpans.h"
#include "platform/documents/list/RowSwipe.h"
#include "platform/documents/list/RowThumbnails.h"
#include "platform/documents/list/Scrolling.h"

#include <optional>
#include <unordered_map>

namespace platform {

/// What a place in the list is.
struct ListHit {
    enum class Part { nothing, row, more, swipeAction };
    Part part = Part::nothing;
    std::size_t index = 0;
    /// Of a swipe action.
    int action = 0;
};

/// Everything about a list on screen but its events: rows, places, marks. Belongs to ListWidget;
/// its helpers work on it. Coordinates are those of the widget.
class ListState {
public:
    ListState(std::shared_ptr<RowModel> theModel, ListClient& theClient,
              std::function<void()> scrolled, std::function<void()> repaint);
    /// The client is going; the list may stay in the tree a little longer.
    void leaveClient();

    /// Measures anew what depends on rows, settings and size.
    void measure();
    double yOf(std::size_t index) const { return spans.top(index) - scrolling.offset(); }
    Rect rowRect(std::size_t index) const;
    std::size_t firstInView() const;
    std::size_t endInView() const;
    /// The first row that is not cut by the upper edge. There must be rows.
    std::size_t firstWholeInView() const;
    std::optional<std::size_t> rowAt(double y) const;
    ListHit hit(Point point);
    RowLook lookOf(std::size_t index) const;
    /// Where "more" of the row is, or would be.
    Rect moreRect(std::size_t index);
    bool allows(std::size_t index) const { return client->listAllowsRow(index); }
    /// The first row that is allowed from `index` on, that way; none when there is none.
    std::optional<std::size_t> nextAllowed(std::size_t index, bool forward) const;
    /// The allowed row at `index`, else the nearest after it, else the nearest before.
    std::optional<std::size_t> allowedAround(std::size_t index) const;
    /// The index of the row, when it is still there.
    std::optional<std::size_t> indexOf(const std::optional<RowId>& row) const;

    /// Scrolls as little as brings the whole row into view.
    void reveal(std::size_t index, bool animated);
    void setCurrent(std::size_t index);
    /// Opens the row, or selects it in edit mode.
    void activate(std::size_t index);
    void toggleSelected(std::size_t index);
    void selectAll();
    void chooseAction(int action, std::size_t index, Rect from);
    void askForActions(std::size_t index, Rect from);
    void setEditing(bool editing, bool animated);

    /// Never none. Held here, because a view may outlive its screen for a moment.
    const std::shared_ptr<RowModel> modelOwner;
    RowModel& model;
    /// Never none.
    ListClient* client;
    RowStyle style = RowStyle::current();
    RowContents contents;
    RowThumbnails thumbnails;
    RowSpans spans;
    RowSelection selection;
    Scrolling scrolling;
    RowSwipe swipe;

    Size size;
    /// Above the first row.
    double header = 0;
    bool editing = false;
    /// 0 to 1 while edit mode comes and goes.
    double editingShare = 0;
    bool hasFocus = false;
    std::optional<RowId> current;
    std::optional<RowId> hovered;
    std::optional<RowId> pressed;
    /// The rows of which something is being asked, until it is dealt with.
    std::optional<RowId> pending;
    /// Of rows whose content is on its way.
    std::unordered_map<RowId, double> arriving;

private:
    void keepPending(std::size_t index);
    std::function<void()> pendingDone();

    std::function<void()> repaint_;
    Animation editingMotion_;
    /// Weakly held by what the client keeps.
    std::shared_ptr<bool> alive_ = std::make_shared<bool>(true);
};

} // namespace platform
