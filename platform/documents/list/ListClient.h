#pragma once

#include "platform/ui/Geometry.h"

#include <cstddef>
#include <functional>

namespace platform {

/// Who owns a list on screen and decides what its events mean. Main thread.
class ListClient {
public:
    virtual ~ListClient() = default;
    /// The row was tapped, or Enter pressed on it, outside edit mode.
    virtual void listDidOpenRow(std::size_t index) = 0;
    /// Whether anything can be done with the row; one that is not allowed is dimmed and only shows
    /// that it is there.
    virtual bool listAllowsRow(std::size_t /*index*/) const { return true; }
    /// The bit set of row actions that are offered; 0 for none.
    virtual unsigned listActions() const = 0;
    /// An action was chosen. `from` is where, in the list's coordinates. `done` ends the mark on
    /// the row.
    virtual void listDidChooseAction(int action, std::size_t index, Rect from,
                                     std::function<void()> done) = 0;
    /// The row's actions are asked for as a menu.
    virtual void listDidAskForActions(std::size_t index, Rect from, std::function<void()> done) = 0;
    virtual void listSelectionDidChange() {}
    virtual void listDidScroll() {}
    /// The list was pulled down beyond its top, or reading again was asked for by a key.
    virtual void listDidAskForRefresh(std::function<void()> done) { done(); }
    /// Whether pulling down asks for anything.
    virtual bool listCanRefresh() const { return false; }
};

} // namespace platform
