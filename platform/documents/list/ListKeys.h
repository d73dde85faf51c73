#pragma once

#include "platform/base/MainQueue.h"
#include "platform/documents/list/ListState.h"

#include <QString>

class QKeyEvent;

namespace platform {

/// What the keyboard does to a list. Typing finds the first name that begins so.
class ListKeys {
public:
    ListKeys(ListState& state, std::function<void()> refresh)
        : state_(state), refresh_(std::move(refresh)) {}

    /// Answers whether the key was used.
    bool press(const QKeyEvent& event);

private:
    bool moveCurrent(const QKeyEvent& event);
    bool actOnCurrent(const QKeyEvent& event);
    bool leave();
    bool selectAll();
    bool find(const QString& typed);
    void moveTo(std::size_t index, bool extend);
    std::size_t pageStep() const;

    ListState& state_;
    std::function<void()> refresh_;
    QString typed_;
    Timer forget_;
};

} // namespace platform
