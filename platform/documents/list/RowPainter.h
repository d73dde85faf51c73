#pragma once

#include "platform/documents/list/RowContents.h"
#include "platform/documents/list/RowGeometry.h"

#include <QRectF>

#include <optional>

class QPainter;

namespace platform {

/// How a row stands at this moment.
struct RowLook {
    bool selected = false;
    /// Under the pointer.
    bool hovered = false;
    /// Pressed, or what is done to it is being asked about.
    bool pressed = false;
    /// The keyboard's row, to be seen.
    bool focused = false;
    bool more = false;
    /// Nothing can be done with it.
    bool dimmed = false;
    /// Made narrower by the actions that were drawn in beside it.
    bool aside = false;
    double editing = 0;
    /// The document's picture; its type's icon stands for none.
    Image thumbnail;
    /// The share of its content that has arrived; none when nothing is on its way.
    std::optional<double> progress;
    /// No line below: the last row, or the one above a marked one.
    bool lastRow = false;
};

RowParts partsOf(const RowContent& content, const RowLook& look, double width, double height);

/// Paints a row that fills `area`.
void paintRow(QPainter& painter, const QRectF& area, RowContent& content, const RowLook& look,
              const RowStyle& style);

/// Paints a row that is still to come.
void paintPlaceholderRow(QPainter& painter, const QRectF& area, const RowStyle& style,
                         std::size_t index);

} // namespace platform
