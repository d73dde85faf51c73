#pragma once

#include <functional>
#include <optional>

class QObject;

namespace platform {

/// What the user told the desktop about every program; none where it does not say.
struct DesktopSettings {
    std::optional<bool> reducesMotion;
    std::optional<double> textScale;
};

/// Asks the desktop's settings portal without waiting; `answer` runs on the main thread when all is
/// known that the desktop says, and not at all without a session bus or after `context`.
void askDesktopSettings(QObject& context, std::function<void(const DesktopSettings&)> answer);

} // namespace platform
