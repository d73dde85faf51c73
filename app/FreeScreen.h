#pragma once

#include "platform/ui/Window.h"

#include <chrono>
#include <memory>

namespace tavrin {

/// How soon a question that found another one in its way looks again.
inline constexpr auto questionDelay = std::chrono::seconds(1);

/// The window's screen while nothing is presented over it: a question may be asked there. None
/// otherwise.
inline std::shared_ptr<platform::ViewController> freeScreen(const platform::Window& window) {
    const std::shared_ptr<platform::ViewController> root = window.rootViewController();
    return root && !root->presentedViewController() ? root : nullptr;
}

} // namespace tavrin
