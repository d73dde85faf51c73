#pragma once

#include <vector>

class QWidget;

namespace platform {

/// The stops of the Tab key below `scope`, in reading order: top to bottom, then along the line in
/// the program's direction. Not Qt's own chain, which is the order in which widgets were made.
std::vector<QWidget*> focusOrder(const QWidget& scope);

/// Whether a person can get at it now: it neither moves nor goes, and nothing stands before it. What
/// works without the pointer (keys, a screen reader's actions) has to ask.
bool isWithinReach(const QWidget& widget);

/// Moves the focus to the next stop within `scope`, round its end. False when it has none.
bool moveFocus(const QWidget& scope, bool forward);

} // namespace platform
