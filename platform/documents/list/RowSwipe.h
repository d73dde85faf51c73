#pragma once

#include "platform/documents/model/DocumentEntry.h"
#include "platform/ui/Animation.h"
#include "platform/ui/Geometry.h"

#include <QRectF>

#include <functional>
#include <optional>
#include <vector>

class QPainter;

namespace platform {

/// The row that is drawn aside, and the actions that lie behind it.
class RowSwipe {
public:
    explicit RowSwipe(std::function<void()> changed) : changed_(std::move(changed)) {}

    std::optional<RowId> row() const { return row_; }
    bool isOpen() const { return row_ && open_; }
    /// How far the row is drawn aside, toward the leading edge.
    double distance() const { return distance_; }

    /// Takes the row in hand; `actions` are numbers of DocumentAction in the order of their bits.
    void begin(RowId row, const std::vector<int>& actions, double rowWidth);
    void dragTo(double distance);
    /// Opens or closes by how far and how fast (points a second toward the leading edge).
    void release(double speed);
    void open();
    void close();
    void forget();

    /// The action at a place `fromEnd` points before the trailing edge of the row.
    std::optional<int> actionAt(double fromEnd) const;
    /// Where an action's button is in a row of that size, reading from the left.
    Rect buttonRect(int action, Size row) const;
    void setPressed(std::optional<int> action);
    void paint(QPainter& painter, const QRectF& area) const;

private:
    void settle(double distance, bool open);
    double fullWidth() const { return buttonWidth_ * static_cast<double>(actions_.size()); }

    std::function<void()> changed_;
    std::optional<RowId> row_;
    /// From the trailing edge inward.
    std::vector<int> actions_;
    double buttonWidth_ = 0;
    double distance_ = 0;
    double start_ = 0;
    bool open_ = false;
    std::optional<int> pressed_;
    Animation motion_;
};

/// What an action of a row is called, on its button and in its menu.
std::string actionTitle(int action);
/// The actions that the bits offer, in the order in which a menu lists them.
std::vector<int> offeredActions(unsigned bits);

} // namespace platform
