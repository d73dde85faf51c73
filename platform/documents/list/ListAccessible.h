#pragma once

namespace platform {

class ListWidget;

/// Lets screen readers and testing tools see lists: a list of named rows that can be opened,
/// selected and asked for their actions. Called before a list is made.
void installListAccessibility();

void announceCurrentRow(ListWidget& list);
void announceRowsChanged(ListWidget& list);

} // namespace platform
